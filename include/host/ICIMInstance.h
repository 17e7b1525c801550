#pragma once

#include <host/HostFwd.h>
#include <host/ICIMElement.h>
#include <host/TCIMReference.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// An instance of a class.
class ICIMInstance : public ICIMElement
{
  public:
    virtual void Validate(TCIMContext context) = 0;
    virtual void AddToNamespace(TCIMContext context) = 0;
    virtual void ModifyInstance(boost::shared_ptr<ICIMInstance> newValues, TCIMContext context) = 0;
    virtual void Delete(TCIMContext context) = 0;
    virtual TCIMReference GetReference(TCIMContext context) const = 0;
    // Returns: what GetReference returns.
    virtual TCIMReference BuildPath(TCIMContext context) const;
    virtual boost::shared_ptr<ICIMClass> GetClass(TCIMContext context) const = 0;
    // Returns: the server namespace that the instance came from; empty when it has none.
    virtual std::string GetPegasusNSPStr() const = 0;
    virtual void EnumerateAssociatedInstances(TInstanceVisitor visitor, const std::string& associationClass,
                                              const std::string& resultClass, const std::string& role,
                                              const std::string& resultRole, TCIMContext context) = 0;
    virtual void EnumerateAssociationInstances(TInstanceVisitor visitor, const std::string& resultClass,
                                               const std::string& role, TCIMContext context) = 0;
    // Throws: TVRXException 15 for a property that the instance does not hold.
    virtual boost::shared_ptr<ICIMProperty> GetProperty(const std::string& name, TCIMContext context) const = 0;
    virtual void SetPropertyValue(const std::string& name, TCIMValue value, TCIMContext context) = 0;
    virtual void EnumerateProperties(TPropertyVisitor visitor, TCIMContext context) const = 0;
    // Calls an extrinsic method. The parameters carry the inputs by name and receive the outputs.
    virtual TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) = 0;
    virtual bool operator==(const ICIMInstance& other) const = 0;
    virtual bool operator<(const ICIMInstance& other) const = 0;
    virtual ICIMInstance& operator=(const ICIMInstance& other) = 0;
};

} // namespace NKOLVRX20
