// SPDX-License-Identifier: MIT
#include "tests/src/support/CapturedLog.h"

#include <host/TRootObject.h>

#include <algorithm>
#include <iterator>
#include <stdexcept>

namespace NKOLVRX20 {

TCapturedLog::TCapturedLog() : fReplaced(TRootObject::SetCoreLogger(this)) {}

TCapturedLog::~TCapturedLog()
{
    TRootObject::SetCoreLogger(fReplaced);
}

void TCapturedLog::Log(EVRXLogSeverity severity, const std::string& text)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fFailingPart.empty() && text.find(fFailingPart) != std::string::npos) {
        throw std::runtime_error("the log is full");
    }
    fLines.push_back(std::to_string(severity) + "|" + text);
}

std::vector<std::string> TCapturedLog::Lines() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fLines;
}

std::vector<std::string> TCapturedLog::LinesWith(const std::string& prefix) const
{
    const std::vector<std::string> lines = Lines();
    std::vector<std::string> chosen;
    std::copy_if(lines.begin(), lines.end(), std::back_inserter(chosen),
                 [&prefix](const std::string& line) { return line.compare(0, prefix.size(), prefix) == 0; });
    return chosen;
}

std::vector<std::string> TCapturedLog::Take()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<std::string> taken;
    taken.swap(fLines);
    return taken;
}

void TCapturedLog::FailOn(const std::string& part)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fFailingPart = part;
}

} // namespace NKOLVRX20
