// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/NamedValues.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <algorithm>

namespace Pegasus::cmpi {

void NamedValues::set(const char* name, const CMPIValue* value, CMPIType type)
{
    const CIMName parsed = requireName(name);
    const CIMValue decoded = decodeValue(value, type);
    const auto isSame = [&](const NamedValue& held) { return held.name.equal(parsed); };
    fValues.erase(std::remove_if(fValues.begin(), fValues.end(), isSame), fValues.end());
    append(parsed, decoded);
}

const CIMValue* NamedValues::find(std::string_view name) const
{
    for (const NamedValue& held : fValues) {
        if (base::equalNoCase(base::utf8(held.name), name)) {
            return &held.value;
        }
    }
    return nullptr;
}

CMPIData NamedValues::get(Broker& broker, const char* name) const
{
    const CIMValue* found = find(requireText(name));
    if (found == nullptr) {
        throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
    }
    return encodeValue(broker, *found);
}

CMPIData NamedValues::getAt(Broker& broker, CMPICount index, CMPIString** name) const
{
    if (index >= fValues.size()) {
        throw CmpiError{CMPI_RC_ERR_NO_SUCH_PROPERTY, {}};
    }
    if (name != nullptr) {
        *name = makeName(fValues[index].name);
    }
    return encodeValue(broker, fValues[index].value);
}

CMPIString* makeName(const CIMName& name)
{
    return Frame::current().make<StringObject>(base::utf8(name));
}

} // namespace Pegasus::cmpi
