// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/TQualifiedElement.h"

#include <host/ICIMPropertyDecl.h>

#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;

// The declaration of a property in a mirrored class.
// Ownership: points to its class weakly.
class TPEGASUSPropertyDecl : public TQualifiedElement<TPEGASUSPropertyDecl, ICIMPropertyDecl>
{
  public:
    // The default also gives the type: a typed null, or an empty array, when the default is absent.
    TPEGASUSPropertyDecl(const boost::shared_ptr<TPEGASUSClass>& owner, std::string name, TCIMValue defaultValue);

    TPEGASUSPropertyDecl(const TPEGASUSPropertyDecl&) = delete;
    TPEGASUSPropertyDecl& operator=(const TPEGASUSPropertyDecl&) = delete;

    // Returns at once.
    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when the class is gone; what the class's AddPropertyDecl throws.
    void AddToClass(TCIMContext context) override;
    // Throws: TVRXException 31, always.
    void RemoveFromClass(TCIMContext context) override;
    std::string GetName(TCIMContext context) const override;
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const override;
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    TCIMValue GetDefaultValue(TCIMContext context) const override;
    // The type stays as it is.
    void SetDefaultValue(TCIMValue value, TCIMContext context) override;
    // By name, case included.
    bool operator==(const ICIMPropertyDecl& other) const override;
    bool operator<(const ICIMPropertyDecl& other) const override;
    // Leaves this declaration as it is.
    ICIMPropertyDecl& operator=(const ICIMPropertyDecl& other) override;

  private:
    boost::weak_ptr<TPEGASUSClass> fOwner;
    const std::string fName;
    const TCIMValue::TCIMType fType;
    TCIMValue fDefaultValue;
};

} // namespace NKOLVRX20
