// SPDX-License-Identifier: MIT
#include "host/inmem/ObjectNames.h"

#include "display/PlainText.h"

#include <charconv>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;

std::string Quoted(const std::string& text)
{
    std::string quoted = "\"";
    for (const char c : text) {
        if (c == '"' || c == '\\') {
            quoted += '\\';
        }
        quoted += c;
    }
    return quoted + '"';
}

std::string RealText(double number)
{
    constexpr int kDecimals = 16;
    char text[32]; // a sign, 17 digits, a point and an exponent of up to five characters
    const auto end = std::to_chars(std::begin(text), std::end(text), number, std::chars_format::scientific, kDecimals);
    return std::string(text, end.ptr);
}

std::string KeyText(const TCIMValue& value)
{
    // An unset key keeps its place in the path.
    if (value.IsNull()) {
        return Quoted("");
    }
    switch (value.GetType()) {
    case TType::kBoolean:
        return static_cast<bool>(value) ? "TRUE" : "FALSE";
    case TType::kReal32:
    case TType::kReal64:
        return RealText(static_cast<double>(value));
    case TType::kChar16:
        return Quoted(CharacterText(static_cast<TCIMChar16>(value)));
    case TType::kString:
    case TType::kDatetime:
    case TType::kReference:
        return Quoted(value.ToString(10));
    default:
        return value.ToString(10);
    }
}

} // namespace

// CIM names are folded by ASCII, whatever the process's locale is.
std::string NormalizedName(const std::string& name)
{
    std::string key = name;
    for (char& c : key) {
        if (c >= 'A' && c <= 'Z') {
            c = static_cast<char>(c - 'A' + 'a');
        }
    }
    return key;
}

std::string ObjectPathText(const std::string& className, const std::vector<TKeyBinding>& keys)
{
    std::string path = className;
    char separator = '.';
    for (const auto& [name, value] : keys) {
        path += separator + name + '=' + KeyText(value);
        separator = ',';
    }
    return path;
}

} // namespace NKOLVRX20
