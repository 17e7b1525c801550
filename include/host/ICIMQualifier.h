#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// One qualifier on a class, property, method or parameter.
class ICIMQualifier
{
  public:
    virtual ~ICIMQualifier() = default;

    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToClassOrProperty(TCIMContext context) = 0;
    virtual void RemoveFromClassOrProperty(TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the element that carries it, null when that is gone.
    virtual boost::shared_ptr<ICIMNamedElement> GetClassOrProperty(TCIMContext context) const = 0;
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    virtual bool IsArray(TCIMContext context) const = 0;
    virtual boost::shared_ptr<const ICIMQualifierDecl> GetDeclaration(TCIMContext context) const = 0;
    virtual TCIMValue GetValue(TCIMContext context) const = 0;
    virtual void SetValue(TCIMValue value, TCIMContext context) = 0;
    virtual void SetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) = 0;
    virtual void UnsetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) = 0;
    virtual ICIMQualifierDecl::EFlavor GetFlavor(TCIMContext context) const = 0;
    virtual bool operator==(const ICIMQualifier& other) const = 0;
    virtual bool operator<(const ICIMQualifier& other) const = 0;
    // Returns: true when it was inherited and not set on this very element.
    virtual bool GetPropagated(TCIMContext context) const = 0;
    virtual ICIMQualifier& operator=(const ICIMQualifier& other) = 0;
};

} // namespace NKOLVRX20
