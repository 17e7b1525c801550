#pragma once

#include "pegasus/cmpi/ClassSchema.h"

#include <Pegasus/Common/CIMPropertyList.h>

#include <string>
#include <vector>

namespace Pegasus::cmpi {

// A request's property list, asked once per property and instance.
// Thread: one.
class PropertyFilter
{
  public:
    // Everything passes.
    PropertyFilter() = default;
    explicit PropertyFilter(const CIMPropertyList& list);

    bool passes(const CIMName& name) const;
    // The same by index: the answers of one class are kept.
    bool passes(const ClassSchema& schema, std::size_t index) const;

    // Returns: the names as providers get them, ending in a null; null for "all". Lives as long as the filter.
    const char** names() const { return fAll ? nullptr : fNames.data(); }

  private:
    bool fAll = true;
    std::vector<CIMName> fList;
    std::vector<std::string> fTexts;
    mutable std::vector<const char*> fNames;
    mutable const ClassSchema* fSchema = nullptr;
    mutable std::vector<bool> fPasses; // by property of fSchema
};

} // namespace Pegasus::cmpi
