// SPDX-License-Identifier: MIT
#include "providers/linux/Record.h"

namespace lnx {

const Value* Record::find(const std::string& name) const
{
    for (const Property& property : fProperties) {
        if (property.name == name) {
            return &property.value;
        }
    }
    return nullptr;
}

Reference Record::reference() const
{
    Reference result{fClassName, {}};
    for (const Property& property : fProperties) {
        if (property.isKey) {
            result.keys.emplace_back(property.name, std::get<std::string>(property.value));
        }
    }
    return result;
}

} // namespace lnx
