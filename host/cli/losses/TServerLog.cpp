// SPDX-License-Identifier: MIT
#include "host/cli/losses/TServerLog.h"

#include <algorithm>
#include <fstream>

#include <sys/stat.h>

namespace vrxhost {
namespace {

struct stat StatusOf(const std::string& path)
{
    struct stat status = {};
    if (::stat(path.c_str(), &status) != 0) {
        status = {};
    }
    return status;
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

TServerLog::TServerLog(const std::string& root) : fPath(root + "/pegasus/cimserver.log")
{
    const struct stat status = StatusOf(fPath);
    fFile = status.st_ino;
    fStart = status.st_size;
}

// A full log was put aside during the run when another file is at its path.
std::vector<TServerLogLine> TServerLog::Read() const
{
    std::vector<TServerLogLine> lines;
    const std::string aside = fPath + ".1";
    const bool isSame = fFile == 0 || StatusOf(fPath).st_ino == fFile;
    if (!isSame && StatusOf(aside).st_ino == fFile) {
        Append(lines, aside, fStart);
    }
    Append(lines, fPath, isSame ? fStart : 0);
    return lines;
}

void TServerLog::Append(std::vector<TServerLogLine>& lines, const std::string& path, off_t start)
{
    const off_t last = StatusOf(path).st_size - static_cast<off_t>(kMaxBytes);
    std::ifstream file(path, std::ios::binary);
    file.seekg(std::max(start, last));
    std::string line;
    if (last > start) {
        std::getline(file, line); // the rest of one that is left out
    }
    while (std::getline(file, line)) {
        const std::size_t process = line.find("] "); // "TIME [PROCESS] SEVERITY: TEXT"
        const std::string text = process == std::string::npos ? line : line.substr(process + 2);
        const std::string module = ModuleOf(text);
        if (!module.empty()) {
            lines.push_back({module, text, IsOutputOf(module, text)});
        }
    }
}

} // namespace vrxhost
