// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/DateTimeObject.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/Habits.h"
#include "pegasus/cmpi/objects/StringObject.h"

#include <Pegasus/Common/Exception.h>

namespace Pegasus::cmpi {
namespace {

// Returns: 1970 in microseconds since the beginning of year 0, from which CIM counts; CMPI counts from 1970.
Uint64 unixEpoch()
{
    static const Uint64 kEpoch = CIMDateTime(String("19700101000000.000000+000")).toMicroSeconds();
    return kEpoch;
}

CMPIUint64 getBinaryFormat(const CMPIDateTime* self, CMPIStatus* rc)
{
    return answer(rc, CMPIUint64{0}, [&]() -> CMPIUint64 {
        const CIMDateTime& value = objectOf<DateTimeObject>(self).value();
        return value.isInterval() ? value.toMicroSeconds() : value.toMicroSeconds() - unixEpoch();
    });
}

CMPIString* getStringFormat(const CMPIDateTime* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<CMPIString*>(nullptr), [&]() -> CMPIString* {
        return Frame::current().make<StringObject>(base::utf8(objectOf<DateTimeObject>(self).value().toString()));
    });
}

CMPIBoolean isInterval(const CMPIDateTime* self, CMPIStatus* rc)
{
    return answer(rc, CMPIBoolean{0},
                  [&]() -> CMPIBoolean { return objectOf<DateTimeObject>(self).value().isInterval(); });
}

} // namespace

const CMPIDateTimeFT kDateTimeTable{kTableVersion,
                                    releaseHeld<DateTimeObject, CMPIDateTime>,
                                    cloneObject<DateTimeObject, CMPIDateTime>,
                                    getBinaryFormat,
                                    getStringFormat,
                                    isInterval};

DateTimeObject::DateTimeObject(const CIMDateTime& value) : CMPIDateTime{nullptr, &kDateTimeTable}, fValue(value)
{
    hdl = this;
}

CIMDateTime dateTimeFromBinary(CMPIUint64 microseconds, bool isInterval)
{
    try {
        return {isInterval ? microseconds : microseconds + unixEpoch(), isInterval};
    } catch (const Exception& error) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, base::utf8(error.getMessage())};
    }
}

CIMDateTime dateTimeFromText(const char* text)
{
    try {
        return {base::fromUtf8Repaired(requireText(text))};
    } catch (const Exception& error) {
        throw CmpiError{CMPI_RC_ERR_INVALID_PARAMETER, base::utf8(error.getMessage())};
    }
}

} // namespace Pegasus::cmpi
