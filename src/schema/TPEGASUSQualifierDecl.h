// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/OwningNamespace.h"

#include <host/ICIMQualifierDecl.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// The declaration of a qualifier, as the server has it.
// Ownership: points to its namespace weakly.
class TPEGASUSQualifierDecl : public ICIMQualifierDecl, public boost::enable_shared_from_this<TPEGASUSQualifierDecl>
{
  public:
    // The default also gives the type: a typed null, or an empty array, when the default is absent.
    TPEGASUSQualifierDecl(const boost::shared_ptr<TPEGASUSNamespace>& ns, std::string name, TCIMValue defaultValue,
                          EScope scope, EFlavor flavor);

    TPEGASUSQualifierDecl(const TPEGASUSQualifierDecl&) = delete;
    TPEGASUSQualifierDecl& operator=(const TPEGASUSQualifierDecl&) = delete;

    // Returns at once.
    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when the namespace is gone; TVRXException 16, 25.
    void AddToNamespace(TCIMContext context) override;
    // Throws: TVRXException 31, always.
    void RemoveQualifierDecl(TCIMContext context) override;
    std::string GetName(TCIMContext context) const override;
    // Returns: null when it is gone.
    boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const override;
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    TCIMValue GetDefaultValue(TCIMContext context) const override;
    void SetDefaultValue(TCIMValue value, TCIMContext context) override;
    EScope GetScope(TCIMContext context) const override;
    void SetFlavor(EFlavor flavor, TCIMContext context) override;
    void UnsetFlavor(EFlavor flavor, TCIMContext context) override;
    EFlavor GetFlavor(TCIMContext context) const override;
    // By name, case included.
    bool operator==(const ICIMQualifierDecl& other) const override;
    bool operator<(const ICIMQualifierDecl& other) const override;
    // Leaves this declaration as it is.
    ICIMQualifierDecl& operator=(const ICIMQualifierDecl& other) override;

  private:
    const std::string fName;
    const TCIMValue::TCIMType fType;
    TCIMValue fDefaultValue;
    const EScope fScope;
    EFlavor fFlavor;
    TOwningNamespace fNamespace;
};

} // namespace NKOLVRX20
