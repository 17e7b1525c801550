// SPDX-License-Identifier: MIT
#include "src/common/CoreLog.h"

#include <Pegasus/Common/Exception.h>
#include <host/TRootObject.h>

#include <exception>

namespace NKOLVRX20 {

void WriteCoreLog(ILogger::EVRXLogSeverity severity, const std::string& text)
{
    TRootObject::GetCoreLogger()->Log(severity, text);
}

// Thrown once more to find its family: the client library's exceptions have a base class of their own.
std::string DescribeCurrentException()
{
    try {
        throw;
    } catch (const Pegasus::Exception& exception) {
        return ToStdString(exception.getMessage());
    } catch (const std::exception& exception) {
        return exception.what();
    } catch (...) {
        return "an exception of unknown type";
    }
}

} // namespace NKOLVRX20
