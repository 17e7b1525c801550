// SPDX-License-Identifier: MIT
#include "pegasus/server/admin/Log.h"

#include "pegasus/base/Descriptor.h"

#include <atomic>
#include <cstdio>
#include <ctime>
#include <mutex>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

namespace Pegasus::server {

namespace {

struct LogState
{
    std::mutex mutex;
    base::Descriptor file;
    std::string path;
    bool toStandardError = false;
    std::atomic<LogLevel> least{LogLevel::kInformation};
};

LogState& state()
{
    static LogState fgInstance;
    return fgInstance;
}

void reopen(LogState& log)
{
    log.file.reset(::open(log.path.c_str(), O_WRONLY | O_CREAT | O_APPEND | O_NOFOLLOW | O_CLOEXEC, 0600));
    ::fchmod(log.file.get(), 0600); // a file of before may be open to others
}

bool isAtPath(const LogState& log)
{
    struct stat opened = {};
    struct stat named = {};
    return ::fstat(log.file.get(), &opened) == 0 && ::lstat(log.path.c_str(), &named) == 0 &&
           opened.st_dev == named.st_dev && opened.st_ino == named.st_ino;
}

// The server and its agents write one file. The first to lock the full one renames it; the others, who still have it
// open, find a new one at its path.
void rotateWhenFull(LogState& log)
{
    struct stat info = {};
    if (::fstat(log.file.get(), &info) != 0 || static_cast<std::size_t>(info.st_size) < Log::kMaxLogBytes) {
        return;
    }
    if (::flock(log.file.get(), LOCK_EX) == 0 && isAtPath(log)) {
        ::rename(log.path.c_str(), (log.path + ".1").c_str());
    }
    reopen(log); // closes the old file, which ends the lock
}

const char* label(LogLevel severity)
{
    static const char* const kLabels[] = {"error", "warning", "info", "debug"};
    return kLabels[static_cast<int>(severity)];
}

std::string stamp()
{
    const std::time_t now = std::time(nullptr);
    std::tm parts = {};
    ::gmtime_r(&now, &parts);
    char text[32];
    const std::size_t size = std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%SZ", &parts);
    return std::string(text, size);
}

std::string formatLine(LogLevel severity, const std::string& text)
{
    return stamp() + " [" + std::to_string(::getpid()) + "] " + label(severity) + ": " + printable(text) + "\n";
}

void put(int fd, const std::string& line)
{
    if (fd >= 0 && ::write(fd, line.data(), line.size()) < 0) {
        return; // the line is lost
    }
}

} // namespace

std::string printable(std::string_view text)
{
    std::string shown;
    for (const char c : text) {
        if (c == '\n') {
            shown += "\\n";
        } else if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f) {
            char escape[8];
            std::snprintf(escape, sizeof escape, "\\x%02x", static_cast<unsigned>(static_cast<unsigned char>(c)));
            shown += escape;
        } else {
            shown += c;
        }
    }
    return shown;
}

void Log::open(const std::string& home, bool alsoToStandardError) noexcept
try {
    LogState& log = state();
    const std::lock_guard<std::mutex> lock(log.mutex);
    log.path = home + "/cimserver.log";
    log.toStandardError = alsoToStandardError;
    reopen(log);
} catch (...) {
}

void Log::setLevel(LogLevel least) noexcept
{
    state().least = least;
}

void Log::write(LogLevel severity, const std::string& text) noexcept
try {
    LogState& log = state();
    if (severity > log.least) {
        return;
    }
    const std::string line = formatLine(severity, text);
    const std::lock_guard<std::mutex> lock(log.mutex);
    if (log.file) {
        rotateWhenFull(log);
    }
    put(log.file.get(), line);
    if (log.toStandardError) {
        put(STDERR_FILENO, line);
    }
} catch (...) {
}

} // namespace Pegasus::server
