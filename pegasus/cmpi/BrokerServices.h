#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMValue.h>

#include <string>

namespace Pegasus::cmpi {

// What the broker needs of the server around it: the class schema, the operations that providers call back ("upcalls"),
// and a log. Operations have the meaning of the CIMClient members of the same names.
//
// Throws: CIMException with the operation's status; whatever else leaves (Pegasus::Exception, std::exception) reaches
// the
//     provider as CMPI_RC_ERROR_SYSTEM with its text.
// Thread: called on every thread that runs a provider, several at once, and again on another thread while an earlier
// call
//     waits (a provider may enumerate its own class): an implementation keeps a pool of connections, never one under a
//     lock.
// Blocks: by the implementation's own time-out; the broker holds no lock meanwhile.
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
    // Subclasses' instances too, with all their properties. A path without namespace is in `nameSpace`.
    virtual Array<CIMInstance> enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                  const CIMPropertyList& properties) = 0;
    virtual Array<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace,
                                                        const CIMName& className) = 0;
    virtual CIMValue invokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                                  const Array<CIMParamValue>& in, Array<CIMParamValue>& out) = 0;

    // The defaults of the rest throw CIM_ERR_NOT_SUPPORTED: for servers that lack the operation.
    virtual CIMObjectPath createInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance);
    virtual void modifyInstance(const CIMNamespaceName& nameSpace, const CIMInstance& instance,
                                const CIMPropertyList& properties);
    virtual void deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path);

    // A provider's own message (`text` in UTF-8, one line or several), or the broker's about a provider.
    // Throws: nothing.
    virtual void log(Severity severity, const std::string& text) noexcept = 0;
};

} // namespace Pegasus::cmpi
