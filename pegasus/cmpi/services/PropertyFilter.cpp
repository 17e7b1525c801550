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
        fList.push_back(list[i]);
        fTexts.push_back(base::utf8(list[i]));
    }
    for (const std::string& text : fTexts) {
        fNames.push_back(text.c_str());
    }
    fNames.push_back(nullptr);
}

bool PropertyFilter::passes(const CIMName& name) const
{
    return fAll || std::any_of(fList.begin(), fList.end(), [&](const CIMName& listed) { return listed.equal(name); });
}

bool PropertyFilter::passes(const ClassSchema& schema, std::size_t index) const
{
    if (fAll) {
        return true;
    }
    if (fSchema != &schema) {
        fPasses.clear();
        for (const PropertySchema& property : schema.properties()) {
            fPasses.push_back(passes(property.name));
        }
        fSchema = &schema;
    }
    return fPasses[index];
}

} // namespace Pegasus::cmpi
