// SPDX-License-Identifier: MIT
#include "pegasus/common/ArrayImpl.h"
#include "pegasus/common/NameAccess.h"

#include <Pegasus/Common/CIMPropertyList.h>

namespace Pegasus {

CIMPropertyList::CIMPropertyList(const Array<CIMName>& propertyNames)
{
    set(propertyNames);
}

void CIMPropertyList::set(const Array<CIMName>& propertyNames)
{
    for (Uint32 i = 0; i < propertyNames.size(); ++i) {
        notNull(propertyNames[i]);
    }
    fNames = propertyNames;
    fIsNull = false;
}

void CIMPropertyList::clear()
{
    fNames.clear();
    fIsNull = true;
}

const CIMName& CIMPropertyList::operator[](Uint32 index) const
{
    return fNames[index];
}

Boolean CIMPropertyList::contains(const CIMName& name) const
{
    for (Uint32 i = 0; i < fNames.size(); ++i) {
        if (fNames[i].equal(name)) {
            return true;
        }
    }
    return false;
}

String CIMPropertyList::toString() const
{
    if (fIsNull) {
        return "NULL";
    }
    if (fNames.size() == 0) {
        return "EMPTY";
    }
    String text = fNames[0].getString();
    for (Uint32 i = 1; i < fNames.size(); ++i) {
        text.append(", ").append(fNames[i].getString());
    }
    return text;
}

} // namespace Pegasus
