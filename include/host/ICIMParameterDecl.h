// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a method's parameter. The rules of HostFwd.h hold. Its qualifiers IN and OUT say which way it
// travels.
class ICIMParameterDecl : public ICIMNamedElement
{
  public:
    // Checks the declaration. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Adds the declaration to its method; it replaces one of the same name.
    // Throws: TVRXException 25; boost::bad_weak_ptr when the method is gone.
    virtual void AddToMethod(TCIMContext context) = 0;
    // Returns: the name as the server spells it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the method; null when it is gone.
    virtual boost::shared_ptr<ICIMMethodDecl> GetMethodDecl(TCIMContext context) const = 0;
    // Returns: the scalar code, or the array code of an array.
    virtual TCIMValue::TCIMType GetType(TCIMContext context) const = 0;
    // Returns: whether GetType is an array code.
    virtual bool IsArray(TCIMContext context) const = 0;
    // Comparisons are by name. Here: the assignment leaves this declaration as it is.
    virtual bool operator==(const ICIMParameterDecl& other) const = 0;
    virtual bool operator<(const ICIMParameterDecl& other) const = 0;
    virtual ICIMParameterDecl& operator=(const ICIMParameterDecl& other) = 0;
};

} // namespace NKOLVRX20
