// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMQualifier.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// A qualifier on a mirrored element.
// Ownership: points to the element weakly, shares the declaration.
class TPEGASUSQualifier : public ICIMQualifier, public boost::enable_shared_from_this<TPEGASUSQualifier>
{
  public:
    // Requires: a declaration.
    TPEGASUSQualifier(const boost::shared_ptr<ICIMNamedElement>& element,
                      boost::shared_ptr<const ICIMQualifierDecl> declaration, TCIMValue value,
                      ICIMQualifierDecl::EFlavor flavor);

    TPEGASUSQualifier(const TPEGASUSQualifier&) = delete;
    TPEGASUSQualifier& operator=(const TPEGASUSQualifier&) = delete;

    // Returns at once.
    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when the element is gone; TVRXException 25.
    void AddToClassOrProperty(TCIMContext context) override;
    // Throws: TVRXException 31, always: a mirrored element keeps its qualifiers.
    void RemoveFromClassOrProperty(TCIMContext context) override;
    std::string GetName(TCIMContext context) const override;
    boost::shared_ptr<ICIMNamedElement> GetClassOrProperty(TCIMContext context) const override;
    // Returns: the declaration's type.
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    boost::shared_ptr<const ICIMQualifierDecl> GetDeclaration(TCIMContext context) const override;
    TCIMValue GetValue(TCIMContext context) const override;
    void SetValue(TCIMValue value, TCIMContext context) override;
    void SetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) override;
    void UnsetFlavor(ICIMQualifierDecl::EFlavor flavor, TCIMContext context) override;
    ICIMQualifierDecl::EFlavor GetFlavor(TCIMContext context) const override;
    // By name, case included, and then by value.
    bool operator==(const ICIMQualifier& other) const override;
    bool operator<(const ICIMQualifier& other) const override;
    bool GetPropagated(TCIMContext context) const override;
    // Takes over the value alone.
    ICIMQualifier& operator=(const ICIMQualifier& other) override;

    void SetPropagated(bool propagated) { fPropagated = propagated; }

  private:
    boost::weak_ptr<ICIMNamedElement> fElement;
    boost::shared_ptr<const ICIMQualifierDecl> fDeclaration;
    TCIMValue fValue;
    ICIMQualifierDecl::EFlavor fFlavor;
    bool fPropagated = false;
};

} // namespace NKOLVRX20
