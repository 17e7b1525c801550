// Extrinsic methods, called through the class.
#include "src/common/ConnectedClient.h"
#include "src/instance/MethodResult.h"
#include "src/instance/ValueConversion.h"
#include "src/namespace/TPEGASUSNamespace.h"
#include "src/schema/TPEGASUSClass.h"

namespace NKOLVRX20 {

TCIMValue TPEGASUSClass::InvokeMethod(const std::string&, TCIMContext&, TCIMContext)
{
    return TCIMValue();
}

TCIMValue TPEGASUSClass::InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                                      TCIMContext& outputs, TCIMContext)
{
    const Pegasus::CIMObjectPath path(Pegasus::String(target.GetPath().c_str()));
    const Pegasus::CIMName method(name.c_str());
    Pegasus::Array<Pegasus::CIMParamValue> pegInputs;
    for (const auto& [inputName, input] : inputs) {
        Pegasus::CIMValue value;
        vrxValToPeg(input, value);
        pegInputs.append(Pegasus::CIMParamValue(inputName.c_str(), value, true));
    }
    Pegasus::Array<Pegasus::CIMParamValue> pegOutputs;
    const Pegasus::CIMValue returned =
        ConnectedClient(*LockNamespace()).invokeMethod(fPegasusNsp, path, method, pegInputs, pegOutputs);
    TCIMValue result = MethodValueToHost(name, returned, shared_from_this());
    AddOutputs(
        pegOutputs, shared_from_this(), [](const std::string&) {}, outputs);
    return result;
}

} // namespace NKOLVRX20
