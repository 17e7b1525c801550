// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/StringObject.h"

#include "pegasus/cmpi/objects/Habits.h"

#include <utility>

namespace Pegasus::cmpi {
namespace {

const char* getCharPtr(const CMPIString* self, CMPIStatus* rc)
{
    return answer(rc, static_cast<const char*>(nullptr), [&] { return objectOf<StringObject>(self).text().c_str(); });
}

char* newCharsCP(const CMPIString*, CMPICodepageID, CMPIStatus* rc)
{
    return answer(rc, static_cast<char*>(nullptr), []() -> char* { throw CmpiError{CMPI_RC_ERR_NOT_SUPPORTED, {}}; });
}

} // namespace

const CMPIStringFT kStringTable{kTableVersion, releaseHeld<StringObject, CMPIString>,
                                cloneObject<StringObject, CMPIString>, getCharPtr, newCharsCP};

StringObject::StringObject(std::string text) : CMPIString{nullptr, &kStringTable}, fText(std::move(text))
{
    hdl = fText.data();
}

} // namespace Pegasus::cmpi
