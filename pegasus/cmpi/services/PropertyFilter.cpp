// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/services/PropertyFilter.h"

#include "pegasus/base/Text.h"

#include <algorithm>

namespace Pegasus::cmpi {

PropertyFilter::PropertyFilter(const CIMPropertyList& list) : fAll(list.isNull())
{
    if (fAll) {
        return;
    }
    for (Uint32 i = 0; i < list.size(); ++i) {
        fTexts.push_back(base::utf8(list[i]));
    }
    for (const std::string& text : fTexts) {
        fNames.push_back(text.c_str());
    }
    fNames.push_back(nullptr);
}

const std::vector<std::size_t>& PropertyFilter::passing(const ClassSchema& schema) const
{
    if (fSchema == &schema) {
        return fPassing;
    }
    fSchema = &schema;
    fPassing.clear();
    for (std::size_t i = 0; fAll && i < schema.properties().size(); ++i) {
        fPassing.push_back(i);
    }
    for (const std::string& text : fTexts) {
        const std::size_t at = schema.find(text);
        if (at != ClassSchema::kNotFound && std::find(fPassing.begin(), fPassing.end(), at) == fPassing.end()) {
            fPassing.push_back(at);
        }
    }
    return fPassing;
}

} // namespace Pegasus::cmpi
