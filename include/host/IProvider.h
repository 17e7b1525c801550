#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// One vendor's provider as the host lists it.
class IProvider
{
  public:
    virtual ~IProvider() = default;

    virtual std::string GetName(TCIMContext context) const = 0;
    virtual std::string GetModuleName(TCIMContext context) const = 0;
    virtual std::string GetDescription(TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    virtual void EnumerateClassesProvided(TClassVisitor visitor, TCIMContext context) = 0;
    virtual IProvider& operator=(const IProvider& other) = 0;
};

} // namespace NKOLVRX20
