// SPDX-License-Identifier: MIT
#include "host/core/TProcessLog.h"

#include <host/TRootObject.h>

#include <cstring>
#include <iterator>

namespace NKOLVRX20 {
namespace {

// Of standard output only the beginning is kept: its whole may be 16 MiB, and failures are reported in the first lines.
TFailedProgram Describe(const TProcessRequest& request, const TProcessOutcome& outcome)
{
    TFailedProgram program;
    program.fName = request.fArguments.front();
    program.fArguments.assign(std::next(request.fArguments.begin()), request.fArguments.end());
    program.fEnd = outcome.fEnd;
    program.fStatus = outcome.fStatus;
    program.fOutput = outcome.fOutput.substr(0, kMaxErrorOutputBytes);
    program.fErrorOutput = outcome.fErrorOutput;
    return program;
}

std::size_t TextBytes(const TFailedProgram& program)
{
    std::size_t bytes = program.fName.size() + program.fOutput.size() + program.fErrorOutput.size();
    for (const std::string& argument : program.fArguments) {
        bytes += argument.size();
    }
    return bytes;
}

std::string LogLine(const TFailedProgram& program, const TProcessOutcome& outcome)
{
    std::string line = "TOSSpecific::SpawnProcess " + program.fName;
    for (const std::string& argument : program.fArguments) {
        line += " " + argument;
    }
    line += ": " + program.GetReason();
    if (outcome.fDroppedBytes > 0) {
        line += ", " + std::to_string(outcome.fDroppedBytes) + " bytes of output dropped";
    }
    if (!outcome.fErrorOutput.empty()) {
        line += ": " + outcome.fErrorOutput;
    }
    return line;
}

} // namespace

std::string TFailedProgram::GetReason() const
{
    switch (fEnd) {
    case TProcessOutcome::kExited:
        return "exit status " + std::to_string(fStatus);
    case TProcessOutcome::kSignaled:
        return "signal " + std::to_string(fStatus) + " (" + strsignal(fStatus) + ")";
    case TProcessOutcome::kUnknown:
        return "exit status unknown";
    case TProcessOutcome::kNotRun:
        return std::string("not started: ") + std::strerror(fStatus);
    case TProcessOutcome::kTimedOut:
        return "killed because its time ran out";
    case TProcessOutcome::kCancelled:
        return "cancelled";
    }
    return "";
}

TProcessLog& TProcessLog::Instance()
{
    static TProcessLog* fgInstance = new TProcessLog; // outlives every plug-in
    return *fgInstance;
}

void TProcessLog::Add(const TProcessRequest& request, const TProcessOutcome& outcome)
{
    if (outcome.IsSuccess() && outcome.fErrorOutput.empty() && outcome.fDroppedBytes == 0) {
        return;
    }
    const TFailedProgram program = Describe(request, outcome);
    if (!outcome.IsSuccess() && outcome.fEnd != TProcessOutcome::kCancelled) {
        Keep(program);
    }
    TRootObject::GetCoreLogger()->Log(ILogger::kInfo, LogLine(program, outcome));
}

void TProcessLog::Keep(const TFailedProgram& program)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    // The new entry stays even if it exceeds kMaxBytes alone: the failure at hand is the one that the user asks about.
    fBytes += TextBytes(program);
    fEntries.push_back(program);
    while (fEntries.size() > kMaxEntries || (fBytes > kMaxBytes && fEntries.size() > 1)) {
        fBytes -= TextBytes(fEntries.front());
        fEntries.pop_front();
    }
}

std::vector<TFailedProgram> TProcessLog::Take()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<TFailedProgram> taken(std::make_move_iterator(fEntries.begin()),
                                      std::make_move_iterator(fEntries.end()));
    fEntries.clear();
    fBytes = 0;
    return taken;
}

} // namespace NKOLVRX20
