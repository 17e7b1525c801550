// SPDX-License-Identifier: MIT
#pragma once

#include "fuzz/cmpi_broker/CallInput.h"
#include "fuzz/cmpi_broker/Require.h"

#include <cmpi/cmpi.h>

#include <cstddef>
#include <vector>

namespace fuzz {

// What a broker passes to a provider's function.
struct CallObjects
{
    const CMPIBroker* broker;
    const CMPIContext* context;
    const CMPIObjectPath* path;
    const CMPIArgs* given;
    CMPIArgs* out;
    const CMPIResult* result;
};

// A value as a function takes it: the bytes of its type alone.
struct Passed
{
    const CMPIValue* value = nullptr;
    CMPIType type = CMPI_null;
    std::vector<char> bytes;
};

// The objects that a provider has, and the arguments that an input chooses from them. Each function reads its choices
// from the input.
class CallState
{
  protected:
    CallState(CallInput& in, const CallObjects& call);

    // Returns: a status that the callee has to overwrite; or null. The next status replaces it.
    CMPIStatus* status();
    // Checks the status that a call left and keeps its message.
    void answered(const CMPIStatus* rc);
    // Checks that a factory gave an object or an error. Returns: the object.
    template <typename Object> Object* made(Object* object, const CMPIStatus* rc)
    {
        require(rc == nullptr || (object != nullptr) == (rc->rc == CMPI_RC_OK));
        answered(rc);
        return object;
    }

    // Reads data and keeps its object.
    void keep(const CMPIData& data);
    void keep(CMPIString* string);

    // Returns: any type with a value of that type; or no value.
    Passed value();
    // Returns: a list of names that ends with null; or null. The next list replaces it.
    const char** list();
    const CMPIObjectPath* path();
    const CMPIArgs* args();

    CallInput& fIn;
    const CMPIBroker* fMb;
    const CMPIContext* fContext;
    const CMPIObjectPath* fPath;
    const CMPIArgs* fGiven;
    CMPIArgs* fOut;
    const CMPIResult* fResult;
    Places<CMPIString> fStrings;
    Places<CMPIObjectPath> fPaths;
    Places<CMPIInstance> fInstances;
    Places<CMPIArray> fArrays;
    Places<CMPIDateTime> fDates;
    Places<CMPIArgs> fArgs;
    Places<CMPIError> fErrors;
    Places<CMPIEnumeration> fEnumerations;
    std::size_t fLength = 0; // of what was read

  private:
    CMPIStatus fStatus{};
    std::vector<const char*> fList;
};

} // namespace fuzz
