// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/NamedMap.h"
#include "src/schema/TQualifiedElement.h"

#include <host/ICIMMethodDecl.h>

#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;
class TPEGASUSParameterDecl;

// The declaration of a method in a mirrored class.
// Ownership: points to its class weakly, owns its parameters.
class TPEGASUSMethodDecl : public TQualifiedElement<TPEGASUSMethodDecl, ICIMMethodDecl>
{
  public:
    TPEGASUSMethodDecl(const boost::shared_ptr<TPEGASUSClass>& owner, std::string name, TCIMValue::TCIMType returnType);

    TPEGASUSMethodDecl(const TPEGASUSMethodDecl&) = delete;
    TPEGASUSMethodDecl& operator=(const TPEGASUSMethodDecl&) = delete;

    // Returns at once.
    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when the class is gone.
    void AddToClass(TCIMContext context) override;
    std::string GetName(TCIMContext context) const override;
    // Returns: null when it is gone.
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const override;
    TCIMValue::TCIMType GetReturnType(TCIMContext context) const override;
    boost::shared_ptr<ICIMParameterDecl> AllocateParameterDecl(const std::string& name, TCIMValue::TCIMType type,
                                                               TCIMContext context) override;
    // Throws: TVRXException 25.
    boost::shared_ptr<ICIMParameterDecl> GetParameterDecl(const std::string& name, TCIMContext context) const override;
    // In byte order of the normalised names.
    void EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext context) const override;
    // By name, case included.
    bool operator==(const ICIMMethodDecl& other) const override;
    bool operator<(const ICIMMethodDecl& other) const override;
    // Leaves this declaration as it is.
    ICIMMethodDecl& operator=(const ICIMMethodDecl& other) override;

    // Takes the place of a parameter of the same name. Throws: TVRXException 25.
    void AddParameterDecl(const boost::shared_ptr<TPEGASUSParameterDecl>& declaration);

  private:
    boost::weak_ptr<TPEGASUSClass> fOwner;
    const std::string fName;
    const TCIMValue::TCIMType fReturnType;
    TNamedMap<TPEGASUSParameterDecl> fParameters;
};

} // namespace NKOLVRX20
