// SPDX-License-Identifier: MIT
#include <Pegasus/Client/CIMClientException.h>

#include <string>

namespace Pegasus {
namespace {

// `HTTP Error (400 Bad Request): CIMError = "..." Detail = "...".` with the parts that there are.
String httpErrorText(Uint32 code, const String& reason, const String& cimError, const String& detail)
{
    String text("HTTP Error (");
    text.append(std::to_string(code).c_str());
    if (reason.size() > 0) {
        text.append(" ").append(reason);
    }
    text.append(")");
    if (cimError.size() > 0 || detail.size() > 0) {
        text.append(":");
    }
    if (cimError.size() > 0) {
        text.append(" CIMError = \"").append(cimError).append("\"");
    }
    if (detail.size() > 0) {
        text.append(" Detail = \"").append(detail).append("\"");
    }
    return text.append(".");
}

} // namespace

CIMClientMalformedHTTPException::CIMClientMalformedHTTPException(const String& message) : Exception(message) {}
CIMClientMalformedHTTPException::~CIMClientMalformedHTTPException() = default;

CIMClientHTTPErrorException::CIMClientHTTPErrorException(Uint32 httpStatusCode, const String& cimError,
                                                         const String& cimErrorDetail)
    : CIMClientHTTPErrorException(httpStatusCode, String(), cimError, cimErrorDetail)
{
}

CIMClientHTTPErrorException::CIMClientHTTPErrorException(Uint32 httpStatusCode, const String& reasonPhrase,
                                                         const String& cimError, const String& cimErrorDetail)
    : Exception(httpErrorText(httpStatusCode, reasonPhrase, cimError, cimErrorDetail)), fCode(httpStatusCode),
      fCIMError(cimError), fCIMErrorDetail(cimErrorDetail)
{
}

CIMClientHTTPErrorException::~CIMClientHTTPErrorException() = default;

Uint32 CIMClientHTTPErrorException::getCode() const
{
    return fCode;
}

String CIMClientHTTPErrorException::getCIMError() const
{
    return fCIMError;
}

String CIMClientHTTPErrorException::getCIMErrorDetail() const
{
    return fCIMErrorDetail;
}

CIMClientXmlException::CIMClientXmlException(const String& message) : Exception(message) {}
CIMClientXmlException::~CIMClientXmlException() = default;

CIMClientResponseException::CIMClientResponseException(const String& message) : Exception(message) {}
CIMClientResponseException::~CIMClientResponseException() = default;

} // namespace Pegasus
