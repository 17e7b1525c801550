// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Config.h>

PEGASUS_NAMESPACE_BEGIN

struct ArrayHeader;

// A growing array; copies share until one is changed. The library holds the code for its own element types
// (the basic types, Char16, String and the CIM classes); other element types fail to link.
// Throws: IndexOutOfBoundsException for every index or range outside the array.
template <typename T> class PEGASUS_COMMON_LINKAGE Array
{
  public:
    Array() noexcept = default;
    Array(const Array<T>& x) noexcept;
    Array(Array<T>&& x) noexcept : fHeader(x.fHeader) { x.fHeader = nullptr; }
    Array(Uint32 size);
    Array(Uint32 size, const T& x);
    Array(const T* items, Uint32 size);
    ~Array();
    Array<T>& operator=(const Array<T>& x) noexcept; // NOLINT(bugprone-unhandled-self-assignment): copies, then swaps
    Array<T>& operator=(Array<T>&& x) noexcept
    {
        swap(x);
        return *this;
    }

    void clear();
    void reserveCapacity(Uint32 capacity);
    // Appends `size` copies of x.
    void grow(Uint32 size, const T& x);
    void swap(Array<T>& x) noexcept
    {
        ArrayHeader* mine = fHeader;
        fHeader = x.fHeader;
        x.fHeader = mine;
    }

    Uint32 size() const noexcept;
    Uint32 getCapacity() const noexcept;
    const T* getData() const noexcept;
    // Unshares the elements first. Through a reference that is kept while the array is copied, the copy changes too.
    T& operator[](Uint32 index);
    const T& operator[](Uint32 index) const;

    void append(const T& x);
    void append(const T* x, Uint32 size);
    void appendArray(const Array<T>& x);
    void prepend(const T& x);
    void prepend(const T* x, Uint32 size);
    void insert(Uint32 index, const T& x);
    void insert(Uint32 index, const T* x, Uint32 size);
    void remove(Uint32 index);
    void remove(Uint32 index, Uint32 size);

  private:
    T* makeRoom(Uint32 index, Uint32 count);
    T* writable();

    ArrayHeader* fHeader = nullptr;
};

PEGASUS_NAMESPACE_END
