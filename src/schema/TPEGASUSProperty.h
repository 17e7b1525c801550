// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMProperty.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

namespace NKOLVRX20 {

// A property with a value, on a mirrored class.
// Ownership: points to its declaration and its class weakly.
class TPEGASUSProperty : public ICIMProperty
{
  public:
    TPEGASUSProperty(TCIMValue value, const boost::shared_ptr<ICIMPropertyDecl>& declaration,
                     const boost::shared_ptr<ICIMClass>& owner);

    TPEGASUSProperty(const TPEGASUSProperty&) = delete;
    TPEGASUSProperty& operator=(const TPEGASUSProperty&) = delete;

    // Returns: the declaration's type; the value's own when the declaration is gone.
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    bool IsDefaultValue(TCIMContext context) const override;
    TCIMValue GetValue(TCIMContext context) const override;
    void SetValue(TCIMValue value, TCIMContext context) override;
    // Returns: whether the server says so, or another class declares it.
    bool GetPropagated(TCIMContext context) const override;
    boost::shared_ptr<ICIMPropertyDecl> GetDeclaration(TCIMContext context) const override;
    // By value.
    bool operator==(const ICIMProperty& other) const override;
    bool operator<(const ICIMProperty& other) const override;
    // Takes over the value alone.
    ICIMProperty& operator=(const ICIMProperty& other) override;
    TCIMValue GetPrevValue() const override;
    void SetPrevValue(TCIMValue value) override;
    void SetPrevValue() override;
    bool IsPrevValueDifferent() const override;
    std::string ToString() const override;
    std::string PrevValueToString() const override;
    std::vector<std::string> ToStringVector() const override;

    void SetPropagated(bool propagated) { fPropagated = propagated; }

  private:
    TCIMValue fValue;
    TCIMValue fPrevValue;
    boost::weak_ptr<ICIMPropertyDecl> fDeclaration;
    boost::weak_ptr<ICIMClass> fOwner;
    bool fPropagated = false;
};

} // namespace NKOLVRX20
