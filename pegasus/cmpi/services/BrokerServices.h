// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMValue.h>
#include <Pegasus/Common/Exception.h>

#include <string>

namespace Pegasus::cmpi {

// What the broker needs from the server around it: the class schema, the operations that providers call back
// ("upcalls"), and a log. Operations have the meaning of the CIMClient members of the same names.
//
// Throws: CIMException with the operation's status. Any other exception (Pegasus::Exception, std::exception) reaches
//     the provider as CMPI_RC_ERROR_SYSTEM with its text.
// Thread: called on every thread that runs a provider, several at once, and again on another thread while an earlier
//     call waits (a provider may enumerate its own class). An implementation therefore needs a pool of connections; one
//     connection under a lock would deadlock.
// Blocks: up to the implementation's own timeout. The broker's locks are free during the call.
class BrokerServices
{
  public:
    enum class Severity
    {
        kError,
        kWarning,
        kInformation,
        kDebug
    };

    virtual ~BrokerServices() = default;

    // Returns: the whole class, inherited members and qualifiers included (localOnly false, includeQualifiers true).
    virtual CIMClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className) = 0;

    virtual CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                    const CIMPropertyList& properties) = 0;
    // Subclasses' instances too, with all their properties. A path that omits its namespace is in `nameSpace`.
    virtual Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                  const CIMPropertyList& properties) = 0;
    virtual Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace,
                                                        const CIMName& className) = 0;
    virtual CIMValue invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                                  const Array<CIMParamValue>& in, Array<CIMParamValue>& out) = 0;

    // The defaults of the next three throw CIM_ERR_NOT_SUPPORTED, for servers that lack the operation.
    virtual CIMObjectPath createInstance(const CIMNamespaceName&, const CIMInstance&)
    {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, String("CreateInstance"));
    }
    virtual void modifyInstance(const CIMNamespaceName&, const CIMInstance&, const CIMPropertyList&)
    {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, String("ModifyInstance"));
    }
    virtual void deleteInstance(const CIMNamespaceName&, const CIMObjectPath&)
    {
        throw CIMException(CIM_ERR_NOT_SUPPORTED, String("DeleteInstance"));
    }

    // Whether calls fail that would fail on OpenPegasus 2.14, though the broker could carry them out.
    virtual bool strictProviders() const { return false; }

    // A message of a provider, or of the broker about a provider. `text` is UTF-8, one line or several.
    virtual void log(Severity severity, const std::string& text) noexcept = 0;
};

} // namespace Pegasus::cmpi
