#pragma once

#include "pegasus/cmpi/services/ClassSchema.h"

#include <Pegasus/Common/CIMPropertyList.h>

#include <string>
#include <vector>

namespace Pegasus::cmpi {

// A request's property list, asked once per property and instance.
// Thread: one thread at a time.
class PropertyFilter
{
  public:
    // Passes everything.
    PropertyFilter() = default;
    explicit PropertyFilter(const CIMPropertyList& list);

    bool passes(const CIMName& name) const;
    // The same by the property's index in `schema`. The answers for one class are kept: results come class by class.
    bool passes(const ClassSchema& schema, std::size_t index) const;

    // Returns: the names as CMPI passes them, ending in a null; null for "all".
    // Ownership: the filter's.
    const char** names() const { return fAll ? nullptr : fNames.data(); }

  private:
    bool fAll = true;
    std::vector<CIMName> fList;
    std::vector<std::string> fTexts; // fNames point into these
    mutable std::vector<const char*> fNames;
    mutable const ClassSchema* fSchema = nullptr;
    mutable std::vector<bool> fPasses; // by property of fSchema
};

} // namespace Pegasus::cmpi
