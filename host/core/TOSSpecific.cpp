// SPDX-License-Identifier: MIT
#include "host/core/TChildProcess.h"
#include "host/core/TProcessControl.h"
#include "host/core/TProcessLog.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <algorithm>
#include <sstream>

#include <sys/stat.h>

namespace NKOLVRX20 {
namespace {

std::vector<std::string> SplitAtBlanks(const std::string& line)
{
    std::istringstream words(line);
    std::vector<std::string> result;
    for (std::string word; words >> word;) {
        result.push_back(word);
    }
    return result;
}

void RunAndReport(const TProcessRequest& request, std::string& output, int timeoutSeconds)
{
    TProcessControl::Instance().NotifyStart(request.fArguments, timeoutSeconds);
    // A program is logged before the call throws, so that the reason is known when the caller handles the exception.
    TProcessOutcome outcome = TChildProcess(request).Run(std::chrono::seconds(std::max(timeoutSeconds, 1)));
    TProcessLog::Instance().Add(request, outcome);
    output = std::move(outcome.fOutput);
    if (outcome.fEnd == TProcessOutcome::kCancelled) {
        throw TProgramsCancelled();
    }
    if (outcome.fEnd == TProcessOutcome::kNotRun || outcome.fEnd == TProcessOutcome::kTimedOut) {
        throw TVRXException(TVRXStatusCode::kProcessFailed);
    }
}

} // namespace

void TOSSpecific::SpawnProcess(const std::string& commandLine, int timeoutSeconds)
{
    std::string output;
    SpawnProcess(commandLine, std::vector<std::string>(), output, timeoutSeconds);
}

void TOSSpecific::SpawnProcess(const std::string& commandLine, const std::vector<std::string>& arguments,
                               std::string& output, int timeoutSeconds)
{
    TProcessRequest request;
    request.fArguments = SplitAtBlanks(commandLine);
    if (request.fArguments.empty()) {
        throw TVRXException(TVRXStatusCode::kProcessFailed);
    }
    request.fProgram = request.fArguments.front();
    request.fArguments.insert(request.fArguments.end(), arguments.begin(), arguments.end());
    request.fSearchPath = true;
    request.fInheritEnvironment = true;
    RunAndReport(request, output, timeoutSeconds);
}

void TOSSpecific::SpawnProcess(const std::string& name, const std::vector<std::string>& arguments,
                               const std::string& programPath, const std::vector<std::string>& environment,
                               std::string& output, int timeoutSeconds)
{
    TProcessRequest request;
    request.fProgram = programPath;
    request.fArguments.push_back(name);
    request.fArguments.insert(request.fArguments.end(), arguments.begin(), arguments.end());
    request.fEnvironment = environment;
    RunAndReport(request, output, timeoutSeconds);
}

std::size_t TOSSpecific::GetFileSize(const std::string& path)
{
    struct stat status = {};
    if (::stat(path.c_str(), &status) != 0 || !S_ISREG(status.st_mode)) {
        return 0;
    }
    return static_cast<std::size_t>(status.st_size);
}

} // namespace NKOLVRX20
