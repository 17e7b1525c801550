// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/services/ClassSchema.h"

#include <Pegasus/Common/CIMPropertyList.h>

#include <string>
#include <vector>

namespace Pegasus::cmpi {

// A request's property list, asked once per instance.
// Thread: one thread at a time.
class PropertyFilter
{
  public:
    // Passes everything.
    PropertyFilter() = default;
    explicit PropertyFilter(const CIMPropertyList& list);

    bool passesAll() const { return fAll; }
    // Returns: the indices of the properties that pass: all in the class's order, or the listed ones in the list's
    // order. The answer for one class is kept: results come class by class.
    const std::vector<std::size_t>& passing(const ClassSchema& schema) const;

    // Returns: the names as CMPI passes them, ending in a null; null for "all".
    // Ownership: the filter's.
    const char** names() const { return fAll ? nullptr : fNames.data(); }

  private:
    bool fAll = true;
    std::vector<std::string> fTexts; // fNames point into these
    mutable std::vector<const char*> fNames;
    mutable const ClassSchema* fSchema = nullptr;
    mutable std::vector<std::size_t> fPassing; // of fSchema
};

} // namespace Pegasus::cmpi
