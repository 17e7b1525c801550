// SPDX-License-Identifier: MIT
#include "pegasus/server/agent/AgentHandler.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/OwnedPath.h"
#include "pegasus/base/PercentCoding.h"
#include "pegasus/server/agent/AgentMessages.h"
#include "pegasus/wire/ElementEncoder.h"

#include <cstdlib>
#include <utility>

#include <unistd.h>

namespace Pegasus::server {

namespace {

std::string privateHeader(const HttpRequest& http, const char* name)
{
    const std::string* value = http.header(name);
    return value != nullptr ? base::percentDecoded(*value) : std::string();
}

cmpi::ProviderRequest providerRequest(const HttpRequest& http, const CimRequest& request)
{
    cmpi::ProviderRequest result;
    result.provider = privateHeader(http, "PG-Provider");
    result.nameSpace = request.nameSpace;
    static const String kPrincipal("root");
    result.principal = kPrincipal; // the server's clients are its own user and root, and providers ask for one name
    return result;
}

} // namespace

cmpi::ProviderModule& AgentHandler::module(const HttpRequest& http)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fModule) {
        const std::string library = privateHeader(http, "PG-Library");
        if (fStrictOwners) {
            requireOwned(library);
        }
        fModule = std::make_unique<cmpi::ProviderModule>(fModuleName, library, fServices);
        // A provider that calls exit() ends its agent as it says: this handler runs before the destructors of the
        // library's objects, which its other threads may still use.
        ::on_exit([](int status, void*) { ::_exit(status); }, nullptr);
    }
    return *fModule;
}

// A user who can change the library, or put another one into its folder, would run code as this user.
void AgentHandler::requireOwned(const std::string& library) const
{
    std::string fault = base::ownershipFault(library.substr(0, library.rfind('/') + 1));
    if (fault.empty()) {
        fault = base::ownershipFault(library);
    }
    if (!fault.empty()) {
        const std::string text = "Provider module \"" + fModuleName + "\" is not loaded: " + fault;
        throw CIMException(CIM_ERR_FAILED, String(text.c_str()));
    }
}

void AgentHandler::handle(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    using Operation = void (AgentHandler::*)(const HttpRequest&, const CimRequest&, CimAnswer&);
    static const std::pair<const char*, Operation> kOperations[] = {
        {"EnumerateInstances", &AgentHandler::enumerateInstances},
        {"EnumerateInstanceNames", &AgentHandler::enumerateInstanceNames},
        {"GetInstance", &AgentHandler::getInstance},
        {"CreateInstance", &AgentHandler::createInstance},
        {"ModifyInstance", &AgentHandler::modifyInstance},
        {"DeleteInstance", &AgentHandler::deleteInstance},
        {kUnloadMethod, &AgentHandler::unload},
    };
    if (!request.isIntrinsic) {
        return invokeMethod(http, request, answer);
    }
    for (const auto& [name, operation] : kOperations) {
        if (base::equalNoCase(name, request.method)) {
            return (this->*operation)(http, request, answer);
        }
    }
    throw CIMException(CIM_ERR_NOT_SUPPORTED, String());
}

// Success says that the agent may be ended.
void AgentHandler::unload(const HttpRequest&, const CimRequest&, CimAnswer&)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    if (fModule && fModule->cleanupWhenIdle() != cmpi::ProviderModule::Cleanup::kReleased) {
        throw CIMException(CIM_ERR_FAILED, String("the provider module is in use"));
    }
}

void AgentHandler::enumerateInstances(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    module(http).writeInstances(providerRequest(http, request), request.parameters.className("ClassName"),
                                request.parameters.propertyList(),
                                [&](std::string_view element) { answer.write(element); });
}

void AgentHandler::enumerateInstanceNames(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    std::string text;
    module(http).enumerateInstanceNames(providerRequest(http, request), request.parameters.className("ClassName"),
                                        [&](const CIMObjectPath& path) {
                                            text.clear();
                                            wire::appendInstanceName(text, path, wire::Blanks::kRaw);
                                            answer.write(text);
                                        });
}

void AgentHandler::getInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    std::string text;
    wire::appendInstance(text,
                         module(http).getInstance(providerRequest(http, request),
                                                  request.parameters.instanceName("InstanceName"),
                                                  request.parameters.propertyList()),
                         wire::Blanks::kRaw);
    answer.write(text);
}

void AgentHandler::createInstance(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    std::string text;
    wire::appendInstanceName(
        text, module(http).createInstance(providerRequest(http, request), request.parameters.instance("NewInstance")));
    answer.write(text);
}

void AgentHandler::modifyInstance(const HttpRequest& http, const CimRequest& request, CimAnswer&)
{
    module(http).modifyInstance(providerRequest(http, request), request.parameters.namedInstance("ModifiedInstance"),
                                request.parameters.propertyList());
}

void AgentHandler::deleteInstance(const HttpRequest& http, const CimRequest& request, CimAnswer&)
{
    module(http).deleteInstance(providerRequest(http, request), request.parameters.instanceName("InstanceName"));
}

void AgentHandler::invokeMethod(const HttpRequest& http, const CimRequest& request, CimAnswer& answer)
{
    Array<CIMParamValue> out;
    const CIMValue result = module(http).invokeMethod(providerRequest(http, request), request.object,
                                                      CIMName(String(request.method.c_str())), request.arguments, out);
    std::string text;
    if (!result.isNull()) {
        wire::appendReturnValue(text, result);
    }
    for (Uint32 i = 0; i < out.size(); ++i) {
        wire::appendParamValue(text, out[i]);
    }
    answer.write(text);
}

} // namespace Pegasus::server
