// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMNamedElement.h>

namespace NKOLVRX20 {

// The declaration of a method in a class. The rules of HostFwd.h hold. ICIMClass::GetMethodDecl hands it out;
// ICIMInstance::InvokeMethod and ICIMClass::InvokeMethod call what it declares.
class ICIMMethodDecl : public ICIMNamedElement
{
  public:
    // Checks the declaration. Here: returns at once.
    virtual void Validate(TCIMContext context) = 0;
    // Adds the declaration to its class.
    // Here: ignored, as by ICIMClass::AddMethodDecl. Throws: boost::bad_weak_ptr when the class is gone.
    virtual void AddToClass(TCIMContext context) = 0;
    // Returns: the name as the server spells it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the class; null when it is gone.
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    // Returns: a scalar code: methods return scalars.
    virtual TCIMValue::TCIMType GetReturnType(TCIMContext context) const = 0;
    // Makes a parameter declaration. The type is a scalar code, or the array code of an array.
    // Returns: a declaration that points back to this method; ICIMParameterDecl::AddToMethod adds it.
    virtual boost::shared_ptr<ICIMParameterDecl>
    AllocateParameterDecl(const std::string& name, TCIMValue::TCIMType type, TCIMContext context) = 0;
    // Returns: the declaration; null for an undeclared parameter.
    virtual boost::shared_ptr<ICIMParameterDecl> GetParameterDecl(const std::string& name,
                                                                  TCIMContext context) const = 0;
    // Visits the parameters in byte order of their lower-cased names; the order of the signature is lost.
    virtual void EnumerateParameterDecls(TParameterDeclVisitor visitor, TCIMContext context) const = 0;
    // Comparisons are by name. Here: the assignment leaves this declaration as it is.
    virtual bool operator==(const ICIMMethodDecl& other) const = 0;
    virtual bool operator<(const ICIMMethodDecl& other) const = 0;
    virtual ICIMMethodDecl& operator=(const ICIMMethodDecl& other) = 0;
};

} // namespace NKOLVRX20
