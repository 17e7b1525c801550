// SPDX-License-Identifier: MIT
#pragma once

#include "providers/linux/Record.h"

#include <cmpi/cmpi.h>

#include <string>

namespace lnx {

// Returns: the string's text; the empty text for null.
std::string textOf(const CMPIString* string);

// Records in the broker's terms.
// Ownership: objects that the broker makes belong to the running call, which may make thousands. Whatever is needed for
// one property or key only is released after its use; the broker copies what setProperty and addKey are given. Paths
// and instances that are returned are the caller's to release. Thread: distinct objects may be used by distinct
// threads.
class CmpiRecord
{
  public:
    // Requires: broker and `nameSpace` outlive the object.
    CmpiRecord(const CMPIBroker& broker, const std::string& nameSpace) : fBroker(broker), fNameSpace(nameSpace) {}

    // Return the path, or the instance with its path; null with the broker's status in `status` when the broker
    // refuses.
    CMPIObjectPath* path(const Record& record, CMPIStatus& status) const;
    CMPIInstance* instance(const Record& record, CMPIStatus& status) const;

    // Returns: whether the path has every key of the record, with the same value. Key texts are compared byte for byte,
    // classes of references ignoring case.
    static bool matches(const Record& record, const CMPIObjectPath& path);

  private:
    CMPIObjectPath* reference(const Reference& reference, CMPIStatus& status) const;
    void addKey(CMPIObjectPath& path, const Property& property, CMPIStatus& status) const;
    CMPIStatus setProperty(CMPIInstance& instance, const Property& property) const;

    const CMPIBroker& fBroker;
    const std::string& fNameSpace;
};

} // namespace lnx
