// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/TCIMValue.h>

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// Returns: an input parameter with the value that the conversion makes.
// Throws: TVRXException 14, after a log line with the operation, the method and the parameter, when it fails to
// convert.
Pegasus::CIMParamValue MethodInput(const char* operation, const std::string& method, const std::string& name,
                                   const boost::function<Pegasus::CIMValue()>& convert);

// Returns: the value that came back from a method, by its own type; null for null and for a type that the host lacks.
// Throws: as pegValToVRX.
TCIMValue MethodValueToHost(const std::string& name, const Pegasus::CIMValue& value,
                            const boost::shared_ptr<ICIMClass>& forClass);

// Enters the outputs under their names, replacing what is there, and calls onOutput with each name.
// Throws: as pegValToVRX; the outputs before the failing one have been entered.
void AddOutputs(const Pegasus::Array<Pegasus::CIMParamValue>& outputs, const boost::shared_ptr<ICIMClass>& forClass,
                const boost::function<void(const std::string&)>& onOutput, TCIMContext& entries);

} // namespace NKOLVRX20
