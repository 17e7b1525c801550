// SPDX-License-Identifier: MIT
#pragma once

#include <host/ICIMInstance.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>

#include <memory>

namespace NKOLVRX20 {

class TInmemValues;

// An instance whose property values are kept in memory; the base of the instances that a plug-in serves. It implements
// every slot of ICIMInstance, whose comments hold; what is said there of the host's part is this class.
//
// An implementer provides the constructor and these operations. A plug-in overrides exactly AddToNamespace,
// GetPegasusNSPStr and InvokeMethod.
// Here and below, names are matched in lower case; an undeclared name is kept as well.
// Ownership: always held by boost::shared_ptr. Keeps its class alive.
// Thread: one at a time.
class TInmemInstance : public ICIMInstance, public boost::enable_shared_from_this<TInmemInstance>
{
  public:
    // The class may be null: path and declarations are then empty, and AddToNamespace returns at once. The context is
    // ignored.
    TInmemInstance(boost::shared_ptr<ICIMClass> instanceClass, TCIMContext context);
    ~TInmemInstance() override;

    TInmemInstance(const TInmemInstance&) = delete;
    TInmemInstance& operator=(const TInmemInstance&) = delete;

    void Validate(TCIMContext context) override;
    // Throws: boost::bad_weak_ptr when no shared pointer owns the instance; so does Delete.
    void AddToNamespace(TCIMContext context) override;
    void ModifyInstance(boost::shared_ptr<ICIMInstance> newValues, TCIMContext context) override;
    void Delete(TCIMContext context) override;
    // Returns: the class's namespace, and a path made of the class name and the values of its key properties, in the
    // order in which the class enumerates its keys and with the types that it declares; strings are quoted, numbers and
    // booleans are bare.
    TCIMReference GetReference(TCIMContext context) const override;
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const override;
    // Returns: the empty text.
    std::string GetPegasusNSPStr() const override;
    // Leave the visitor uncalled: associations are beyond an instance in memory.
    void EnumerateAssociatedInstances(TInstanceVisitor visitor, const std::string& associationClass,
                                      const std::string& resultClass, const std::string& role,
                                      const std::string& resultRole, TCIMContext context) override;
    void EnumerateAssociationInstances(TInstanceVisitor visitor, const std::string& resultClass,
                                       const std::string& role, TCIMContext context) override;
    // Throws: TVRXException 15 for a property that the instance lacks.
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const override;
    // The declaration, where the class has one, gives the property its name's spelling and its texts. A property that
    // is there already keeps its object: pointers from GetProperty see the new value.
    // Throws: what ICIMClass::GetPropertyDecl throws, but for 15.
    void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) override;
    // In byte order of the lower-cased names. The visitor may set values.
    void EnumerateProperties(TPropertyVisitor visitor, TCIMContext context) const override;
    // Throws: TVRXException 31: methods are beyond an instance in memory.
    TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) override;
    bool operator==(const ICIMInstance& other) const override;
    bool operator<(const ICIMInstance& other) const override;
    // Throws: what the other's class and properties throw; the instance is then as it was.
    ICIMInstance& operator=(const ICIMInstance& other) override;

  private:
    boost::shared_ptr<ICIMClass> fClass;
    std::unique_ptr<TInmemValues> fValues; // relies on the class
};

} // namespace NKOLVRX20
