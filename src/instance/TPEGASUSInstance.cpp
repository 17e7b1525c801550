// SPDX-License-Identifier: MIT
#include "src/instance/TPEGASUSInstance.h"

#include "src/common/ClientConnection.h"
#include "src/common/Constants.h"
#include "src/common/CoreLog.h"
#include "src/instance/MethodValues.h"

#include <host/ICIMClass.h>
#include <host/ICIMMethodDecl.h>
#include <host/ICIMNamespace.h>
#include <host/ICIMParameterDecl.h>
#include <host/ICIMQualifier.h>
#include <host/TVRXException.h>

namespace NKOLVRX20 {

namespace {

constexpr Pegasus::Uint32 kMethodTimeoutMs = 300000;

boost::shared_ptr<ICIMParameterDecl> ParameterDeclOf(const ICIMClass& instanceClass, const std::string& method,
                                                     const std::string& parameter)
{
    const auto methodDecl = instanceClass.GetMethodDecl(method, {});
    auto parameterDecl = methodDecl ? methodDecl->GetParameterDecl(parameter, {}) : nullptr;
    if (!parameterDecl) {
        LogAndThrow(TVRXStatusCode::kNotFound, "TPEGASUSInstance::InvokeMethod failed: ", instanceClass.GetName({}),
                    ".", method, methodDecl ? " declares no parameter " + parameter : " is not declared");
    }
    return parameterDecl;
}

// Returns: the namespace, whose client carries method calls; it is kept alive during the call.
// Throws: boost::bad_weak_ptr when it is gone.
boost::shared_ptr<ICIMNamespace> NamespaceOf(const ICIMClass& instanceClass)
{
    auto ns = instanceClass.GetNamespace({});
    if (!ns) {
        throw boost::bad_weak_ptr();
    }
    return ns;
}

Pegasus::CIMParamValue ReferenceParameter(const std::string& method, const std::string& name, const TCIMValue& value)
{
    return MethodInput("TPEGASUSInstance::InvokeMethod", method, name, [&value] {
        return Pegasus::CIMValue(Pegasus::CIMObjectPath(Pegasus::String(value.ToString(kDecimal).c_str())));
    });
}

} // namespace

TPEGASUSInstance::TPEGASUSInstance(boost::shared_ptr<ICIMClass> instanceClass, TCIMContext context)
    : TInmemInstance(instanceClass, context), fPegNameSpace(std::make_unique<Pegasus::CIMNamespaceName>()),
      fPegInstanceName(std::make_unique<Pegasus::CIMObjectPath>())
{
}

TPEGASUSInstance::~TPEGASUSInstance() = default;

void TPEGASUSInstance::AddToNamespace(TCIMContext context)
{
    GetClass(context)->AddInstance(shared_from_this());
}

std::string TPEGASUSInstance::GetPegasusNSPStr() const
{
    return fNsp;
}

// Both tests are made, so that a parameter of both directions is sent twice; the servers expect it.
Pegasus::Array<Pegasus::CIMParamValue> TPEGASUSInstance::InputsFor(const std::string& method,
                                                                   const TCIMContext& parameters) const
{
    Pegasus::Array<Pegasus::CIMParamValue> inputs;
    for (const auto& [name, value] : parameters) {
        const auto declaration = ParameterDeclOf(*GetClass({}), method, name);
        if (declaration->GetQualifier("OUT", {})) {
            inputs.append(ReferenceParameter(method, name, value));
        }
        if (declaration->GetQualifier("IN", {})) {
            inputs.append(ReferenceParameter(method, name, value));
        }
    }
    return inputs;
}

TCIMValue TPEGASUSInstance::InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext)
{
    const Pegasus::CIMName method(name.c_str());
    const auto inputs = InputsFor(name, parameters);
    const auto instanceClass = GetClass({});
    const auto ns = NamespaceOf(*instanceClass);
    Pegasus::Array<Pegasus::CIMParamValue> outputs;
    Pegasus::CIMValue returned;
    try {
        Pegasus::CIMClient& client = dynamic_cast<const TClientOwner&>(*ns).ConnectedClient();
        client.setTimeout(kMethodTimeoutMs);
        returned = client.invokeMethod(*fPegNameSpace, *fPegInstanceName, method, inputs, outputs);
    } catch (const Pegasus::Exception& exception) {
        LogProgress("pegClient->invokeMethod returned exception: ", ToStdString(exception.getMessage()));
        return TCIMValue();
    }
    TCIMValue result = MethodValueToHost(name, returned, instanceClass);
    const auto logOutput = [](const std::string& output) { LogProgress("adding output param : ", output); };
    AddOutputs(outputs, instanceClass, logOutput, parameters);
    return result;
}

} // namespace NKOLVRX20
