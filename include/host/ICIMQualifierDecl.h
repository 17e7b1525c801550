// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// The declaration of a qualifier in a namespace: its type, default, scopes and flavors. The rules of HostFwd.h hold.
// ICIMNamespace::EnumerateQualifierDecls hands it out.
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

    // Checks the declaration. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Enters the declaration into its namespace.
    // Throws: TVRXException 16 when one of that name is there, 25; boost::bad_weak_ptr when the namespace is gone.
    virtual void AddToNamespace(TCIMContext context) = 0;
    // Takes the declaration out of its namespace.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void RemoveQualifierDecl(TCIMContext context) = 0;
    // Returns: the name as the server spells it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the namespace; null when it is gone.
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array. It is fixed when the declaration is made.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    // Returns: whether GetType is an array code.
    virtual bool IsArray(TCIMContext context) const = 0;
    // Returns: the default; possibly a typed null.
    virtual TCIMValue GetDefaultValue(TCIMContext context) const = 0;
    // Replaces the default by a value of any type; the declared type stays.
    virtual void SetDefaultValue(TCIMValue value, TCIMContext context) = 0;
    // Returns: the elements that the qualifier may stand on.
    virtual EScope GetScope(TCIMContext context) const = 0;
    // Adds the bits to the flavor.
    virtual void SetFlavor(EFlavor flavor, TCIMContext context) = 0;
    // Takes the bits out of the flavor.
    virtual void UnsetFlavor(EFlavor flavor, TCIMContext context) = 0;
    // Returns: the flavor that a qualifier of this declaration gets by default.
    virtual EFlavor GetFlavor(TCIMContext context) const = 0;
    // Comparisons are by name. Here: the assignment leaves this declaration as it is.
    virtual bool operator==(const ICIMQualifierDecl& other) const = 0;
    virtual bool operator<(const ICIMQualifierDecl& other) const = 0;
    virtual ICIMQualifierDecl& operator=(const ICIMQualifierDecl& other) = 0;
};

} // namespace NKOLVRX20
