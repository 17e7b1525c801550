// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/base/Descriptor.h"

#include <chrono>
#include <deque>
#include <functional>
#include <mutex>
#include <string>
#include <string_view>

namespace Pegasus::server {

// What an agent's process writes to its standard output and error, taken apart into lines.
//
// A provider may write without end: of what is written, whole lines are logged as long as the budget lasts, the last
// ones are kept for the error text of a failure, and the rest is counted.
// Thread: one; tail(): any.
class OutputLines
{
  public:
    using Clock = std::chrono::steady_clock;

    static constexpr std::size_t kMaxOutputLineBytes = 512; // the rest of the line is cut off
    static constexpr unsigned kMaxOutputLines = 100;        // at once; the budget grows by one a second
    static constexpr std::size_t kMaxTailBytes = 1024;      // of the last lines

    explicit OutputLines(std::function<void(const std::string&)> log) : fLog(std::move(log)) {}

    void feed(std::string_view bytes, Clock::time_point now);
    // Ends a line that has been begun, and reports the lines that were left out.
    void finish();
    // Returns: the last lines, joined by " | ", printable and valid UTF-8. Empty if nothing was written.
    std::string tail() const;

  private:
    void endLine(Clock::time_point now);
    bool mayLog(Clock::time_point now);
    void reportLeftOut();

    std::function<void(const std::string&)> fLog;
    std::string fLine;
    Clock::time_point fGrown{}; // when the budget was last looked at
    unsigned fBudget = kMaxOutputLines;
    std::size_t fLeftOut = 0;
    mutable std::mutex fMutex; // guards the next
    std::deque<std::string> fLast;
};

// The server's end of an agent's output.
// Thread: one; tail(): any.
class AgentOutput
{
  public:
    static constexpr std::size_t kMaxOutputBytesPerSecond = 4u << 20; // more is left in the pipe: its writer waits

    explicit AgentOutput(const std::string& module);

    // Makes the pipe. Returns: the agent's end of it. Throws: std::system_error.
    base::Descriptor open();
    // Returns: what to poll for reading: -1 at the end of the output, and in a pause.
    int fd() const;
    // Returns: the time-out for polling; -1: none.
    int pollTimeoutMs() const;
    // Takes some of what there is.
    void read();
    // Takes what is left, and ends.
    void finish();
    std::string tail() const { return fLines.tail(); }

  private:
    bool readSome();

    base::Descriptor fPipe;
    OutputLines fLines;
    OutputLines::Clock::time_point fSecond{};
    std::size_t fReadInSecond = 0;
};

} // namespace Pegasus::server
