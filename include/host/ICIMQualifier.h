// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// One qualifier on a class, property, method or parameter. The rules of HostFwd.h hold. ICIMNamedElement::GetQualifier
// hands it out. It keeps its declaration alive, and its element only weakly.
class ICIMQualifier
{
  public:
    virtual ~ICIMQualifier() = default;

    // Checks value and flavor against the declaration. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Enters the qualifier into its element.
    // Throws: what ICIMNamedElement::AddQualifier throws; boost::bad_weak_ptr when the element is gone.
    virtual void AddToClassOrProperty(TCIMContext context) = 0;
    // Takes the qualifier out of its element.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void RemoveFromClassOrProperty(TCIMContext context) = 0;
    // Returns: the declaration's name.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the element that carries it; null when that is gone.
    virtual boost::shared_ptr<ICIMNamedElement> GetClassOrProperty(TCIMContext context) const = 0;
    // Returns: the declaration's type: a scalar code, or the array code of an array.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    // Returns: whether GetType is an array code.
    virtual bool IsArray(TCIMContext context) const = 0;
    // Returns: the declaration that it was made of.
    virtual boost::shared_ptr<const ICIMQualifierDecl> GetDeclaration(TCIMContext context) const = 0;
    // Returns: the qualifier's own value, possibly null.
    virtual TCIMValue GetValue(TCIMContext context) const = 0;
    // Replaces the value by one of any type.
    virtual void SetValue(TCIMValue value, TCIMContext context) = 0;
    // Adds the bits to the flavor.
    virtual void SetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) = 0;
    // Takes the bits out of the flavor.
    virtual void UnsetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) = 0;
    // Returns: the flavor of this qualifier, which may differ from its declaration's.
    virtual ICIMQualifierDecl::EFlavor GetFlavor(TCIMContext context) const = 0;
    // Comparisons are by name, then by value.
    virtual bool operator==(const ICIMQualifier& other) const = 0;
    virtual bool operator<(const ICIMQualifier& other) const = 0;
    // Returns: true when the element inherited the qualifier as it is.
    virtual bool GetPropagated(TCIMContext context) const = 0;
    // Takes over the value alone.
    virtual ICIMQualifier& operator=(const ICIMQualifier& other) = 0;
};

} // namespace NKOLVRX20
