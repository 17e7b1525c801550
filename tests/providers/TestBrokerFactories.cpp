// SPDX-License-Identifier: MIT
// The functions of the broker itself: its factories; the rest ends the test.
#include "tests/providers/TestBrokerObjects.h"

#include <memory>
#include <string>
#include <utility>

namespace lnx {

namespace {

TestBroker& brokerOf(const CMPIBroker* face)
{
    return *static_cast<TestBroker*>(const_cast<void*>(face->hdl));
}

// Makes an object; null when the function is to fail.
template <typename Object, typename... Args>
Object* made(const CMPIBroker* face, const char* name, CMPIStatus* rc, Args&&... args)
{
    TestBroker& owner = brokerOf(face);
    const bool fails = owner.fails(name);
    leave(rc, fails ? CMPI_RC_ERR_FAILED : CMPI_RC_OK);
    return fails ? nullptr : owner.make(std::make_unique<Object>(std::forward<Args>(args)...), true);
}

} // namespace

const CMPIBrokerFT kUpcalls = [] {
    auto table = emptyTable<CMPIBrokerFT>();
    table.brokerVersion = CMPIVersion200;
    table.brokerName = "test";
    return table;
}();

const CMPIBrokerEncFT kFactories = [] {
    auto table = emptyTable<CMPIBrokerEncFT>();
    table.newString = [](const CMPIBroker* face, const char* text, CMPIStatus* rc) -> CMPIString* {
        return made<StringObject>(face, "newString", rc, text);
    };
    table.newObjectPath = [](const CMPIBroker* face, const char* nameSpace, const char* className,
                             CMPIStatus* rc) -> CMPIObjectPath* {
        return made<PathObject>(face, "newObjectPath", rc, PathContent{nameSpace, className, {}});
    };
    table.newInstance = [](const CMPIBroker* face, const CMPIObjectPath* path, CMPIStatus* rc) -> CMPIInstance* {
        return made<InstanceObject>(face, "newInstance", rc, of<PathObject>(path).content);
    };
    table.newArray = [](const CMPIBroker* face, CMPICount size, CMPIType type, CMPIStatus* rc) -> CMPIArray* {
        return made<ArrayObject>(face, "newArray", rc, size, type);
    };
    table.newDateTimeFromBinary = [](const CMPIBroker* face, CMPIUint64 time, CMPIBoolean,
                                     CMPIStatus* rc) -> CMPIDateTime* {
        return made<DateTimeObject>(face, "newDateTimeFromBinary", rc, std::to_string(time));
    };
    return table;
}();

const CMPIBrokerExtFT kThreads = emptyTable<CMPIBrokerExtFT>();

} // namespace lnx
