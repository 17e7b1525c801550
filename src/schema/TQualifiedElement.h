// SPDX-License-Identifier: MIT
#pragma once

#include "src/common/CoreLog.h"
#include "src/schema/NamedMap.h"
#include "src/schema/TPEGASUSQualifier.h"

#include <host/ICIMNamedElement.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/make_shared.hpp>

#include <string>

namespace NKOLVRX20 {

// The qualifier half of every named element: TSelf is the element's class, TInterface the host's interface to it.
// Ownership: TSelf is always held by boost::shared_ptr; its qualifiers point back weakly.
template <typename TSelf, typename TInterface>
class TQualifiedElement : public TInterface, public boost::enable_shared_from_this<TSelf>
{
  public:
    using TInterface::operator=;

    // Takes the place of a qualifier of the same name.
    // Throws: TVRXException 14 for null or a qualifier that another plug-in made, 25 for a bad name.
    void AddQualifier(boost::shared_ptr<ICIMQualifier> qualifier, TCIMContext) override
    {
        const auto own = boost::dynamic_pointer_cast<TPEGASUSQualifier>(qualifier);
        if (!own) {
            LogAndThrow(TVRXStatusCode::kTypeMismatch, "TQualifiedElement::AddQualifier failed: ", this->GetName({}),
                        ": null, or not a qualifier of this plug-in");
        }
        fQualifiers.Put(own->GetName({}), own);
    }

    // Throws: TVRXException 14 for a null declaration.
    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                       TCIMValue value, ICIMQualifierDecl::EFlavor flavor,
                                                       TCIMContext) override
    {
        if (!declaration) {
            LogAndThrow(TVRXStatusCode::kTypeMismatch,
                        "TQualifiedElement::AllocateQualifier failed: ", this->GetName({}), ": no declaration");
        }
        return boost::make_shared<TPEGASUSQualifier>(this->shared_from_this(), declaration, value, flavor);
    }

    boost::shared_ptr<ICIMQualifier> AllocateQualifier(boost::shared_ptr<const ICIMQualifierDecl> declaration,
                                                       TCIMValue value, TCIMContext context) override
    {
        const auto flavor = declaration ? declaration->GetFlavor(context) : ICIMQualifierDecl::kFlavorNone;
        return AllocateQualifier(declaration, value, flavor, context);
    }

    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, TCIMContext) const override
    {
        return fQualifiers.Find(name);
    }

    boost::shared_ptr<ICIMQualifier> GetQualifier(const std::string& name, bool& found, TCIMContext) const override
    {
        auto qualifier = fQualifiers.Find(name);
        found = qualifier != nullptr;
        return qualifier;
    }

    void EnumerateQualifiers(TQualifierVisitor visitor, TCIMContext) const override { fQualifiers.Visit(visitor); }

    // For initialisation, where the maker of many qualifiers has normalised their declaration's name once.
    void EnterQualifier(const std::string& key, const boost::shared_ptr<TPEGASUSQualifier>& qualifier)
    {
        fQualifiers.PutAs(key, qualifier);
    }

  private:
    TNamedMap<TPEGASUSQualifier> fQualifiers;
};

// Returns: whether the element carries the qualifier with the boolean value true.
inline bool HasTrueQualifier(const ICIMNamedElement& element, const std::string& name)
{
    const auto qualifier = element.GetQualifier(name, {});
    return qualifier && qualifier->GetValue({}) == TCIMValue(true);
}

} // namespace NKOLVRX20
