// SPDX-License-Identifier: MIT
#pragma once

#include "src/common/Names.h"

#include <boost/shared_ptr.hpp>

#include <map>
#include <string>

namespace NKOLVRX20 {

// Named elements of one owner, found by name, case ignored, and visited in byte order of their normalised names.
// Every operation that takes a name throws TVRXException 25 for an invalid CIM name.
template <typename TElement> class TNamedMap
{
  public:
    using TPointer = boost::shared_ptr<TElement>;

    // Returns: null when the name is absent.
    TPointer Find(const std::string& name) const { return FindAs(NormalizedName(name)); }
    // Requires: a normalised name.
    TPointer FindAs(const std::string& key) const
    {
        const auto entry = fElements.find(key);
        return entry == fElements.end() ? nullptr : entry->second;
    }

    // The element takes the place of one of the same name.
    void Put(const std::string& name, const TPointer& element) { PutAs(NormalizedName(name), element); }
    // Requires: a normalised name.
    void PutAs(const std::string& key, const TPointer& element) { fElements[key] = element; }

    // Calls the visitor with each element until it returns false. The walk is on a copy: the visitor may change or
    // destroy this map.
    template <typename TVisitor> void Visit(const TVisitor& visitor) const
    {
        const auto elements = fElements;
        for (const auto& entry : elements) {
            if (!visitor(entry.second)) {
                return;
            }
        }
    }

  private:
    std::map<std::string, TPointer> fElements; // by normalised name
};

} // namespace NKOLVRX20
