// SPDX-License-Identifier: MIT
// Providers in C++ that work in their factory. "Exact" makes a hundred rounds of broker calls and throws at the first
// unexpected answer; "Throwing" always throws; "Late" throws at its first request.
#include <cmpi/cmpi.h>

#include <stdexcept>
#include <string>

namespace {

void expect(bool holds, const char* what)
{
    if (!holds) {
        throw std::runtime_error(what);
    }
}

void oneRound(const CMPIBroker* mb, int round)
{
    const CMPIBrokerEncFT* const eft = mb->eft;
    CMPIStatus rc = {CMPI_RC_ERROR, nullptr};
    CMPIString* text = eft->newString(mb, "text", &rc);
    expect(text != nullptr && rc.rc == CMPI_RC_OK, "newString");
    CMPIArray* array = eft->newArray(mb, 1, CMPI_string, &rc);
    CMPIValue value = {};
    value.string = text;
    expect(array->ft->setElementAt(array, 0, &value, CMPI_string).rc == CMPI_RC_OK, "setElementAt");
    expect(array->ft->setElementAt(array, 1, &value, CMPI_string).rc == CMPI_RC_ERR_NO_SUCH_PROPERTY, "index");
    expect(array->ft->setElementAt(array, 0, &value, CMPI_uint8).rc == CMPI_RC_ERR_TYPE_MISMATCH, "element type");
    CMPIObjectPath* path = eft->newObjectPath(mb, "root/cimv2", "TST_Item", &rc);
    const std::string id = std::to_string(round);
    expect(path->ft->addKey(path, "Id", reinterpret_cast<const CMPIValue*>(id.c_str()), CMPI_chars).rc == CMPI_RC_OK,
           "addKey");
    expect(eft->classPathIsA(mb, path, "TST_Item", &rc) == 1, "classPathIsA");
    CMPIInstance* instance = eft->newInstance(mb, path, &rc);
    const CMPIData key = instance->ft->getProperty(instance, "id", &rc);
    expect(rc.rc == CMPI_RC_OK && id == static_cast<const char*>(key.value.string->hdl), "getProperty");
    for (const CMPIStatus status :
         {instance->ft->release(instance), path->ft->release(path), array->ft->release(array)})
    {
        expect(status.rc == CMPI_RC_OK, "release");
    }
}

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean)
{
    return {CMPI_RC_OK, nullptr};
}

CMPIStatus enumerateNothing(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath*,
                            const char**)
{
    return result->ft->returnDone(result);
}

CMPIStatus enumerateAndThrow(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                             const char**)
{
    throw 7;
}

constexpr CMPIInstanceMIFT tableWith(decltype(CMPIInstanceMIFT::enumerateInstances) enumerate)
{
    return {CMPIVersion100, CMPIVersion100, "instance", cleanup, nullptr, enumerate,
            nullptr,        nullptr,        nullptr,    nullptr, nullptr, nullptr};
}

const CMPIInstanceMIFT kExactTable = tableWith(enumerateNothing);
const CMPIInstanceMIFT kLateTable = tableWith(enumerateAndThrow);
CMPIInstanceMI gExact = {nullptr, &kExactTable};
CMPIInstanceMI gLate = {nullptr, &kLateTable};

} // namespace

extern "C" {

CMPIInstanceMI* Exact_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)
{
    for (int round = 0; round < 100; ++round) {
        oneRound(broker, round);
    }
    return &gExact;
}

CMPIInstanceMI* Throwing_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*)
{
    throw std::runtime_error("no device: the factory throws");
}

CMPIInstanceMI* Late_Create_InstanceMI(const CMPIBroker*, const CMPIContext*, CMPIStatus*)
{
    return &gLate;
}
}
