// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/TChildProcess.h"

#include <cstddef>
#include <deque>
#include <mutex>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// A program that failed, as the host reports it to the user.
struct TFailedProgram
{
    std::string fName;                   // argv[0]
    std::vector<std::string> fArguments; // argv[1] and following
    TProcessOutcome::EEnd fEnd = TProcessOutcome::kUnknown;
    int fStatus = 0;
    std::string fOutput; // its beginning: some programs report failures here
    std::string fErrorOutput;

    // Returns: "exit status 250", "signal 11 (Segmentation fault)", "not started: No such file or directory" ...
    std::string GetReason() const;
};

// The host's memory of failed programs, in addition to the log line that each gets. The oldest entries are dropped when
// a limit is reached.
// Thread: safe.
class TProcessLog
{
  public:
    static constexpr std::size_t kMaxEntries = 1000;
    static constexpr std::size_t kMaxBytes = 8UL * 1024 * 1024; // of their texts; one program is kept whatever its size

    static TProcessLog& Instance();

    // Keeps a program that failed, then logs one line of severity 3 about it. A program that succeeded but wrote to
    // standard error is only logged. The entry comes first, so that a logger can take it when it sees the line.
    void Add(const TProcessRequest& request, const TProcessOutcome& outcome);

    // Returns: the failed programs since the last call, in the order in which they ended.
    std::vector<TFailedProgram> Take();

  private:
    void Keep(const TFailedProgram& program);

    std::mutex fMutex;
    std::deque<TFailedProgram> fEntries;
    std::size_t fBytes = 0; // of the entries' texts
};

} // namespace NKOLVRX20
