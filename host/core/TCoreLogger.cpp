// SPDX-License-Identifier: MIT
#define SPDLOG_PREVENT_CHILD_FD // makes spdlog open the file close-on-exec
#include "host/core/TCoreLogger.h"

#include "host/core/TUniqueFd.h"

#include <host/TVRXException.h>

#include <spdlog/logger.h>
#include <spdlog/sinks/basic_file_sink.h>
#include <spdlog/sinks/stdout_sinks.h>

#include <atomic>

#include <fcntl.h>
#include <sys/stat.h>

namespace NKOLVRX20 {

struct TCoreLogger::TSinks
{
    spdlog::logger fLogger{"vrx"};
};

namespace {

constexpr char kPattern[] = "%Y-%m-%d %H:%M:%S.%e %-7l %t %v";

spdlog::level::level_enum ToLevel(ILogger::EVRXLogSeverity severity)
{
    switch (severity) {
    case ILogger::kError:
        return spdlog::level::err;
    case ILogger::kWarning:
        return spdlog::level::warn;
    case ILogger::kNotice:
    case ILogger::kInfo:
        return spdlog::level::info;
    default:
        return spdlog::level::debug;
    }
}

// What spdlog says on a failure names the file by its descriptor; the reason comes last.
std::function<void(const std::string&)> ReportOnce(const std::function<void(const std::string&)>& report)
{
    return [report, isFirst = std::make_shared<std::atomic<bool>>(true)](const std::string& text) {
        if (isFirst->exchange(false) && report) {
            const std::size_t reason = text.rfind(": ");
            report(reason == std::string::npos ? text : text.substr(reason + 2));
        }
    };
}

// The log holds what vendors print, and its folder may be anybody's: it is created for the user alone, and a link, a
// FIFO or another user's file at its path is refused.
TUniqueFd OpenPrivateFile(const std::string& path)
{
    constexpr mode_t kOwnerOnly = 0600;
    TUniqueFd file(
        ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY, kOwnerOnly));
    struct stat status = {};
    if (!file || ::fstat(file.Get(), &status) != 0 || S_ISFIFO(status.st_mode)) {
        throw TVRXException(TVRXStatusCode::kBadPath);
    }
    if (S_ISREG(status.st_mode) && (status.st_uid != ::geteuid() || ::fchmod(file.Get(), kOwnerOnly) != 0)) {
        throw TVRXException(TVRXStatusCode::kBadPath);
    }
    return file;
}

} // namespace

TCoreLogger& TCoreLogger::Instance()
{
    // Lives until the process ends: a plug-in's static destructors may still log.
    static TCoreLogger* fgInstance = new TCoreLogger;
    return *fgInstance;
}

TCoreLogger::TCoreLogger()
{
    TOptions options;
    options.fToStandardError = true;
    options.fLeastSevere = kError;
    Configure(options);
}

TCoreLogger::~TCoreLogger() = default;

void TCoreLogger::Configure(const TOptions& options)
{
    const auto sinks = std::make_shared<TSinks>();
    TUniqueFd file; // until the sink has opened the very file that was checked
    try {
        if (!options.fFile.empty()) {
            file = OpenPrivateFile(options.fFile);
            sinks->fLogger.sinks().push_back(std::make_shared<spdlog::sinks::basic_file_sink_mt>(
                "/proc/self/fd/" + std::to_string(file.Get()), options.fTruncate));
        }
        if (options.fToStandardError) {
            sinks->fLogger.sinks().push_back(std::make_shared<spdlog::sinks::stderr_sink_mt>());
        }
    } catch (const spdlog::spdlog_ex&) {
        throw TVRXException(TVRXStatusCode::kBadPath);
    }
    sinks->fLogger.set_pattern(kPattern);
    sinks->fLogger.set_error_handler(ReportOnce(options.fOnFailure));
    sinks->fLogger.set_level(ToLevel(options.fLeastSevere));
    sinks->fLogger.flush_on(spdlog::level::trace); // the last lines before a crash are the ones that matter
    std::atomic_store(&fSinks, sinks);
}

void TCoreLogger::Log(EVRXLogSeverity severity, const std::string& text)
{
    Current()->fLogger.log(ToLevel(severity), text);
}

std::shared_ptr<TCoreLogger::TSinks> TCoreLogger::Current() const
{
    return std::atomic_load(&fSinks);
}

} // namespace NKOLVRX20
