// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/TInmemInstance.h>

#include <memory>
#include <string>

namespace NKOLVRX20 {

// One instance of the server: the host's in-memory instance, and what is needed to reach it on the server again.
// Ownership: always held by boost::shared_ptr; made by TPEGASUSClass::AllocateInstance. Keeps its class alive.
// Thread: one at a time.
class TPEGASUSInstance : public TInmemInstance
{
  public:
    using TInmemInstance::operator=;

    TPEGASUSInstance(boost::shared_ptr<ICIMClass> instanceClass, TCIMContext context);
    ~TPEGASUSInstance() override;

    // Enters the instance in its class. Throws: boost::bad_weak_ptr when no shared pointer owns it.
    void AddToNamespace(TCIMContext context) override;
    // Returns: the server namespace of the enumeration that made the instance; empty for any other instance.
    std::string GetPegasusNSPStr() const override;
    // Calls the method on the server. Every parameter whose declaration has the qualifier "OUT" travels as a reference
    // made of its text, and once more when it has "IN". Outputs replace entries of the same name.
    // Returns: null also when the server refuses the call, which the log says.
    // Throws, after a log line and before anything is sent: TVRXException 6 for an undeclared method or parameter, 14
    // when a parameter's text is a malformed object path.
    // Throws: Pegasus::Exception when the method's name is an invalid CIM name, or an output fails to convert;
    // boost::bad_weak_ptr when the namespace is gone.
    // Blocks: up to 300 seconds.
    TCIMValue InvokeMethod(const std::string& name, TCIMContext& parameters, TCIMContext context) override;

    void SetPegasusNSPStr(const std::string& nsp) { fNsp = nsp; }
    void setPegNameSpace(const Pegasus::CIMNamespaceName& nameSpace) { *fPegNameSpace = nameSpace; }
    void setPegInstanceName(const Pegasus::CIMObjectPath& instanceName) { *fPegInstanceName = instanceName; }

    // Whether finishGettingInst was called.
    bool instReadytoUse() const { return fReady; }
    void finishGettingInst() { fReady = true; }

  private:
    Pegasus::Array<Pegasus::CIMParamValue> InputsFor(const std::string& method, const TCIMContext& parameters) const;

    bool fReady = false;
    std::string fNsp;
    std::unique_ptr<Pegasus::CIMNamespaceName> fPegNameSpace;
    std::unique_ptr<Pegasus::CIMObjectPath> fPegInstanceName;
};

} // namespace NKOLVRX20
