// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>

namespace NKOLVRX20 {

// A named element that carries qualifiers: a class, or the declaration of a property, method or parameter. The rules of
// HostFwd.h hold.
class ICIMNamedElement
{
  public:
    virtual ~ICIMNamedElement() = default;

    // Enters a qualifier; it replaces one of the same name.
    // Here: it must be one that AllocateQualifier of this plug-in made.
    // Throws: TVRXException 14 for null or a qualifier from elsewhere, 25.
    virtual void AddQualifier(boost::shared_ptr<ICIMQualifier> qualifier, TCIMContext context) = 0;

    // Makes a qualifier of the declaration with the value and the declaration's flavor.
    // Returns: a qualifier that points back to this element; AddQualifier enters it.
    // Throws: TVRXException 14 for a null declaration.
    virtual boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                               TCIMValue value, TCIMContext context) = 0;
    // The same with a flavor of its own.
    virtual boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                               TCIMValue value, ICIMQualifierDecl::EFlavor flavor,
                                                               TCIMContext context) = 0;

    // Returns: the qualifier; null when the element lacks it, whatever default the
    // qualifier's declaration has.
    virtual boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext context) const = 0;

    // Visits the qualifiers that the element carries, inherited ones included.
    virtual void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext context) const = 0;

    // The same; found is set to whether the element carries the qualifier.
    virtual boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                          TCIMContext context) const = 0;
};

} // namespace NKOLVRX20
