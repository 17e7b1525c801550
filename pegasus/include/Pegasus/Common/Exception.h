// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/CIMStatusCode.h>
#include <Pegasus/Common/String.h>

PEGASUS_NAMESPACE_BEGIN

class CIMInstance;

// Root of everything the library throws. It does not derive from std::exception.
class PEGASUS_COMMON_LINKAGE Exception
{
  public:
    Exception(const String& message);
    Exception(const Exception& exception) = default;
    virtual ~Exception();
    Exception& operator=(const Exception& exception) = default;
    // Valid as long as the exception.
    virtual const String& getMessage() const;

  protected:
    Exception() = default;

  private:
    String fMessage;
};

// "index out of bounds"
class PEGASUS_COMMON_LINKAGE IndexOutOfBoundsException : public Exception
{
  public:
    IndexOutOfBoundsException();
    ~IndexOutOfBoundsException() override;
};

// "already exists: " + message
class PEGASUS_COMMON_LINKAGE AlreadyExistsException : public Exception
{
  public:
    AlreadyExistsException(const String& message);
    ~AlreadyExistsException() override;
};

// "The CIM name is not valid: " + name
class PEGASUS_COMMON_LINKAGE InvalidNameException : public Exception
{
  public:
    InvalidNameException(const String& name);
    ~InvalidNameException() override;
};

// "invalid CIM namespace name: " + name
class PEGASUS_COMMON_LINKAGE InvalidNamespaceNameException : public Exception
{
  public:
    InvalidNamespaceNameException(const String& name);
    ~InvalidNamespaceNameException() override;
};

// "uninitialized object"
class PEGASUS_COMMON_LINKAGE UninitializedObjectException : public Exception
{
  public:
    UninitializedObjectException();
    ~UninitializedObjectException() override;
};

// "type mismatch", or "type mismatch: " + message
class PEGASUS_COMMON_LINKAGE TypeMismatchException : public Exception
{
  public:
    TypeMismatchException();
    TypeMismatchException(const String& message);
    ~TypeMismatchException() override;
};

// "dynamic cast failed"
class PEGASUS_COMMON_LINKAGE DynamicCastFailedException : public Exception
{
  public:
    DynamicCastFailedException();
    ~DynamicCastFailedException() override;
};

// "invalid datetime format"
class PEGASUS_COMMON_LINKAGE InvalidDateTimeFormatException : public Exception
{
  public:
    InvalidDateTimeFormatException();
    ~InvalidDateTimeFormatException() override;
};

// "DateTime is out of range : " + message
class PEGASUS_COMMON_LINKAGE DateTimeOutOfRangeException : public Exception
{
  public:
    DateTimeOutOfRangeException(const String& message);
    ~DateTimeOutOfRangeException() override;
};

// "malformed object name: " + objectName
class PEGASUS_COMMON_LINKAGE MalformedObjectNameException : public Exception
{
  public:
    MalformedObjectNameException(const String& objectName);
    ~MalformedObjectNameException() override;
};

// "Bind failed: " + message
class PEGASUS_COMMON_LINKAGE BindFailedException : public Exception
{
  public:
    BindFailedException(const String& message);
    ~BindFailedException() override;
};

// "Invalid locator: " + locator
class PEGASUS_COMMON_LINKAGE InvalidLocatorException : public Exception
{
  public:
    InvalidLocatorException(const String& locator);
    ~InvalidLocatorException() override;
};

// "Cannot create socket"
class PEGASUS_COMMON_LINKAGE CannotCreateSocketException : public Exception
{
  public:
    CannotCreateSocketException();
    ~CannotCreateSocketException() override;
};

// The message as given.
class PEGASUS_COMMON_LINKAGE CannotConnectException : public Exception
{
  public:
    CannotConnectException(const String& message);
    ~CannotConnectException() override;
};

// "already connected"
class PEGASUS_COMMON_LINKAGE AlreadyConnectedException : public Exception
{
  public:
    AlreadyConnectedException();
    ~AlreadyConnectedException() override;
};

// "not connected"
class PEGASUS_COMMON_LINKAGE NotConnectedException : public Exception
{
  public:
    NotConnectedException();
    ~NotConnectedException() override;
};

// "connection timed out"
class PEGASUS_COMMON_LINKAGE ConnectionTimeoutException : public Exception
{
  public:
    ConnectionTimeoutException();
    ~ConnectionTimeoutException() override;
};

// "Invalid Enumeration Context, uninitilialized"
class PEGASUS_COMMON_LINKAGE InvalidEnumerationContextException : public Exception
{
  public:
    InvalidEnumerationContextException();
    ~InvalidEnumerationContextException() override;
};

// "SSL Exception: " + message
class PEGASUS_COMMON_LINKAGE SSLException : public Exception
{
  public:
    SSLException(const String& message);
    ~SSLException() override;
};

// A CIM operation failed with a status code; the message is exactly the text given.
class PEGASUS_COMMON_LINKAGE CIMException : public Exception
{
  public:
    CIMException(CIMStatusCode code = CIM_ERR_SUCCESS, const String& message = String::EMPTY);
    CIMException(CIMStatusCode code, const String& message, const CIMInstance& instance);
    CIMException(CIMStatusCode code, const String& message, const Array<CIMInstance>& instances);
    CIMException(const CIMException& exception) = default;
    ~CIMException() override;
    CIMException& operator=(const CIMException& exception) = default;

    CIMStatusCode getCode() const;
    // The CIM_Error instances that came with the status.
    Uint32 getErrorCount() const;

  private:
    CIMStatusCode fCode;
    Array<CIMInstance> fErrors;
};

PEGASUS_NAMESPACE_END
