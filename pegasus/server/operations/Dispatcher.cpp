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

void notSupported(ServerCore&, const HttpRequest&, const CimRequest&, ElementSink&)
{
    throw CIMException(CIM_ERR_NOT_SUPPORTED, String());
}

struct Entry
{
    const char* name;
    Operation operation;
};

constexpr Entry kOperations[] = {
    {"GetClass", withoutHttp<operations::getClass>},
    {"EnumerateInstances", withoutHttp<operations::enumerateInstances>},
    {"GetInstance", operations::getInstance},
    {"EnumerateInstanceNames", withoutHttp<operations::enumerateInstanceNames>},
    {"GetQualifier", withoutHttp<operations::getQualifier>},
    {"EnumerateQualifiers", withoutHttp<operations::enumerateQualifiers>},
    {"EnumerateClasses", withoutHttp<operations::enumerateClasses>},
    {"EnumerateClassNames", withoutHttp<operations::enumerateClassNames>},
    {"CreateClass", withoutHttp<operations::createClass>},
    {"CreateInstance", withoutHttp<operations::createInstance>},
    {"SetQualifier", withoutHttp<operations::setQualifier>},
    {"DeleteClass", notSupported},
    {"DeleteInstance", notSupported},
    {"DeleteQualifier", notSupported},
    {"ModifyClass", notSupported},
    {"ModifyInstance", notSupported},
    {"GetProperty", notSupported},
    {"SetProperty", notSupported},
    {"ExecQuery", notSupported},
    {"Associators", notSupported},
    {"AssociatorNames", notSupported},
    {"References", notSupported},
    {"ReferenceNames", notSupported},
    {"OpenEnumerateInstances", notSupported},
    {"OpenEnumerateInstancePaths", notSupported},
    {"OpenReferenceInstances", notSupported},
    {"OpenReferenceInstancePaths", notSupported},
    {"OpenAssociatorInstances", notSupported},
    {"OpenAssociatorInstancePaths", notSupported},
    {"OpenQueryInstances", notSupported},
    {"PullInstancesWithPath", notSupported},
    {"PullInstancePaths", notSupported},
    {"PullInstances", notSupported},
    {"CloseEnumeration", notSupported},
    {"EnumerationCount", notSupported},
};

// Returns: null for an unknown method.
Operation findOperation(const CimRequest& request)
{
    for (const Entry& entry : kOperations) {
        if (base::equalNoCase(entry.name, request.method)) {
            return entry.operation;
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
    if (request.isIntrinsic) {
        findOperation(request)(fCore, http, request, answer);
    } else {
        operations::invokeMethod(fCore, http, request, answer);
    }
}

} // namespace Pegasus::server
