#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a property in a class.
class ICIMPropertyDecl : public ICIMNamedElement
{
  public:
    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToClass(TCIMContext context) = 0;
    virtual void RemoveFromClass(TCIMContext context) = 0;
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the class that declares it, null when that is gone.
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    virtual bool IsArray(TCIMContext context) const = 0;
    virtual TCIMValue GetDefaultValue(TCIMContext context) const = 0;
    virtual void SetDefaultValue(TCIMValue value, TCIMContext context) = 0;
    virtual bool operator==(const ICIMPropertyDecl& other) const = 0;
    virtual bool operator<(const ICIMPropertyDecl& other) const = 0;
    virtual ICIMPropertyDecl& operator=(const ICIMPropertyDecl& other) = 0;
};

} // namespace NKOLVRX20
