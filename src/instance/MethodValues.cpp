// SPDX-License-Identifier: MIT
#include "src/instance/MethodValues.h"

#include "src/common/CoreLog.h"
#include "src/instance/ValueConversion.h"

namespace NKOLVRX20 {

// All families are caught: the client library's exceptions are a family apart from std::exception, and one that got
// through would end a host that passed an invalid path.
Pegasus::CIMParamValue MethodInput(const char* operation, const std::string& method, const std::string& name,
                                   const boost::function<Pegasus::CIMValue()>& convert)
{
    try {
        return Pegasus::CIMParamValue(name.c_str(), convert(), true);
    } catch (...) {
        LogAndThrow(TVRXStatusCode::kTypeMismatch, operation, " failed: ", method, ": parameter ", name,
                    " does not convert: ", DescribeCurrentException());
    }
}

TCIMValue MethodValueToHost(const std::string& name, const Pegasus::CIMValue& value,
                            const boost::shared_ptr<ICIMClass>& forClass)
{
    TCIMValue converted;
    if (!value.isNull()) {
        pegValToVRX(name, value, value.getType(), value.isArray(), converted, forClass);
    }
    return converted;
}

void AddOutputs(const Pegasus::Array<Pegasus::CIMParamValue>& outputs, const boost::shared_ptr<ICIMClass>& forClass,
                const boost::function<void(const std::string&)>& onOutput, TCIMContext& entries)
{
    for (Pegasus::Uint32 i = 0; i < outputs.size(); ++i) {
        const std::string name = ToStdString(outputs[i].getParameterName());
        entries[name] = MethodValueToHost(name, outputs[i].getValue(), forClass);
        onOutput(name);
    }
}

} // namespace NKOLVRX20
