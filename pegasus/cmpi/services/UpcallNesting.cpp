// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/services/UpcallNesting.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <algorithm>
#include <vector>

namespace Pegasus::cmpi {

UpcallNesting::Place UpcallNesting::begin(const CIMNamespaceName& nameSpace, const CIMName& className, unsigned depth)
{
    Pending pending{base::utf8(nameSpace.getString()), base::utf8(className), depth + 1};
    const std::lock_guard lock(fMutex);
    return fPending.insert(fPending.end(), std::move(pending));
}

void UpcallNesting::end(Place place)
{
    const std::lock_guard lock(fMutex);
    fPending.erase(place);
}

unsigned UpcallNesting::depthOf(SchemaCache& classes, const CIMNamespaceName& nameSpace, const CIMName& className) const
{
    std::string space;
    std::vector<Pending> pending;
    {
        const std::lock_guard lock(fMutex); // ends before the server is asked for classes
        if (fPending.empty()) {
            return 0;
        }
        space = base::utf8(nameSpace.getString());
        std::copy_if(fPending.begin(), fPending.end(), std::back_inserter(pending),
                     [&](const Pending& at) { return base::equalNoCase(at.nameSpace, space); });
    }
    unsigned depth = 0;
    std::string name = base::utf8(className);
    while (!pending.empty() && !name.empty()) {
        for (const Pending& at : pending) {
            depth = base::equalNoCase(at.className, name) ? std::max(depth, at.depth) : depth;
        }
        const ClassSchema* schema = classes.find(space, name);
        name = schema != nullptr && !schema->superClass().isNull() ? base::utf8(schema->superClass()) : std::string();
    }
    return depth;
}

} // namespace Pegasus::cmpi
