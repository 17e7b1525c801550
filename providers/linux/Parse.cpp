// SPDX-License-Identifier: MIT
#include "providers/linux/Parse.h"

#include <charconv>
#include <cstdlib>

namespace lnx {
namespace {

constexpr std::string_view kBlanks = " \t\n\r\f\v";

template <typename T> std::optional<T> parsed(std::string_view text, int base)
{
    T value{};
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, value, base);
    return error == std::errc() && stop == end && !text.empty() ? std::optional<T>(value) : std::nullopt;
}

std::string_view unquoted(std::string_view text)
{
    const bool isQuoted =
        text.size() >= 2 && (text.front() == '"' || text.front() == '\'') && text.back() == text.front();
    return isQuoted ? text.substr(1, text.size() - 2) : text;
}

} // namespace

std::string_view trimmed(std::string_view text)
{
    const std::size_t begin = text.find_first_not_of(kBlanks);
    if (begin == std::string_view::npos) {
        return {};
    }
    return text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

std::vector<std::string> words(std::string_view text)
{
    std::vector<std::string> result;
    for (std::size_t begin = text.find_first_not_of(kBlanks); begin != std::string_view::npos;) {
        const std::size_t end = std::min(text.find_first_of(kBlanks, begin), text.size());
        result.emplace_back(text.substr(begin, end - begin));
        begin = text.find_first_not_of(kBlanks, end);
    }
    return result;
}

std::vector<std::string_view> lines(std::string_view text)
{
    std::vector<std::string_view> result;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size());
        result.push_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return result;
}

std::optional<std::int64_t> toInteger(std::string_view text)
{
    return parsed<std::int64_t>(trimmed(text), 10);
}

std::optional<std::uint64_t> toNatural(std::string_view text)
{
    text = trimmed(text);
    const bool isHex = text.substr(0, 2) == "0x";
    return isHex ? parsed<std::uint64_t>(text.substr(2), 16) : parsed<std::uint64_t>(text, 10);
}

std::optional<double> toReal(std::string_view text)
{
    text = trimmed(text);
    double value{};
    const char* const end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, value);
    return error == std::errc() && stop == end && !text.empty() ? std::optional<double>(value) : std::nullopt;
}

Fields fields(std::string_view text, char separator)
{
    Fields result;
    for (const std::string_view line : lines(text)) {
        const std::size_t at = line.find(separator);
        if (at != std::string_view::npos) {
            result.emplace(trimmed(line.substr(0, at)), trimmed(line.substr(at + 1)));
        }
    }
    return result;
}

Fields shellFields(std::string_view text)
{
    Fields result = fields(text, '=');
    for (auto& [name, value] : result) {
        value = std::string(unquoted(value));
    }
    return result;
}

std::optional<std::string> field(const Fields& from, const std::string& name)
{
    const auto found = from.find(name);
    return found != from.end() && !found->second.empty() ? std::optional<std::string>(found->second) : std::nullopt;
}

} // namespace lnx
