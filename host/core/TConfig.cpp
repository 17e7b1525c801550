// SPDX-License-Identifier: MIT
#include <host/TConfig.h>
#include <host/TVRXException.h>

#include <cerrno>
#include <fstream>
#include <sstream>

namespace NKOLVRX20 {
namespace {

constexpr std::size_t kMaxFileBytes = 1024UL * 1024;

std::string Trimmed(const std::string& text)
{
    static constexpr char kBlanks[] = " \t\r";
    const std::size_t begin = text.find_first_not_of(kBlanks);
    if (begin == std::string::npos) {
        return "";
    }
    return text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

std::string ReadWhole(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::string text;
    for (char piece[4096]; file.good() && text.size() <= kMaxFileBytes;) {
        file.read(piece, sizeof piece);
        text.append(piece, static_cast<std::size_t>(file.gcount()));
    }
    // A directory opens like a file; only reading it fails.
    if (!file.is_open() || file.bad() || text.size() > kMaxFileBytes) {
        throw TVRXException(TVRXStatusCode::kBadPath);
    }
    return text;
}

// Some editors begin a UTF-8 file with this; it is cut off before the first key.
std::string WithoutByteOrderMark(const std::string& text)
{
    static constexpr char kMark[] = "\xef\xbb\xbf";
    return text.compare(0, 3, kMark) == 0 ? text.substr(3) : text;
}

std::map<std::string, std::string> ParseLines(const std::string& text)
{
    std::map<std::string, std::string> values;
    std::istringstream lines(WithoutByteOrderMark(text));
    for (std::string line; std::getline(lines, line);) {
        line = Trimmed(line);
        if (line.empty() || line[0] == '#') {
            continue;
        }
        const std::size_t equals = line.find('=');
        if (equals == std::string::npos) {
            throw TVRXException(TVRXStatusCode::kTypeMismatch);
        }
        values[Trimmed(line.substr(0, equals))] = Trimmed(line.substr(equals + 1));
    }
    return values;
}

} // namespace

TConfig* TConfig::GetInstance()
{
    static TConfig fgInstance;
    return &fgInstance;
}

std::string TConfig::getValue(const std::string& key) const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    for (const auto* values : {&fOverrides, &fFileValues}) { // in order of precedence
        const auto found = values->find(key);
        if (found != values->end()) {
            return found->second;
        }
    }
    return "";
}

void TConfig::Load(const std::string& path)
{
    const auto values = ParseLines(ReadWhole(path)); // all lines are read before the first one takes effect
    const std::lock_guard<std::mutex> lock(fMutex);
    for (const auto& entry : values) {
        fFileValues[entry.first] = entry.second;
    }
}

void TConfig::setValue(const std::string& key, const std::string& value)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fOverrides[key] = value;
}

void TConfig::Clear()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fFileValues.clear();
    fOverrides.clear();
}

} // namespace NKOLVRX20
