// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/ICIMElement.h>
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// An instance of a class. The rules of HostFwd.h hold. TInmemInstance implements the interface in the host's own
// library; a plug-in derives from it.
//
// Here: a copy of one instance of the private server, as it was when ICIMClass::EnumerateInstances or
// ICIMNamespace::GetInstance fetched it. Changes stay in memory; only InvokeMethod reaches the server. The instance
// keeps its class alive, and the namespace only weakly.
class ICIMInstance : public ICIMElement
{
  public:
    // Checks the values against the class's declarations. Here: returns at once; values are kept as they were set.
    virtual void Validate(TCIMContext context) = 0;
    // Enters the instance into its class (ICIMClass::AddInstance).
    virtual void AddToNamespace(TCIMContext context) = 0;
    // Takes over every property that the other instance holds. In memory only.
    virtual void ModifyInstance(boost::shared_ptr<ICIMInstance> newValues, TCIMContext context) = 0;
    // Takes the instance out of its class (ICIMClass::RemoveInstance). In memory only.
    virtual void Delete(TCIMContext context) = 0;
    // Returns: the class's namespace and the path text Class.key=value,... made of the key properties that the instance
    // holds.
    virtual TCIMReference GetReference(TCIMContext context) const = 0;
    // Returns: what GetReference returns. The host implements this slot.
    virtual TCIMReference BuildPath(TCIMContext context) const;
    // Returns: the instance's class.
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    // Returns: the server namespace that the instance was enumerated in, for instance "root/cimv2"; empty for an
    // instance that ICIMNamespace::GetInstance or AllocateInstance made.
    virtual std::string GetPegasusNSPStr() const = 0;
    // Visits the instances that associations link with this one; an empty text lets every instance pass.
    // Here: this and the next one leave the visitor uncalled. Enumerate the association class and read its references.
    virtual void EnumerateAssociatedInstances(TInstanceVisitor visitor, const std::string& associationClass,
                                              const std::string& resultClass, const std::string& role,
                                              const std::string& resultRole, TCIMContext context) = 0;
    // Visits the association instances that refer to this one.
    virtual void EnumerateAssociationInstances(TInstanceVisitor visitor, const std::string& resultClass,
                                               const std::string& role, TCIMContext context) = 0;
    // Returns: the property; its value may be null.
    // Throws: TVRXException 15 for a property that the instance lacks.
    virtual boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const = 0;
    // Sets a value of any type, also of an undeclared property. In memory only.
    virtual void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) = 0;
    // Visits the properties that the instance holds.
    virtual void EnumerateProperties(TPropertyVisitor visitor, TCIMContext context) const = 0;
    // Calls an extrinsic method on the instance. parameters holds the inputs by name and receives the outputs; an
    // output replaces an entry of its name.
    // Here: every parameter travels as a reference made of its text; one that is qualified both IN and OUT is sent
    // twice, one that lacks both stays behind. A method whose parameters are of other types is called
    // through the class (ICIMClass::InvokeMethod with the instance's path as target).
    // Returns: the method's return value; null for a void one, and when the server or the method refuses, which the
    // log says.
    // Throws: TVRXException 6 for an undeclared method or parameter, 14 when a parameter's text is a malformed object
    // path, 25 (a parameter's name); Pegasus::Exception when the method's name is an invalid CIM name or an output
    // fails to convert; boost::bad_weak_ptr.
    // Blocks: up to 300 seconds. The namespace's client keeps that timeout.
    virtual TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) = 0;
    // Equal class names, equal properties, equal values.
    virtual bool operator==(const ICIMInstance& other) const = 0;
    // By class name, then by the properties' names and values.
    virtual bool operator<(const ICIMInstance& other) const = 0;
    // Takes over class and values.
    virtual ICIMInstance& operator=(const ICIMInstance& other) = 0;
};

} // namespace NKOLVRX20
