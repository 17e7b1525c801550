// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/ICIMQualifierDecl.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;
class TPEGASUSNamespace;
class TPEGASUSQualifierDecl;
class TQualifierValues;

// The link from a class, or a qualifier declaration, back to its namespace, with all that it asks of the namespace. The
// one place in this folder that knows the namespace's class.
// Ownership: weak; the namespace owns what points back to it. Every operation but Get throws boost::bad_weak_ptr when
// the namespace is gone.
class TOwningNamespace
{
  public:
    explicit TOwningNamespace(const boost::shared_ptr<TPEGASUSNamespace>& ns);

    // Returns: the namespace as the host sees it; null when it is gone.
    boost::shared_ptr<ICIMNamespace> Get() const;

    bool IsConnected() const;
    // Returns: the namespace's client. Throws: Pegasus::NotConnectedException.
    Pegasus::CIMClient& ConnectedClient() const;

    // Returns: the class through the namespace's cache, as TPEGASUSNamespace::GetClass.
    boost::shared_ptr<ICIMClass> GetClass(const std::string& name, const TCIMContext& context) const;
    // Returns: the class "<root>"; null before start-up.
    boost::shared_ptr<TPEGASUSClass> GetRootClass() const;
    // Throws: TVRXException 16, 25.
    void AddClass(const boost::shared_ptr<TPEGASUSClass>& newClass) const;

    boost::shared_ptr<ICIMQualifierDecl> AllocateQualifierDecl(const std::string& name, const TCIMValue& defaultValue,
                                                               ICIMQualifierDecl::EScope scope,
                                                               ICIMQualifierDecl::EFlavor flavor) const;
    // Returns: the namespace's own declaration; null when absent. Throws: TVRXException 25.
    boost::shared_ptr<TPEGASUSQualifierDecl> FindQualifierDecl(const std::string& name) const;
    // Throws: TVRXException 16, 25.
    void AddQualifierDecl(const boost::shared_ptr<TPEGASUSQualifierDecl>& declaration) const;

    // Returns: the values that the namespace's classes share; they live as long as it.
    TQualifierValues& GetQualifierValues() const;

  private:
    boost::shared_ptr<TPEGASUSNamespace> Lock() const;

    boost::weak_ptr<TPEGASUSNamespace> fNamespace;
};

} // namespace NKOLVRX20
