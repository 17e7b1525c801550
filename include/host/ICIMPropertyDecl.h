// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a property in a class. The rules of HostFwd.h hold. ICIMClass::GetPropertyDecl hands it out; its
// qualifiers carry what a value means (Units, Values, ValueMap) and whether it is a KEY.
class ICIMPropertyDecl : public ICIMNamedElement
{
  public:
    // Checks the declaration. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Adds the declaration to its class.
    // Throws: what ICIMClass::AddPropertyDecl throws; boost::bad_weak_ptr when the class is gone.
    virtual void AddToClass(TCIMContext context) = 0;
    // Takes the declaration out of its class.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual void RemoveFromClass(TCIMContext context) = 0;
    // Returns: the name as the server spells it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the class that it is declared for; null when that is gone.
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array. It is fixed when the declaration is made.
    // Here: a type that lacks a code in the host is declared as a string.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    // Returns: whether GetType is an array code.
    virtual bool IsArray(TCIMContext context) const = 0;
    // Returns: the default, possibly null.
    virtual TCIMValue GetDefaultValue(TCIMContext context) const = 0;
    // Replaces the default by a value of any type; the declared type stays.
    virtual void SetDefaultValue(TCIMValue value, TCIMContext context) = 0;
    // Comparisons are by name. Here: the assignment leaves this declaration as it is.
    virtual bool operator==(const ICIMPropertyDecl& other) const = 0;
    virtual bool operator<(const ICIMPropertyDecl& other) const = 0;
    virtual ICIMPropertyDecl& operator=(const ICIMPropertyDecl& other) = 0;
};

} // namespace NKOLVRX20
