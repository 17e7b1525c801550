// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

PEGASUS_NAMESPACE_BEGIN

// The one pointer inside every handle class: counted, to a representation that only the library knows.
// Null is a state of its own (an uninitialised object, an empty string, a default value).
// Thread: the count is atomic, so distinct handles may be used in distinct threads.
template <typename Rep> class PEGASUS_COMMON_LINKAGE RepPointer
{
  public:
    RepPointer() noexcept = default;
    // Takes over one count of `adopted`.
    explicit RepPointer(Rep* adopted) noexcept : fRep(adopted) {}
    RepPointer(const RepPointer& other) noexcept : fRep(other.fRep) { retainIfAny(); }
    RepPointer(RepPointer&& other) noexcept : fRep(other.fRep) { other.fRep = nullptr; }
    ~RepPointer() { releaseIfAny(); }

    RepPointer& operator=(const RepPointer& other) noexcept
    {
        RepPointer copy(other);
        swap(copy);
        return *this;
    }
    RepPointer& operator=(RepPointer&& other) noexcept
    {
        RepPointer taken(static_cast<RepPointer&&>(other));
        swap(taken);
        return *this;
    }

    void swap(RepPointer& other) noexcept
    {
        Rep* mine = fRep;
        fRep = other.fRep;
        other.fRep = mine;
    }
    Rep* get() const noexcept { return fRep; }
    Rep* operator->() const noexcept { return fRep; }
    Rep& operator*() const noexcept { return *fRep; }
    explicit operator bool() const noexcept { return fRep != nullptr; }

    // Throws: UninitializedObjectException when null.
    Rep& checked() const;

  private:
    void retainIfAny() noexcept
    {
        if (fRep) {
            retain(fRep);
        }
    }
    void releaseIfAny() noexcept
    {
        if (fRep) {
            release(fRep);
        }
    }
    static void retain(Rep* rep) noexcept;
    static void release(Rep* rep) noexcept;

    Rep* fRep = nullptr;
};

PEGASUS_NAMESPACE_END
