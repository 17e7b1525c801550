// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Exception.h>

PEGASUS_NAMESPACE_BEGIN

// The server's answer is unusable as an HTTP message.
class PEGASUS_CLIENT_LINKAGE CIMClientMalformedHTTPException : public Exception
{
  public:
    CIMClientMalformedHTTPException(const String& message);
    ~CIMClientMalformedHTTPException() override;
};

// The server answered with another HTTP status than 200.
class PEGASUS_CLIENT_LINKAGE CIMClientHTTPErrorException : public Exception
{
  public:
    CIMClientHTTPErrorException(Uint32 httpStatusCode, const String& cimError = String(),
                                const String& cimErrorDetail = String());
    CIMClientHTTPErrorException(Uint32 httpStatusCode, const String& reasonPhrase, const String& cimError,
                                const String& cimErrorDetail);
    CIMClientHTTPErrorException(const CIMClientHTTPErrorException& exception) = default;
    ~CIMClientHTTPErrorException() override;
    CIMClientHTTPErrorException& operator=(const CIMClientHTTPErrorException& exception) = default;

    // Returns: the HTTP status.
    Uint32 getCode() const;
    String getCIMError() const;
    String getCIMErrorDetail() const;

  private:
    Uint32 fCode;
    String fCIMError;
    String fCIMErrorDetail;
};

// The answer's XML is not well formed, not CIM-XML, or holds a value that does not fit its type.
class PEGASUS_CLIENT_LINKAGE CIMClientXmlException : public Exception
{
  public:
    CIMClientXmlException(const String& message);
    ~CIMClientXmlException() override;
};

// The answer is CIM-XML, but not an answer to the request.
class PEGASUS_CLIENT_LINKAGE CIMClientResponseException : public Exception
{
  public:
    CIMClientResponseException(const String& message);
    ~CIMClientResponseException() override;
};

PEGASUS_NAMESPACE_END
