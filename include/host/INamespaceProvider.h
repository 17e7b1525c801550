#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// The entry object of a plug-in: it makes namespaces of one kind.
class INamespaceProvider
{
  public:
    virtual ~INamespaceProvider() = default;

    // Returns: the kind of namespace, which is also the name that the host's manager knows the provider by.
    virtual std::string GetName(TCIMContext context) const = 0;
    // The context keys "repository" and "upcall" hold addresses of boost::shared_ptr<ICIMNamespace> as kUint64;
    // the pointed-to pointers outlive the call.
    virtual boost::shared_ptr<ICIMNamespace> AllocateNamespace(TCIMContext context, bool create,
                                                               std::string name) const = 0;
    virtual int GetType(TCIMContext context) const = 0;
    virtual bool IsIndicationsSupported(TCIMContext context) const = 0;
};

} // namespace NKOLVRX20
