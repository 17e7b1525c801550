#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a method in a class.
class ICIMMethodDecl : public ICIMNamedElement
{
  public:
    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToClass(TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    virtual TCIMValue::TCIMType GetReturnType(TCIMContext context) const = 0;
    // Builds a parameter declaration, owned by this method but not yet added to it (see AddToMethod).
    virtual boost::shared_ptr<ICIMParameterDecl>
    AllocateParameterDecl(const std::string& name, TCIMValue::TCIMType type, TCIMContext context) = 0;
    // Returns: the parameter of that name, case ignored; null when there is none.
    virtual boost::shared_ptr<ICIMParameterDecl> GetParameterDecl(const std::string& name,
                                                                  TCIMContext context) const = 0;
    virtual void EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext context) const = 0;
    virtual bool operator==(const ICIMMethodDecl& other) const = 0;
    virtual bool operator<(const ICIMMethodDecl& other) const = 0;
    virtual ICIMMethodDecl& operator=(const ICIMMethodDecl& other) = 0;
};

} // namespace NKOLVRX20
