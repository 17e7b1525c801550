// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMValue.h>
#include <Pegasus/Common/String.h>

#include <functional>
#include <string>
#include <string_view>

namespace Pegasus::cmpi {

// What accompanies every request to a provider.
struct ProviderRequest
{
    std::string provider; // PG_Provider.Name, byte for byte: the prefix of the library's entry points
    CIMNamespaceName nameSpace;
    String principal;       // the caller's user name
    String acceptLanguages; // may be empty
    bool includeQualifiers = false;
    bool includeClassOrigin = false;
};

// Where a provider's results go: each one is passed on as soon as the provider returns it.
using InstanceSink = std::function<void(const CIMInstance&)>;
using InstanceTextSink = std::function<void(std::string_view element)>; // an instance, written as VALUE.NAMEDINSTANCE
using PathSink = std::function<void(const CIMObjectPath&)>;
using ReturnValueSink = std::function<void(const CIMValue&)>;

} // namespace Pegasus::cmpi
