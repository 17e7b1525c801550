// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/Habits.h"

#include "pegasus/cmpi/objects/Broker.h"
#include "pegasus/cmpi/objects/TableFunction.h"

namespace Pegasus::cmpi {
namespace {

struct HabitRow
{
    CMPIrc code; // of OpenPegasus
    const char* text;
};

// By Habit. Each text says what happens there, then the right way.
constexpr HabitRow kRows[] = {
    {CMPI_RC_ERR_TYPE_MISMATCH,
     "a CMPI_chars element in an array of CMPI_string is refused (status 13) and stays null; "
     "make the array with CMPI_chars"},
    {CMPI_RC_ERR_FAILED, "an array keeps the string or datetime that setElementAt was given; releasing it before the "
                         "array was used crashes the agent; release it after the array"},
    {CMPI_RC_ERR_INVALID_PARAMETER, "setElementAt without a value is refused (status 4); elements are null from the "
                                    "start"},
    {CMPI_RC_ERR_FAILED, "a null datetime in an array is sent as an invalid datetime and the client loses the class; "
                         "leave such elements out"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "a null value of type CMPI_null is refused (status 61); pass the declared type "
                                    "with a null value"},
    {CMPI_RC_ERR_FAILED, "keys that are set on the path alone leave the key properties null; set the properties too"},
    {CMPI_RC_ERR_INVALID_DATA_TYPE, "text for an embedded instance or object is refused (status 61) and the property "
                                    "stays null; pass a CMPIInstance"},
    {CMPI_RC_ERR_FAILED, "an array of embedded instances or objects in a property crashes the agent; give each "
                         "instance a property of its own"},
    {CMPI_RC_ERR_FAILED, "text that is not UTF-8 is sent as it is and the client loses the class; convert it"},
    {CMPI_RC_ERR_FAILED, "a real that is not a number, infinite or denormal is sent in a form that the client refuses, "
                         "and the class is lost; pass normal numbers"},
    {CMPI_RC_ERR_FAILED,
     "half of a surrogate pair in a char16 is sent as invalid UTF-8 and the client loses the class; "
     "pass characters up to U+FFFF that are not surrogates"},
    {CMPI_RC_ERR_FAILED, "a method that ends without returnDone is answered without an HTTP head; call it always"},
    {CMPI_RC_ERR_INVALID_HANDLE, "an upcall of a thread without attachThread crashes the agent; attach the thread"},
    {CMPI_RC_ERR_FAILED, "upcalls into the own module, nested three deep, hang; keep them at two"},
};

} // namespace

const char* const kHabitMark = "works here, fails on OpenPegasus 2.14: ";

void tolerate(Habit habit, Broker& broker, const std::string& provider)
{
    const HabitRow& row = kRows[static_cast<std::size_t>(habit)];
    const std::string who = provider.empty() ? std::string() : "provider " + provider + ": ";
    broker.warnOnce(who + kHabitMark + row.text);
    if (broker.services().strictProviders()) {
        throw CmpiError{row.code, row.text};
    }
}

void tolerate(Habit habit)
{
    const CallOrigin& origin = Frame::current().origin();
    if (origin.broker != nullptr) {
        tolerate(habit, *origin.broker, origin.provider);
    }
}

} // namespace Pegasus::cmpi
