#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// The declaration of a qualifier in a namespace: its type, default, scopes and flavors.
class ICIMQualifierDecl
{
  public:
    // Where the qualifier may stand; bits that are or'ed (DSP0004, 5.5.1).
    enum EScope : unsigned int
    {
        kScopeNone = 0,
        kScopeClass = 1,
        kScopeAssociation = 2,
        kScopeIndication = 4,
        kScopeProperty = 8,
        kScopeReference = 16,
        kScopeMethod = 32,
        kScopeParameter = 64,
        kScopeAny = 127
    };

    // How the qualifier is handed down; bits that are or'ed (DSP0004, 5.6.3).
    enum EFlavor : unsigned int
    {
        kFlavorNone = 0,
        kFlavorOverridable = 1,
        kFlavorToSubclass = 2,
        kFlavorToInstance = 4,
        kFlavorTranslatable = 8,
        kFlavorDisableOverride = 16,
        kFlavorRestricted = 32
    };

    virtual ~ICIMQualifierDecl() = default;

    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToNamespace(TCIMContext context) = 0;
    virtual void RemoveQualifierDecl(TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    virtual bool IsArray(TCIMContext context) const = 0;
    virtual TCIMValue GetDefaultValue(TCIMContext context) const = 0;
    virtual void SetDefaultValue(TCIMValue value, TCIMContext context) = 0;
    virtual EScope GetScope(TCIMContext context) const = 0;
    virtual void SetFlavor(EFlavor flavor, TCIMContext context) = 0;   // adds the bits
    virtual void UnsetFlavor(EFlavor flavor, TCIMContext context) = 0; // takes the bits away
    virtual EFlavor GetFlavor(TCIMContext context) const = 0;
    virtual bool operator==(const ICIMQualifierDecl& other) const = 0;
    virtual bool operator<(const ICIMQualifierDecl& other) const = 0;
    virtual ICIMQualifierDecl& operator=(const ICIMQualifierDecl& other) = 0;
};

} // namespace NKOLVRX20
