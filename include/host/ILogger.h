#pragma once

#include <string>

namespace NKOLVRX20 {

// The host's log.
// Thread: safe; an entry is never interleaved with another.
class ILogger
{
  public:
    enum EVRXLogSeverity
    {
        kError = 0,
        kWarning = 1,
        kNotice = 2,
        kInfo = 3,
        kDebug = 4
    };

    virtual ~ILogger() = default;

    virtual void Log(EVRXLogSeverity severity, const std::string& text) = 0;
};

} // namespace NKOLVRX20
