// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/TableFunction.h"

#include <string>

// What providers do that works here and fails on OpenPegasus 2.14. A vendor who develops here learns of it from the
// log; with strict providers such a call fails as it would there.
namespace Pegasus::cmpi {

class Broker;

enum class Habit
{
    kCharsInStringArray,
    kElementReleasedEarly,
    kNullElement,
    kNullDateTimeElement,
    kUntypedNull,
    kKeysOnPathOnly,
    kEmbeddedAsText,
    kEmbeddedArray,
    kTextNotUtf8,
    kRealNotNormal,
    kHalfSurrogate,
    kNoReturnDone,
    kNoAttach,
    kNestedUpcalls
};

// Logs the habit once per provider: "provider P: works here, fails on OpenPegasus 2.14: ...". The provider and its
// broker are those of the current frame; outside of a request nothing happens.
// Throws: with strict providers the status of OpenPegasus, or CMPI_RC_ERR_FAILED where it crashes or loses the answer.
void tolerate(Habit habit);
// The same of the provider `provider`; it may be unknown ("").
void tolerate(Habit habit, Broker& broker, const std::string& provider);

// The release function of objects whose handles an array of OpenPegasus keeps.
template <typename Object, typename Face> CMPIStatus releaseHeld(Face* face) noexcept
{
    const CMPIStatus status = perform([&] {
        const Object& object = objectOf<Object>(face);
        if (object.holder && *object.holder) {
            tolerate(Habit::kElementReleasedEarly);
        }
    });
    return status.rc == CMPI_RC_OK ? releaseObject<Object, Face>(face) : status;
}

// What every such line in the log contains.
extern const char* const kHabitMark;

} // namespace Pegasus::cmpi
