// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/TQualifiedElement.h"

#include <host/ICIMParameterDecl.h>

#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSMethodDecl;

// The declaration of a parameter of a mirrored method.
// Ownership: points to its method weakly.
class TPEGASUSParameterDecl : public TQualifiedElement<TPEGASUSParameterDecl, ICIMParameterDecl>
{
  public:
    TPEGASUSParameterDecl(const boost::shared_ptr<TPEGASUSMethodDecl>& owner, std::string name,
                          TCIMValue::TCIMType type);

    TPEGASUSParameterDecl(const TPEGASUSParameterDecl&) = delete;
    TPEGASUSParameterDecl& operator=(const TPEGASUSParameterDecl&) = delete;

    // Returns at once.
    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when the method is gone; TVRXException 25.
    void AddToMethod(TCIMContext context) override;
    std::string GetName(TCIMContext context) const override;
    // Returns: null when it is gone.
    boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(TCIMContext context) const override;
    TCIMValue::TCIMType GetType(TCIMContext context) const override;
    bool IsArray(TCIMContext context) const override;
    // By name, case included.
    bool operator==(const ICIMParameterDecl& other) const override;
    bool operator<(const ICIMParameterDecl& other) const override;
    // Leaves this declaration as it is.
    ICIMParameterDecl& operator=(const ICIMParameterDecl& other) override;

  private:
    boost::weak_ptr<TPEGASUSMethodDecl> fOwner;
    const std::string fName;
    const TCIMValue::TCIMType fType;
};

} // namespace NKOLVRX20
