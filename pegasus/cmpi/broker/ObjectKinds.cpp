// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/broker/ObjectKinds.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/broker/BrokerTables.h"
#include "pegasus/cmpi/objects/ArgsObject.h"
#include "pegasus/cmpi/objects/ArrayObject.h"
#include "pegasus/cmpi/objects/ContextObject.h"
#include "pegasus/cmpi/objects/DateTimeObject.h"
#include "pegasus/cmpi/objects/EnumerationObject.h"
#include "pegasus/cmpi/objects/InstanceObject.h"
#include "pegasus/cmpi/objects/ResultObject.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <array>
#include <cstdio>

namespace Pegasus::cmpi {
namespace {

// The first two words of every object. The table to which the second one points says the kind.
struct AnyObject
{
    const void* hdl;
    const void* ft;
};

struct Kind
{
    std::string_view name;
    const void* table;
};

} // namespace

std::string_view kindOf(const void* object)
{
    if (object == nullptr || static_cast<const AnyObject*>(object)->hdl == nullptr) {
        throw CmpiError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    const std::array kinds{
        Kind{"CMPIInstance", &kInstanceTable},
        Kind{"CMPIObjectPath", &kObjectPathTable},
        Kind{"CMPIArgs", &kArgsTable},
        Kind{"CMPIContext", &kContextTable},
        Kind{"CMPIResult", &kResultTable},
        Kind{"CMPIDateTime", &kDateTimeTable},
        Kind{"CMPIArray", &kArrayTable},
        Kind{"CMPIString", &kStringTable},
        Kind{"CMPIEnumeration", &kEnumerationTable},
        Kind{"CMPIBroker", &kUpcallTable},
    };
    for (const Kind& kind : kinds) {
        if (kind.table == static_cast<const AnyObject*>(object)->ft) {
            return kind.name;
        }
    }
    throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, {}};
}

std::string describe(const void* object)
{
    const std::string_view kind = kindOf(object);
    std::array<char, 32> address{};
    std::snprintf(address.data(), address.size(), "%p:", object);
    std::string text = address.data() + std::string(kind);
    if (kind == "CMPIString") {
        text += ' ' + static_cast<const StringObject*>(static_cast<const CMPIString*>(object))->text();
    } else if (kind == "CMPIObjectPath") {
        text +=
            ' ' + base::utf8(objectOf<ObjectPathObject>(static_cast<const CMPIObjectPath*>(object)).value().toString());
    } else if (kind == "CMPIInstance") {
        text += ' ' + base::utf8(objectOf<InstanceObject>(static_cast<const CMPIInstance*>(object))
                                     .completePath()
                                     .withNameSpace()
                                     .toString());
    } else if (kind == "CMPIDateTime") {
        text += ' ' + base::utf8(objectOf<DateTimeObject>(static_cast<const CMPIDateTime*>(object)).value().toString());
    }
    return text;
}

} // namespace Pegasus::cmpi
