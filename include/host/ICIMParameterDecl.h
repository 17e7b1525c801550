#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a method's parameter.
class ICIMParameterDecl : public ICIMNamedElement
{
  public:
    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToMethod(TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    virtual boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    virtual bool IsArray(TCIMContext context) const = 0;
    virtual bool operator==(const ICIMParameterDecl& other) const = 0;
    virtual bool operator<(const ICIMParameterDecl& other) const = 0;
    virtual ICIMParameterDecl& operator=(const ICIMParameterDecl& other) = 0;
};

} // namespace NKOLVRX20
