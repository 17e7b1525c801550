// SPDX-License-Identifier: MIT
#pragma once

#include "host/inmem/InstanceLayout.h"

#include <host/ICIMProperty.h>

namespace NKOLVRX20 {

// A property of an instance in memory: a value, the previous one, and the declaration that gives it its texts.
// Ownership: weak pointers to the declaration and the class.
class TInmemProperty : public ICIMProperty
{
  public:
    // A place for a property. Set makes it one; before that, the instance lacks it.
    TInmemProperty() = default;
    void Set(std::shared_ptr<const TInmemMember> member, TCIMValue&& value)
    {
        fMember = std::move(member);
        fValue = std::move(value);
    }
    bool IsSet() const { return fMember != nullptr; }
    void ReplaceValue(TCIMValue&& value) { fValue = std::move(value); }

    // Returns: the declaration's name, or the name that the instance was given where the class lacks the property.
    std::string GetName() const;

    // Returns: the name of any property: the contract names it by its declaration, and one of this class knows its own.
    static std::string NameOf(const ICIMProperty& property);

    // Returns: the value's type; for a null of unknown type the declaration's.
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    bool IsDefaultValue(TCIMContext context) const override;
    TCIMValue GetValue(TCIMContext context) const override;
    void SetValue(TCIMValue value, TCIMContext context) override;
    // Returns: true when the declaration belongs to another class than the instance.
    bool GetPropagated(TCIMContext context) const override;
    boost::shared_ptr<ICIMPropertyDecl> GetDeclaration(TCIMContext context) const override;
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

  private:
    std::shared_ptr<const TInmemMember> fMember;
    TCIMValue fValue;
    TCIMValue fPrevValue;
};

} // namespace NKOLVRX20
