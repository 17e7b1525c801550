#pragma once

#include <host/HostFwd.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// An object path: the text form of a class or instance name, and the host namespace in which it is meant.
// Ownership: does not keep the namespace alive.
class TCIMReference
{
  public:
    TCIMReference();

    // The path text starts empty; the key map may be empty.
    TCIMReference(const boost::shared_ptr<ICIMNamespace>& ns, const TCIMContext& keys);

    TCIMReference(const TCIMReference&);
    TCIMReference& operator=(const TCIMReference&);
    ~TCIMReference();

    void SetNamespace(const boost::shared_ptr<ICIMNamespace>& ns);

    // Returns: the namespace, null when there is none or it is gone.
    boost::shared_ptr<ICIMNamespace> GetNamespace() const;

    // "[//host/][namespace:]Class[.key=value,...]", kept to the letter.
    void SetPath(const std::string& path);
    const std::string& GetPath() const;

    // Returns: the class name inside the path; empty when the path is.
    std::string GetClassName() const;

    const TCIMContext& GetKeys() const;

    // By path text, byte for byte.
    bool operator==(const TCIMReference& other) const;
    bool operator<(const TCIMReference& other) const;

  private:
    boost::weak_ptr<ICIMNamespace> fNamespace;
    boost::shared_ptr<const TCIMContext> fKeys; // shared among copies, never changed
    std::string fPath;
};

} // namespace NKOLVRX20
