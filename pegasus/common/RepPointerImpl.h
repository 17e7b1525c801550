// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Exception.h>
#include <Pegasus/Common/RepPointer.h>

#include <atomic>

namespace Pegasus {

// Base of every representation: the count of handles, 1 for the maker's.
struct RefCounted
{
    RefCounted() = default;
    // A copy is a new representation with a count of its own.
    RefCounted(const RefCounted&) noexcept {}
    RefCounted& operator=(const RefCounted&) = delete;

    bool isShared() const noexcept { return fRefs.load(std::memory_order_acquire) != 1; }

    std::atomic<Uint32> fRefs{1};
};

template <typename Rep> void RepPointer<Rep>::retain(Rep* rep) noexcept
{
    rep->fRefs.fetch_add(1, std::memory_order_relaxed);
}

template <typename Rep> void RepPointer<Rep>::release(Rep* rep) noexcept
{
    // The last holder skips the atomic write: only a holder can add a count.
    if (rep->fRefs.load(std::memory_order_acquire) == 1 || rep->fRefs.fetch_sub(1, std::memory_order_acq_rel) == 1) {
        delete rep;
    }
}

template <typename Rep> Rep& RepPointer<Rep>::checked() const
{
    if (!fRep) {
        throw UninitializedObjectException();
    }
    return *fRep;
}

// A representation that may be changed: its own copy when it is shared, a new one for a null pointer.
template <typename Rep> Rep& writable(RepPointer<Rep>& pointer)
{
    if (!pointer) {
        pointer = RepPointer<Rep>(new Rep());
    } else if (pointer->isShared()) {
        pointer = RepPointer<Rep>(new Rep(*pointer));
    }
    return *pointer;
}

} // namespace Pegasus
