// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/cmpi/objects/Frame.h"

#include <Pegasus/Common/CIMName.h>
#include <cmpi/cmpi.h>

#include <string>

// The boundary between the broker's C++ and the provider's C. Providers call the broker and its objects through tables
// of C functions. Every function in a table runs its body through perform() or answer(), which turn an exception into
// a CMPIStatus: an exception must never reach the provider's C frames.
namespace Pegasus::cmpi {

// The status with which a table function's body refuses.
struct CmpiError
{
    CMPIrc code;
    std::string text; // may be empty: the status then consists of the code
};

// The version of CMPI that the tables follow.
constexpr CMPIVersion kTableVersion = CMPIVersion200;

// Who frees an object that a provider holds.
enum class Lifetime
{
    kFrame,   // the current frame, or an earlier release
    kClone,   // the provider's release, at any time and on any thread
    kArgument // the broker, after the call; a provider's release does nothing
};

// Returns: the status of the exception being handled.
// Ownership: the message belongs to the current frame.
// Requires: called from a catch block.
CMPIStatus currentFailure() noexcept;

// Returns: a status. Its message, if any, belongs to the current frame; when memory is short, it is left out.
CMPIStatus makeStatus(CMPIrc code, const std::string& text) noexcept;

// Runs the body of a table function that returns a status only.
template <typename Body> CMPIStatus perform(Body&& body) noexcept
{
    try {
        body();
        return {CMPI_RC_OK, nullptr};
    } catch (...) {
        return currentFailure();
    }
}

// Runs the body of a table function that returns a value.
// Returns: the body's result, or `otherwise` when it threw. `rc` may be null. On success its message is cleared too,
//     since providers pass uninitialised ones.
template <typename Result, typename Body> Result answer(CMPIStatus* rc, Result otherwise, Body&& body) noexcept
{
    CMPIStatus status{CMPI_RC_OK, nullptr};
    const auto leave = [&](const Result& result) {
        if (rc != nullptr) {
            *rc = status;
        }
        return result;
    };
    try {
        return leave(body());
    } catch (...) {
        status = currentFailure();
    }
    return leave(otherwise);
}

// Returns: the broker's object to which the provider's pointer leads.
// Throws: CMPI_RC_ERR_INVALID_HANDLE for a null pointer or handle.
template <typename Object, typename Face> Object& objectOf(const Face* face)
{
    if (face == nullptr || face->hdl == nullptr) {
        throw CmpiError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    return static_cast<Object&>(const_cast<Face&>(*face));
}

// Returns: `text`.
// Throws: CMPI_RC_ERR_INVALID_PARAMETER when it is null.
const char* requireText(const char* text);
// Throws: CMPI_RC_ERR_INVALID_PARAMETER also for an illegal CIM name.
CIMName requireName(const char* text);

// The release function of every kind of object.
template <typename Object, typename Face> CMPIStatus releaseObject(Face* face) noexcept
{
    return perform([&] {
        Object& object = objectOf<Object>(face);
        if (object.lifetime != Lifetime::kArgument) {
            delete &object;
        }
    });
}

// The clone function of every kind of object: a copy outside of all frames.
template <typename Object, typename Face> Face* cloneObject(const Face* face, CMPIStatus* rc) noexcept
{
    return answer(rc, static_cast<Face*>(nullptr), [&]() -> Face* {
        // NOLINTNEXTLINE(bugprone-unhandled-exception-at-new): answer() handles it
        auto* copy = new Object(objectOf<Object>(face));
        copy->lifetime = Lifetime::kClone;
        return copy;
    });
}

// What a function that returns data returns when it fails.
constexpr CMPIData kNothing{CMPI_null, CMPI_nullValue | CMPI_notFound, {}};
// The same where there is no name that could be missing.
constexpr CMPIData kNull{CMPI_null, CMPI_nullValue, {}};

} // namespace Pegasus::cmpi
