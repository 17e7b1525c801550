// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentOutput.h"

#include "pegasus/base/Text.h"
#include "pegasus/server/admin/Log.h"

#include <algorithm>
#include <cerrno>
#include <system_error>

#include <fcntl.h>

namespace Pegasus::server {

namespace {

using Clock = OutputLines::Clock;

constexpr std::size_t kReadBytes = 64u << 10;
constexpr const char* kJoint = " | ";

} // namespace

void OutputLines::feed(std::string_view bytes, Clock::time_point now)
{
    for (std::size_t end = 0; (end = bytes.find('\n')) != std::string_view::npos; bytes.remove_prefix(end + 1)) {
        fLine.append(bytes.substr(0, std::min(end, kMaxOutputLineBytes - fLine.size())));
        endLine(now);
    }
    fLine.append(bytes.substr(0, kMaxOutputLineBytes - fLine.size()));
}

void OutputLines::finish()
{
    if (!fLine.empty()) {
        endLine(fGrown);
    }
    reportLeftOut();
}

void OutputLines::endLine(Clock::time_point now)
{
    std::string line;
    line.swap(fLine);
    if (mayLog(now)) {
        reportLeftOut();
        fLog(line);
    } else {
        ++fLeftOut;
    }
    const std::lock_guard<std::mutex> lock(fMutex);
    fLast.push_back(std::move(line));
    if (fLast.size() > kMaxTailBytes / 8) { // more lines than are shown
        fLast.pop_front();
    }
}

bool OutputLines::mayLog(Clock::time_point now)
{
    const auto seconds = std::chrono::duration_cast<std::chrono::seconds>(now - fGrown).count();
    if (seconds > 0) {
        fBudget = static_cast<unsigned>(std::min<decltype(seconds)>(fBudget + seconds, kMaxOutputLines));
        fGrown = now;
    }
    if (fBudget == 0) {
        return false;
    }
    --fBudget;
    return true;
}

void OutputLines::reportLeftOut()
{
    if (fLeftOut != 0) {
        fLog("(" + std::to_string(fLeftOut) + " lines left out)");
    }
    fLeftOut = 0;
}

std::string OutputLines::tail() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::string text;
    for (auto line = fLast.rbegin(); line != fLast.rend(); ++line) {
        const std::string shown = base::utf8(base::fromUtf8Repaired(printable(*line)));
        if (text.size() + shown.size() > kMaxTailBytes) {
            break;
        }
        text = text.empty() ? shown : shown + kJoint + text;
    }
    return text;
}

AgentOutput::AgentOutput(const std::string& module)
    : fLines([prefix = "provider module \"" + module + "\" wrote: "](const std::string& line) {
          Log::write(LogLevel::kInformation, prefix + line);
      })
{
}

base::Descriptor AgentOutput::open()
{
    int ends[2];
    if (::pipe2(ends, O_CLOEXEC) != 0) {
        throw std::system_error(errno, std::generic_category(), "cannot create a pipe for an agent");
    }
    fPipe.reset(ends[0]);
    ::fcntl(ends[0], F_SETFL, O_NONBLOCK); // of this end alone
    return base::Descriptor(ends[1]);
}

int AgentOutput::fd() const
{
    return fReadInSecond < kMaxOutputBytesPerSecond ? fPipe.get() : -1;
}

int AgentOutput::pollTimeoutMs() const
{
    return fReadInSecond < kMaxOutputBytesPerSecond ? -1 : 1000;
}

void AgentOutput::read()
{
    const Clock::time_point now = Clock::now();
    if (now - fSecond >= std::chrono::seconds(1)) {
        fSecond = now;
        fReadInSecond = 0;
    }
    if (fPipe && fReadInSecond < kMaxOutputBytesPerSecond) {
        readSome();
    }
}

// Returns: whether there was something.
bool AgentOutput::readSome()
{
    char bytes[kReadBytes];
    const ssize_t n = ::read(fPipe.get(), bytes, sizeof bytes);
    if (n == 0) {
        fPipe.reset();
    }
    if (n <= 0) {
        return n < 0 && errno == EINTR;
    }
    fReadInSecond += static_cast<std::size_t>(n);
    fLines.feed({bytes, static_cast<std::size_t>(n)}, Clock::now());
    return true;
}

void AgentOutput::finish()
{
    // A pipe holds less than this; who still writes to it is not the agent.
    for (int i = 0; i < 16 && fPipe && readSome(); ++i) {
    }
    fPipe.reset();
    fLines.finish();
}

} // namespace Pegasus::server
