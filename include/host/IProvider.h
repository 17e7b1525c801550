// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// One vendor's provider as the host lists it. ICIMNamespace::EnumerateProviders hands it out.
// Here: made of one *.classes.xml file. After the namespace's end its texts stay readable and its list of classes is
// empty.
class IProvider
{
  public:
    virtual ~IProvider() = default;

    // Returns: the vendor's name for the provider. Here: <module name="..."/> of the file; empty when the file lacks
    // it.
    virtual std::string GetName(TCIMContext context) const = 0;
    // Returns: the provider's library, the suffix left out. Here: "lib" and the name.
    virtual std::string GetModuleName(TCIMContext context) const = 0;
    // Returns: a text for a person. Here: the name again.
    virtual std::string GetDescription(TCIMContext context) const = 0;
    // Returns: the namespace that the provider belongs to.
    // Here: unsupported. Throws: TVRXException 31, always.
    virtual boost::shared_ptr<ICIMNamespace> GetNamespace(TCIMContext context) const = 0;
    // Visits the classes that the provider delivers.
    // Here: in the order of the file, those that the server knew when the namespace was allocated; classes that the
    // file tags "CDM" and those whose qualifier DONTCOLLECT is true are left out. What the visitor returns is ignored.
    // A TVRXException of the visitor is a line in the log and costs that class only; other exceptions leave.
    // Threads: one thread of a namespace at a time; a visitor of EnumerateProviders that runs on threads only collects
    // the providers (ICIMNamespace).
    virtual void EnumerateClassesProvided(TClassVisitor visitor, TCIMContext context) = 0;
    // Here: leaves this provider as it is.
    virtual IProvider& operator=(const IProvider& other) = 0;
};

} // namespace NKOLVRX20
