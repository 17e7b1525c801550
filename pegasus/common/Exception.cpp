// SPDX-License-Identifier: MIT
#include "pegasus/common/ArrayImpl.h"

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/Exception.h>

namespace Pegasus {

Exception::Exception(const String& message) : fMessage(message) {}
Exception::~Exception() = default;

const String& Exception::getMessage() const
{
    return fMessage;
}

IndexOutOfBoundsException::IndexOutOfBoundsException() : Exception("index out of bounds") {}
IndexOutOfBoundsException::~IndexOutOfBoundsException() = default;

AlreadyExistsException::AlreadyExistsException(const String& message) : Exception("already exists: " + message) {}
AlreadyExistsException::~AlreadyExistsException() = default;

InvalidNameException::InvalidNameException(const String& name) : Exception("The CIM name is not valid: " + name) {}
InvalidNameException::~InvalidNameException() = default;

InvalidNamespaceNameException::InvalidNamespaceNameException(const String& name)
    : Exception("invalid CIM namespace name: " + name)
{
}
InvalidNamespaceNameException::~InvalidNamespaceNameException() = default;

UninitializedObjectException::UninitializedObjectException() : Exception("uninitialized object") {}
UninitializedObjectException::~UninitializedObjectException() = default;

TypeMismatchException::TypeMismatchException() : Exception("type mismatch") {}
TypeMismatchException::TypeMismatchException(const String& message) : Exception("type mismatch: " + message) {}
TypeMismatchException::~TypeMismatchException() = default;

DynamicCastFailedException::DynamicCastFailedException() : Exception("dynamic cast failed") {}
DynamicCastFailedException::~DynamicCastFailedException() = default;

InvalidDateTimeFormatException::InvalidDateTimeFormatException() : Exception("invalid datetime format") {}
InvalidDateTimeFormatException::~InvalidDateTimeFormatException() = default;

DateTimeOutOfRangeException::DateTimeOutOfRangeException(const String& message)
    : Exception("DateTime is out of range : " + message)
{
}
DateTimeOutOfRangeException::~DateTimeOutOfRangeException() = default;

MalformedObjectNameException::MalformedObjectNameException(const String& objectName)
    : Exception("malformed object name: " + objectName)
{
}
MalformedObjectNameException::~MalformedObjectNameException() = default;

BindFailedException::BindFailedException(const String& message) : Exception("Bind failed: " + message) {}
BindFailedException::~BindFailedException() = default;

InvalidLocatorException::InvalidLocatorException(const String& locator) : Exception("Invalid locator: " + locator) {}
InvalidLocatorException::~InvalidLocatorException() = default;

CannotCreateSocketException::CannotCreateSocketException() : Exception("Cannot create socket") {}
CannotCreateSocketException::~CannotCreateSocketException() = default;

CannotConnectException::CannotConnectException(const String& message) : Exception(message) {}
CannotConnectException::~CannotConnectException() = default;

AlreadyConnectedException::AlreadyConnectedException() : Exception("already connected") {}
AlreadyConnectedException::~AlreadyConnectedException() = default;

NotConnectedException::NotConnectedException() : Exception("not connected") {}
NotConnectedException::~NotConnectedException() = default;

ConnectionTimeoutException::ConnectionTimeoutException() : Exception("connection timed out") {}
ConnectionTimeoutException::~ConnectionTimeoutException() = default;

InvalidEnumerationContextException::InvalidEnumerationContextException()
    : Exception("Invalid Enumeration Context, uninitilialized")
{
}
InvalidEnumerationContextException::~InvalidEnumerationContextException() = default;

SSLException::SSLException(const String& message) : Exception("SSL Exception: " + message) {}
SSLException::~SSLException() = default;

CIMException::CIMException(CIMStatusCode code, const String& message) : Exception(message), fCode(code) {}

CIMException::CIMException(CIMStatusCode code, const String& message, const CIMInstance& instance)
    : Exception(message), fCode(code), fErrors(&instance, 1)
{
}

CIMException::CIMException(CIMStatusCode code, const String& message, const Array<CIMInstance>& instances)
    : Exception(message), fCode(code), fErrors(instances)
{
}

CIMException::~CIMException() = default;

CIMStatusCode CIMException::getCode() const
{
    return fCode;
}

Uint32 CIMException::getErrorCount() const
{
    return fErrors.size();
}

} // namespace Pegasus
