// SPDX-License-Identifier: MIT
#pragma once

#include <host/ILogger.h>

#include <mutex>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// Is the host's core logger while it lives, and keeps what is logged as "severity|text".
class TCapturedLog : public ILogger
{
  public:
    TCapturedLog();
    ~TCapturedLog() override;

    void Log(EVRXLogSeverity severity, const std::string& text) override;

    std::vector<std::string> Lines() const;
    // Returns: the lines that begin with the prefix ("3|TPEGASUSNamespace::connect").
    std::vector<std::string> LinesWith(const std::string& prefix) const;
    // Returns: the lines so far, which are then forgotten.
    std::vector<std::string> Take();

    // From now on a text that contains this makes Log throw std::runtime_error; the empty text ends it.
    void FailOn(const std::string& part);

  private:
    mutable std::mutex fMutex;
    std::vector<std::string> fLines;
    std::string fFailingPart;
    ILogger* fReplaced;
};

} // namespace NKOLVRX20
