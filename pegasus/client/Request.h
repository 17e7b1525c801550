// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/RequestEnvelope.h"

#include <string>
#include <string_view>

namespace Pegasus::client {

// One operation as it goes over the wire: the CIM-XML of its call, and what the HTTP header says about it.
struct Request
{
    std::string method;
    std::string object; // for the CIMObject field, percent-encoded
    std::string call;   // the METHODCALL or IMETHODCALL element
    bool isIntrinsic = true;
    std::string_view result; // the element that an answer without an error has; empty when it may have none
};

// The call is empty afterwards.
Request makeRequest(wire::IntrinsicCall& call);

// A call of a provider's method. Throws: InvalidNamespaceNameException (null).
Request makeMethodRequest(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                          const Array<CIMParamValue>& parameters);

// Returns: the whole HTTP message. `host` is the Host field's text; `localUser` is the name that the private socket
// gets, empty for TCP.
std::string encodeHttpRequest(const Request& request, std::string_view messageId, std::string_view host,
                              std::string_view localUser);

} // namespace Pegasus::client
