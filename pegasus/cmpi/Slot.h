#pragma once

#include "pegasus/cmpi/Frame.h"
#include "pegasus/cmpi/include/cmpi/cmpi.h"

#include <string>

// The boundary between the broker's C++ and the provider's C: every function that stands in a table runs its body
// through perform() or answer(), so that nothing is ever thrown into a provider.
namespace Pegasus::cmpi {

// How a slot's body refuses.
struct SlotError
{
    CMPIrc code;
    std::string text; // may be empty: the status then carries no message
};

// What every object of ours says of its table's age.
constexpr CMPIVersion kTableVersion = CMPIVersion200;

// Who ends an object that a provider holds.
enum class Lifetime
{
    kFrame,   // the current frame, or an earlier release
    kClone,   // the provider's release, at any time and on any thread
    kArgument // the broker, after the call; a provider's release does nothing
};

// The status of the exception being handled. The message belongs to the current frame.
// Requires: called from a catch block.
CMPIStatus currentFailure() noexcept;

CMPIStatus makeStatus(CMPIrc code, const std::string& text) noexcept;

template <class Body> CMPIStatus perform(Body&& body) noexcept
{
    try {
        body();
        return {CMPI_RC_OK, nullptr};
    } catch (...) {
        return currentFailure();
    }
}

// Returns the body's result, or `otherwise` when it threw. `rc` may be null; on success its message is cleared too,
// since providers pass uninitialised ones.
template <class Result, class Body> Result answer(CMPIStatus* rc, Result otherwise, Body&& body) noexcept
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

// Returns: the broker's object behind what the provider holds.
// Throws: CMPI_RC_ERR_INVALID_HANDLE for a null pointer or handle.
template <class Object, class Face> Object& objectOf(const Face* face)
{
    if (face == nullptr || face->hdl == nullptr) {
        throw SlotError{CMPI_RC_ERR_INVALID_HANDLE, {}};
    }
    return static_cast<Object&>(const_cast<Face&>(*face));
}

// Throws: CMPI_RC_ERR_INVALID_PARAMETER when it is null.
const char* requireText(const char* text);

// The release slot of every kind of object.
template <class Object, class Face> CMPIStatus releaseObject(Face* face) noexcept
{
    return perform([&] {
        Object& object = objectOf<Object>(face);
        if (object.lifetime != Lifetime::kArgument) {
            delete &object;
        }
    });
}

// The clone slot: a copy that no frame holds.
template <class Object, class Face> Face* cloneObject(const Face* face, CMPIStatus* rc) noexcept
{
    return answer(rc, static_cast<Face*>(nullptr), [&]() -> Face* {
        // NOLINTNEXTLINE(bugprone-unhandled-exception-at-new): answer() handles it
        auto* copy = new Object(objectOf<Object>(face));
        copy->lifetime = Lifetime::kClone;
        return copy;
    });
}

// What a data-returning slot answers when it has nothing.
constexpr CMPIData kNothing{CMPI_null, CMPI_nullValue | CMPI_notFound, {}};

} // namespace Pegasus::cmpi
