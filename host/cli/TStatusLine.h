// SPDX-License-Identifier: MIT
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>

namespace vrxhost {

// What a run waits for.
struct TStep
{
    std::string fText;       // "class LNX_Memory of linuxinventory"
    int fTimeoutSeconds = 0; // 0: unknown
};

// Returns: the step and how long it has taken, "vrxhost: starting the server, 3 s of 60 s", cut to the width.
std::string StatusText(const TStep& step, long seconds, std::size_t width);

// One line on a terminal's standard error that shows what a run waits for. It is redrawn when the step changes and
// every second, at most ten times a second, and removed before anything else is written. Without a terminal nothing is
// drawn. Thread: safe. Its own thread runs from the start, so that the host's threads never become more.
class TStatusLine
{
  public:
    // isWanted: false for a line that is never drawn.
    explicit TStatusLine(bool isWanted);
    // Removes the line.
    ~TStatusLine();

    TStatusLine(const TStatusLine&) = delete;
    TStatusLine& operator=(const TStatusLine&) = delete;

    // Begins a step.
    void Show(const TStep& step);

    // Keeps the line removed while it lives, for other output on the terminal.
    class TGap
    {
      public:
        explicit TGap(TStatusLine& line);

      private:
        const std::lock_guard<std::mutex> fLock;
    };

    // Returns: what removes the line, to go before a text that is written without a gap; empty without a terminal.
    const char* GetErasure() const;

  private:
    void Draw();
    void Erase();
    void Redraw();

    const bool fIsActive;
    std::mutex fMutex;
    std::condition_variable fChanged;
    TStep fStep;
    std::chrono::steady_clock::time_point fBegan;
    bool fHasChanged = false;
    bool fIsDrawn = false;
    bool fIsEnding = false;
    std::thread fThread;
};

} // namespace vrxhost
