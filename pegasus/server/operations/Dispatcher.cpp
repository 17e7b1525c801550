// SPDX-License-Identifier: MIT
#include "pegasus/server/operations/Dispatcher.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/server/operations/Operations.h"

namespace Pegasus::server {

namespace {

using Operation = void (*)(ServerCore&, const HttpRequest&, const CimRequest&, ElementSink&);

template <void (*operation)(ServerCore&, const CimRequest&, ElementSink&)>
void withoutHttp(ServerCore& core, const HttpRequest&, const CimRequest& request, ElementSink& answer)
{
    operation(core, request, answer);
}

// The names in DSP0200 of an operation and its parameters, separated by blanks.
struct Entry
{
    const char* name;
    Operation operation; // null: CIM_ERR_NOT_SUPPORTED
    const char* required = "";
    const char* optional = "";
};

constexpr Entry kOperations[] = {
    {"GetClass", withoutHttp<operations::getClass>, "ClassName",
     "LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateInstances", withoutHttp<operations::enumerateInstances>, "ClassName",
     "LocalOnly DeepInheritance IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"GetInstance", operations::getInstance, "InstanceName",
     "LocalOnly IncludeQualifiers IncludeClassOrigin PropertyList"},
    {"EnumerateInstanceNames", withoutHttp<operations::enumerateInstanceNames>, "ClassName"},
    {"GetQualifier", withoutHttp<operations::getQualifier>, "QualifierName"},
    {"EnumerateQualifiers", withoutHttp<operations::enumerateQualifiers>},
    {"EnumerateClasses", withoutHttp<operations::enumerateClasses>, "",
     "ClassName DeepInheritance LocalOnly IncludeQualifiers IncludeClassOrigin"},
    {"EnumerateClassNames", withoutHttp<operations::enumerateClassNames>, "", "ClassName DeepInheritance"},
    {"CreateClass", withoutHttp<operations::createClass>, "NewClass"},
    {"CreateInstance", operations::createInstance, "NewInstance"},
    {"ModifyInstance", operations::modifyInstance, "ModifiedInstance", "IncludeQualifiers PropertyList"},
    {"DeleteInstance", operations::deleteInstance, "InstanceName"},
    {"GetProperty", withoutHttp<operations::getProperty>, "InstanceName PropertyName"},
    {"SetProperty", withoutHttp<operations::setProperty>, "InstanceName PropertyName", "NewValue"},
    {"SetQualifier", withoutHttp<operations::setQualifier>, "QualifierDeclaration"},
    {"DeleteClass", nullptr},
    {"DeleteQualifier", nullptr},
    {"ModifyClass", nullptr},
    {"ExecQuery", nullptr},
    {"Associators", nullptr},
    {"AssociatorNames", nullptr},
    {"References", nullptr},
    {"ReferenceNames", nullptr},
    {"OpenEnumerateInstances", nullptr},
    {"OpenEnumerateInstancePaths", nullptr},
    {"OpenReferenceInstances", nullptr},
    {"OpenReferenceInstancePaths", nullptr},
    {"OpenAssociatorInstances", nullptr},
    {"OpenAssociatorInstancePaths", nullptr},
    {"OpenQueryInstances", nullptr},
    {"PullInstancesWithPath", nullptr},
    {"PullInstancePaths", nullptr},
    {"PullInstances", nullptr},
    {"CloseEnumeration", nullptr},
    {"EnumerationCount", nullptr},
};

// Returns: null for an unknown method.
const Entry* findOperation(const CimRequest& request)
{
    for (const Entry& entry : kOperations) {
        if (base::equalNoCase(entry.name, request.method)) {
            return &entry;
        }
    }
    return nullptr;
}

} // namespace

bool Dispatcher::knowsMethod(const CimRequest& request) const
{
    return !request.isIntrinsic || findOperation(request) != nullptr;
}

void Dispatcher::handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    if (!request.isIntrinsic) {
        return operations::invokeMethod(fCore, http, request, answer);
    }
    const Entry& entry = *findOperation(request);
    if (entry.operation == nullptr) {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, String());
    }
    request.parameters.check(entry.required, entry.optional);
    entry.operation(fCore, http, request, answer);
}

} // namespace Pegasus::server
