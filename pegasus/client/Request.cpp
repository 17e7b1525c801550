// SPDX-License-Identifier: MIT
#include "pegasus/client/Request.h"

#include "pegasus/base/PercentCoding.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/Exception.h>

#include <algorithm>

namespace Pegasus::client {
namespace {

constexpr std::size_t kLengthDigits = 10; // of a length with its leading zeros

std::string encoded(const String& object)
{
    return base::percentEncoded(base::utf8(object), base::PercentSet::kStrict);
}

} // namespace

Request makeRequest(wire::IntrinsicCall& call)
{
    Request request;
    request.method = call.method();
    request.object = encoded(call.nameSpace().getString());
    request.call = call.finish();
    return request;
}

Request makeMethodRequest(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& parameters)
{
    if (nameSpace.isNull()) {
        throw InvalidNamespaceNameException(String());
    }
    CIMObjectPath target = path;
    target.setHost(String());
    target.setNameSpace(nameSpace);
    Request request;
    request.isIntrinsic = false;
    request.method = base::utf8(method);
    request.object = encoded(target.toString());
    request.call = wire::encodeMethodCall(nameSpace, path, method, parameters);
    return request;
}

std::string encodeHttpRequest(const Request& request, std::string_view messageId, std::string_view host,
                              std::string_view localUser)
{
    const std::string content = wire::encodeRequestMessage(messageId, request.call);
    const std::string length = std::to_string(content.size());
    std::string out;
    out.reserve(content.size() + 512);
    out.append("POST /cimom HTTP/1.1\r\nHOST: ").append(host).append("\r\n");
    out.append("Content-Type: application/xml; charset=utf-8\r\n");
    out.append("content-length: ")
        .append(kLengthDigits - std::min(kLengthDigits, length.size()), '0')
        .append(length)
        .append("\r\n");
    out.append("TE: chunked, trailers\r\n");
    out.append("CIMOperation: MethodCall\r\n");
    out.append("CIMMethod: ");
    base::appendPercentEncoded(out, request.method, base::PercentSet::kStrict);
    out.append("\r\n");
    out.append("CIMObject: ").append(request.object).append("\r\n");
    if (!localUser.empty()) {
        out.append("PegasusAuthorization: Local \"").append(localUser).append("\"\r\n");
    }
    return out.append("\r\n").append(content);
}

} // namespace Pegasus::client
