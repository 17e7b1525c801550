#pragma once

#include "providers/linux/Record.h"

#include <cmpi/cmpi.h>

#include <string>

namespace lnx {

// Records in the broker's terms. Objects made here belong to the running call, and are released early where many are
// made.
class CmpiRecord
{
  public:
    // Requires: `nameSpace` outlives the object.
    CmpiRecord(const CMPIBroker& broker, const std::string& nameSpace) : fBroker(broker), fNameSpace(nameSpace) {}

    // Returns: the path, or null with the broker's status in `status`.
    CMPIObjectPath* path(const Record& record, CMPIStatus& status) const;
    CMPIInstance* instance(const Record& record, CMPIStatus& status) const;

    // True when the path's keys are those of the record; keys that the path lacks do not match.
    static bool matches(const Record& record, const CMPIObjectPath& path);

  private:
    CMPIObjectPath* reference(const Reference& reference, CMPIStatus& status) const;
    void addKey(CMPIObjectPath& path, const Property& property, CMPIStatus& status) const;
    CMPIStatus setProperty(CMPIInstance& instance, const Property& property) const;

    const CMPIBroker& fBroker;
    const std::string& fNameSpace;
};

} // namespace lnx
