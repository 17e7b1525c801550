#include "pegasus/server/agent/AgentMessages.h"

#include "pegasus/wire/ElementEncoder.h"

namespace Pegasus::server {

const char* const kUnloadMethod = "PG_Unload";

namespace {

// An intrinsic call; `parameters` are IPARAMVALUE elements.
AgentRequest makeRequest(const char* method, const CIMNamespaceName& nameSpace, const std::string& parameters)
{
    AgentRequest request;
    request.method = method;
    request.object = std::string(nameSpace.getString().getCString());
    request.body = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n"
                   "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\">\n<SIMPLEREQ>\n<IMETHODCALL NAME=\"";
    request.body += method;
    request.body += "\">\n";
    wire::appendLocalNamespacePath(request.body, nameSpace);
    request.body += parameters;
    request.body += "</IMETHODCALL>\n</SIMPLEREQ>\n</MESSAGE>\n</CIM>\n";
    return request;
}

std::string classNameParameter(const CIMName& className)
{
    std::string text = "<IPARAMVALUE NAME=\"ClassName\">\n";
    wire::appendClassName(text, className);
    return text + "</IPARAMVALUE>\n";
}

std::string propertyListParameter(const CIMPropertyList& properties)
{
    if (properties.isNull()) {
        return {};
    }
    Array<String> names;
    for (Uint32 i = 0; i < properties.size(); ++i) {
        names.append(properties[i].getString());
    }
    std::string text = "<IPARAMVALUE NAME=\"PropertyList\">\n";
    wire::appendValue(text, CIMValue(names));
    return text + "</IPARAMVALUE>\n";
}

} // namespace

AgentRequest makeEnumerateInstancesRequest(const CIMNamespaceName& nameSpace, const CIMName& className,
                                           const CIMPropertyList& properties)
{
    return makeRequest("EnumerateInstances", nameSpace,
                       classNameParameter(className) + propertyListParameter(properties));
}

AgentRequest makeEnumerateInstanceNamesRequest(const CIMNamespaceName& nameSpace, const CIMName& className)
{
    return makeRequest("EnumerateInstanceNames", nameSpace, classNameParameter(className));
}

AgentRequest makeUnloadRequest()
{
    return makeRequest(kUnloadMethod, CIMNamespaceName("root"), "");
}

} // namespace Pegasus::server
