#include "pegasus/client/RequestEncoder.h"

#include "pegasus/base/PercentCoding.h"
#include "pegasus/base/Text.h"
#include "pegasus/wire/ElementEncoder.h"

#include <Pegasus/Common/Exception.h>

namespace Pegasus::client {
namespace {

const CIMNamespaceName& notNull(const CIMNamespaceName& nameSpace)
{
    if (nameSpace.isNull()) {
        throw InvalidNamespaceNameException(String());
    }
    return nameSpace;
}

std::string body(const Request& request, std::string_view messageId)
{
    std::string out;
    out.reserve(request.call.size() + 256);
    out += "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n"
           "<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"";
    out += messageId;
    out += "\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n";
    out += request.call;
    out += "</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
    return out;
}

} // namespace

IntrinsicRequest::IntrinsicRequest(std::string_view method, const CIMNamespaceName& nameSpace, bool isRepeatable)
{
    fRequest.method = method;
    fRequest.object = base::percentEncoded(base::utf8(notNull(nameSpace).getString()), base::PercentSet::kStrict);
    fRequest.isRepeatable = isRepeatable;
    fRequest.call.append("<IMETHODCALL NAME=\"").append(method).append("\">\n");
    wire::appendLocalNamespacePath(fRequest.call, nameSpace);
}

void IntrinsicRequest::open(std::string_view parameter)
{
    fRequest.call.append("<IPARAMVALUE NAME=\"").append(parameter).append("\">\n");
}

void IntrinsicRequest::close()
{
    fRequest.call += "</IPARAMVALUE>\n";
}

IntrinsicRequest& IntrinsicRequest::className(std::string_view parameter, const CIMName& name)
{
    if (name.isNull()) {
        return *this;
    }
    open(parameter);
    wire::appendClassName(fRequest.call, name);
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::instanceName(const CIMObjectPath& path)
{
    open("InstanceName");
    wire::appendInstanceName(fRequest.call, path);
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::flag(std::string_view parameter, Boolean value, Boolean ifMissing)
{
    if (value == ifMissing) {
        return *this;
    }
    open(parameter);
    fRequest.call.append("<VALUE>").append(value ? "TRUE" : "FALSE").append("</VALUE>\n");
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::text(std::string_view parameter, const String& value)
{
    open(parameter);
    fRequest.call += "<VALUE>";
    wire::appendEscaped(fRequest.call, value);
    fRequest.call += "</VALUE>\n";
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::propertyList(const CIMPropertyList& list)
{
    if (list.isNull()) {
        return *this;
    }
    open("PropertyList");
    fRequest.call += "<VALUE.ARRAY>\n";
    for (Uint32 i = 0; i < list.size(); ++i) {
        fRequest.call += "<VALUE>";
        wire::appendEscaped(fRequest.call, list[i].getString());
        fRequest.call += "</VALUE>\n";
    }
    fRequest.call += "</VALUE.ARRAY>\n";
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::newClass(const CIMClass& cimClass)
{
    open("NewClass");
    wire::appendClass(fRequest.call, cimClass);
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::newInstance(const CIMInstance& instance)
{
    open("NewInstance");
    wire::appendInstance(fRequest.call, instance);
    close();
    return *this;
}

IntrinsicRequest& IntrinsicRequest::qualifierDeclaration(const CIMQualifierDecl& declaration)
{
    open("QualifierDeclaration");
    wire::appendQualifierDeclaration(fRequest.call, declaration);
    close();
    return *this;
}

Request IntrinsicRequest::finish()
{
    fRequest.call += "</IMETHODCALL>\n";
    return std::move(fRequest);
}

Request encodeInvokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                           const Array<CIMParamValue>& parameters)
{
    CIMObjectPath target = path;
    target.setHost(String());
    target.setNameSpace(notNull(nameSpace));
    Request request;
    request.isIntrinsic = false;
    request.method = base::utf8(method.getString());
    request.object = base::percentEncoded(base::utf8(target.toString()), base::PercentSet::kStrict);
    request.call = "<METHODCALL NAME=\"";
    wire::appendEscaped(request.call, method.getString());
    request.call += "\">\n";
    if (path.getKeyBindings().size() > 0) {
        wire::appendLocalInstancePath(request.call, nameSpace, path);
    } else {
        wire::appendLocalClassPath(request.call, nameSpace, path.getClassName());
    }
    for (Uint32 i = 0; i < parameters.size(); ++i) {
        wire::appendParamValue(request.call, parameters[i]);
    }
    request.call += "</METHODCALL>\n";
    return request;
}

std::string encodeMessage(const Request& request, std::string_view messageId, std::string_view host,
                          std::string_view localUser)
{
    const std::string content = body(request, messageId);
    char length[16];
    std::snprintf(length, sizeof(length), "%010zu", content.size());
    std::string out;
    out.reserve(content.size() + 512);
    out.append("POST /cimom HTTP/1.1\r\nHOST: ").append(host).append("\r\n");
    out.append("Content-Type: application/xml; charset=utf-8\r\n");
    out.append("content-length: ").append(length).append("\r\n");
    out.append("TE: chunked, trailers\r\n");
    out.append("CIMOperation: MethodCall\r\n");
    const std::string method = base::percentEncoded(request.method, base::PercentSet::kStrict);
    out.append("CIMMethod: ").append(method).append("\r\n");
    out.append("CIMObject: ").append(request.object).append("\r\n");
    if (!localUser.empty()) {
        out.append("PegasusAuthorization: Local \"").append(localUser).append("\"\r\n");
    }
    return out.append("\r\n").append(content);
}

} // namespace Pegasus::client
