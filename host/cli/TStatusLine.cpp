// SPDX-License-Identifier: MIT
#include "host/cli/TStatusLine.h"

#include <algorithm>
#include <csignal>
#include <cstdlib>
#include <cstring>
#include <functional>

#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace vrxhost {
namespace {

constexpr std::chrono::milliseconds kShortestInterval{100};
constexpr std::chrono::seconds kLongestInterval{1};
constexpr char kErasure[] = "\r\x1b[K";
constexpr char kPrefix[] = "vrxhost: ";
constexpr char kCut[] = "...";

bool IsTerminal()
{
    const char* const kind = std::getenv("TERM");
    return ::isatty(STDERR_FILENO) == 1 && kind && std::strcmp(kind, "dumb") != 0;
}

// Asked each time: the user may change it.
std::size_t TerminalWidth()
{
    constexpr std::size_t kDefaultWidth = 80;
    winsize size = {};
    return ::ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0 ? size.ws_col : kDefaultWidth;
}

// A character outside ASCII may take two columns or none.
std::string Plain(std::string text)
{
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c < ' ' || c > '~'; }, '?');
    return text;
}

// A terminal that was stopped (^S) must not stop the run.
void WriteToTerminal(const std::string& text)
{
    pollfd terminal = {STDERR_FILENO, POLLOUT, 0};
    if (::poll(&terminal, 1, 0) == 1) {
        static_cast<void>(!::write(STDERR_FILENO, text.data(), text.size()));
    }
}

// Signals are for the threads that wait for them.
std::thread StartWithoutSignals(const std::function<void()>& work)
{
    sigset_t all, before;
    sigfillset(&all);
    ::pthread_sigmask(SIG_SETMASK, &all, &before);
    std::thread thread(work);
    ::pthread_sigmask(SIG_SETMASK, &before, nullptr);
    return thread;
}

} // namespace

// The seconds stay visible on the narrowest terminal; the last column stays free, because some terminals fold after it.
std::string StatusText(const TStep& step, long seconds, std::size_t width)
{
    const std::string limit = step.fTimeoutSeconds > 0 ? " of " + std::to_string(step.fTimeoutSeconds) + " s" : "";
    const std::string time = ", " + std::to_string(seconds) + " s" + limit;
    std::string text = kPrefix + Plain(step.fText);
    const std::size_t columns = width > 0 ? width - 1 : 0;
    if (text.size() + time.size() > columns) {
        const std::size_t left = columns - std::min(columns, time.size() + sizeof kCut - 1);
        text = text.substr(0, left) + kCut;
    }
    return (text + time).substr(0, columns);
}

TStatusLine::TStatusLine(bool isWanted) : fIsActive(isWanted && IsTerminal())
{
    if (fIsActive) {
        fThread = StartWithoutSignals([this] { Draw(); });
    }
}

TStatusLine::~TStatusLine()
{
    if (fIsActive) {
        {
            const std::lock_guard<std::mutex> lock(fMutex);
            fIsEnding = true;
        }
        fChanged.notify_all();
        fThread.join();
    }
}

void TStatusLine::Show(const TStep& step)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fStep = step;
    fBegan = std::chrono::steady_clock::now();
    fHasChanged = true;
    fChanged.notify_all();
}

TStatusLine::TGap::TGap(TStatusLine& line) : fLock(line.fMutex)
{
    line.Erase();
}

const char* TStatusLine::GetErasure() const
{
    return fIsActive ? kErasure : "";
}

// On the thread: after each drawing a pause, then the next change or second.
void TStatusLine::Draw()
{
    std::unique_lock<std::mutex> lock(fMutex);
    while (!fIsEnding) {
        Redraw();
        fChanged.wait_for(lock, kShortestInterval, [this] { return fIsEnding; });
        fChanged.wait_for(lock, kLongestInterval - kShortestInterval, [this] { return fIsEnding || fHasChanged; });
    }
    Erase();
}

// Here and in Erase the caller holds the mutex.
void TStatusLine::Redraw()
{
    fHasChanged = false;
    if (fStep.fText.empty()) {
        Erase();
        return;
    }
    const auto seconds =
        std::chrono::duration_cast<std::chrono::seconds>(std::chrono::steady_clock::now() - fBegan).count();
    WriteToTerminal(kErasure + StatusText(fStep, seconds, TerminalWidth()));
    fIsDrawn = true;
}

void TStatusLine::Erase()
{
    if (fIsDrawn) {
        WriteToTerminal(kErasure);
    }
    fIsDrawn = false;
}

} // namespace vrxhost
