// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>

#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <string>

namespace NKOLVRX20 {

// An object path: the text form of a class or instance name, and the host namespace in which it is meant.
// Here: a reference from the server carries the server's text, keys inside it, and the host namespace of the class that
// holds it, whatever namespace the text names.
// Ownership: holds the namespace weakly. Copies share the keys.
// Thread: distinct references may be used by distinct threads, also when one was copied from the other.
class TCIMReference
{
  public:
    TCIMReference();

    // The path text starts empty; the key map may be empty and the namespace null. SetPath makes the path; the keys
    // stay beside it.
    TCIMReference(const boost::shared_ptr<ICIMNamespace>& ns, const TCIMContext& keys);

    TCIMReference(const TCIMReference&);
    TCIMReference& operator=(const TCIMReference&);
    ~TCIMReference();

    // Replaces the namespace; null removes it.
    void SetNamespace(const boost::shared_ptr<ICIMNamespace>& ns);

    // Returns: the namespace; null when it is unset or gone.
    boost::shared_ptr<ICIMNamespace> GetNamespace() const;

    // Takes "[//host/][namespace:]Class[.key=value,...]", kept byte for byte, unchecked.
    void SetPath(const std::string& path);
    const std::string& GetPath() const;

    // Returns: the class name inside the path; empty when the path is.
    std::string GetClassName() const;

    // Returns: the key map that the reference was made with. A path from the server stays in one piece; its map is
    // empty.
    const TCIMContext& GetKeys() const;

    // By path text alone, byte for byte.
    bool operator==(const TCIMReference& other) const;
    bool operator<(const TCIMReference& other) const;

  private:
    boost::weak_ptr<ICIMNamespace> fNamespace;
    boost::shared_ptr<const TCIMContext> fKeys; // shared among copies, never changed
    std::string fPath;
};

} // namespace NKOLVRX20
