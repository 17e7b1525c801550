// SPDX-License-Identifier: MIT
// What a run waits for, learnt from what the host sees of the plug-in: its log lines and the programs that it runs.
#pragma once

#include "host/cli/TStatusLine.h"
#include "host/cli/losses/TVendorFiles.h"

#include <host/ILogger.h>

#include <optional>
#include <string>
#include <vector>

namespace vrxhost {

// Returns: the step that a line begins; none for most lines.
std::optional<TStep> StepOfLine(const std::string& line);

// Returns: the step that lasts as long as the program.
TStep StepOfProgram(const std::vector<std::string>& arguments, int timeoutSeconds);

// Returns: fetching the instances of the class, with the timeout that its vendor's class list gives it.
TStep StepOfClass(const std::string& provider, const std::string& className, const TVendorFiles& vendors);

// The host's core logger while it works: shows the steps that lines begin, and passes the lines on.
class TStepLog : public NKOLVRX20::ILogger
{
  public:
    // The references outlive the object.
    TStepLog(TStatusLine& line, NKOLVRX20::ILogger& next) : fLine(line), fNext(next) {}
    void Log(EVRXLogSeverity severity, const std::string& text) override;

  private:
    TStatusLine& fLine;
    NKOLVRX20::ILogger& fNext;
};

} // namespace vrxhost
