// SPDX-License-Identifier: MIT
#include "host/cli/losses/TServerLog.h"

#include <filesystem>
#include <fstream>

namespace vrxhost {
namespace {

std::uintmax_t SizeOf(const std::string& path)
{
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    return error ? 0 : size;
}

// "provider module \"NAME\": ..." is the module's own; "... provider module NAME: ..." reports its end.
std::string ModuleOf(const std::string& text)
{
    constexpr char kModule[] = "provider module ";
    std::size_t begin = text.find(kModule);
    if (begin == std::string::npos) {
        return "";
    }
    begin += sizeof kModule - 1;
    const bool isQuoted = text.compare(begin, 1, "\"") == 0;
    begin += isQuoted ? 1 : 0;
    const std::size_t end = text.find(isQuoted ? '"' : ':', begin);
    return end == std::string::npos ? "" : text.substr(begin, end - begin);
}

bool IsOutputOf(const std::string& module, const std::string& text)
{
    return text.rfind("info: provider module \"" + module + "\" wrote: ", 0) == 0;
}

} // namespace

TServerLog::TServerLog(const std::string& root) : fPath(root + "/pegasus/cimserver.log"), fStart(SizeOf(fPath)) {}

std::vector<TServerLogLine> TServerLog::Read() const
{
    const std::uintmax_t size = SizeOf(fPath);
    std::uintmax_t start = size < fStart ? 0 : fStart; // a full log was put aside, and a new one begun
    start = size - start > kMaxBytes ? size - kMaxBytes : start;
    std::ifstream file(fPath, std::ios::binary);
    file.seekg(static_cast<std::streamoff>(start));
    std::vector<TServerLogLine> lines;
    for (std::string line; std::getline(file, line);) {
        const std::size_t process = line.find("] "); // "TIME [PROCESS] SEVERITY: TEXT"
        const std::string text = process == std::string::npos ? line : line.substr(process + 2);
        const std::string module = ModuleOf(text);
        if (!module.empty()) {
            lines.push_back({module, text, IsOutputOf(module, text)});
        }
    }
    return lines;
}

} // namespace vrxhost
