// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace NKOLVRX20 {

// The host's log. TRootObject::GetCoreLogger returns the one that plug-ins write to.
//
// An implementer provides Log so that it
//   - works before the first plug-in is loaded: a plug-in may log while its library is being loaded;
//   - can be called from several threads at once, and keeps each entry in one piece;
//   - returns soon and throws nothing: an exception leaves the operation that logged;
//   - stays out of the plug-in: it is called in the middle of the plug-in's operations.
// Here: severities 0 and 3 only. A line of severity 0 precedes a failure or stands for something that the host will
// miss; a healthy start has some too (the root element and the closing tags of each *.classes.xml are reported, and so
// is an absent "bcu").
class ILogger
{
  public:
    // The numbers 0 and 3 are fixed by the contract, the others are the host's own.
    enum EVRXLogSeverity
    {
        kError = 0,
        kWarning = 1,
        kNotice = 2,
        kInfo = 3,
        kDebug = 4
    };

    virtual ~ILogger() = default;

    // Writes one entry. The text is UTF-8 and may hold several lines: the captured
    // output of a program is one entry of up to TOSSpecific's limit.
    virtual void Log(EVRXLogSeverity severity, const std::string& text) = 0;
};

} // namespace NKOLVRX20
