#pragma once

#include <host/ICIMInstance.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>

#include <map>

namespace NKOLVRX20 {

// An instance whose property values are kept in memory; the base of instances that a plug-in serves.
// Names are normalised (lower case) on set and on get.
// Ownership: keeps its class alive.
// Thread: one at a time.
class TInmemInstance : public ICIMInstance, public boost::enable_shared_from_this<TInmemInstance>
{
  public:
    TInmemInstance(boost::shared_ptr<ICIMClass> instanceClass, TCIMContext context);
    ~TInmemInstance() override;

    TInmemInstance(const TInmemInstance&) = delete;
    TInmemInstance& operator=(const TInmemInstance&) = delete;

    void Validate(TCIMContext context) override;
    void AddToNamespace(TCIMContext context) override;
    void ModifyInstance(boost::shared_ptr<ICIMInstance> newValues, TCIMContext context) override;
    void Delete(TCIMContext context) override;
    // Returns: the class's namespace, and a path made of the class name and the values of its key properties.
    TCIMReference GetReference(TCIMContext context) const override;
    boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const override;
    std::string GetPegasusNSPStr() const override;
    // Visit nothing: an instance in memory knows no associations.
    void EnumerateAssociatedInstances(TInstanceVisitor visitor, const std::string& associationClass,
                                      const std::string& resultClass, const std::string& role,
                                      const std::string& resultRole, TCIMContext context) override;
    void EnumerateAssociationInstances(TInstanceVisitor visitor, const std::string& resultClass,
                                       const std::string& role, TCIMContext context) override;
    boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const override;
    // The declaration, where the class has one, gives the property its name's spelling and its texts.
    void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) override;
    // In byte order of the normalised names.
    void EnumerateProperties(TPropertyVisitor visitor, TCIMContext context) const override;
    // Throws: TVRXException 31.
    TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) override;
    bool operator==(const ICIMInstance& other) const override;
    bool operator<(const ICIMInstance& other) const override;
    ICIMInstance& operator=(const ICIMInstance& other) override;

  private:
    boost::shared_ptr<ICIMClass> fClass;
    std::map<std::string, boost::shared_ptr<ICIMProperty>> fProperties; // by normalised name
};

} // namespace NKOLVRX20
