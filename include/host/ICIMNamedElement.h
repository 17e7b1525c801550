#pragma once

#include <host/HostFwd.h>
#include <host/ICIMQualifierDecl.h>

namespace NKOLVRX20 {

// A named element that carries qualifiers: a class, a property, a method or a parameter declaration.
class ICIMNamedElement
{
  public:
    virtual ~ICIMNamedElement() = default;

    virtual void AddQualifier(boost::shared_ptr<ICIMQualifier> qualifier, TCIMContext context) = 0;

    // Builds a qualifier of the declaration with the value, owned by this element but not yet added to it; the
    // shorter form takes the declaration's flavor.
    virtual boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                               TCIMValue value, TCIMContext context) = 0;
    virtual boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                               TCIMValue value, ICIMQualifierDecl::EFlavor flavor,
                                                               TCIMContext context) = 0;

    // Returns: the qualifier of that name, case ignored; null when the element has none.
    virtual boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext context) const = 0;

    virtual void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext context) const = 0;

    // As above; found tells a missing qualifier from one that is there.
    virtual boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found,
                                                          TCIMContext context) const = 0;
};

} // namespace NKOLVRX20
