// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Array.h>
#include <Pegasus/Common/Exception.h>

#include <atomic>
#include <cstddef>
#include <functional>
#include <new>
#include <type_traits>
#include <utility>

namespace Pegasus {

// The header of the elements, which follow it in the same piece of memory. An empty array may lack it.
struct ArrayHeader
{
    std::atomic<Uint32> fRefs{1};
    Uint32 fSize = 0;
    Uint32 fCapacity = 0;
    Uint32 fPadding = 0;
};

namespace array_detail {

template <typename T> T* elements(ArrayHeader* header) noexcept
{
    static_assert(sizeof(ArrayHeader) % alignof(T) == 0, "elements follow the header");
    return reinterpret_cast<T*>(header + 1);
}

template <typename T> ArrayHeader* allocate(std::size_t capacity)
{
    if (capacity > (PEG_NOT_FOUND - sizeof(ArrayHeader)) / sizeof(T)) {
        throw std::bad_alloc();
    }
    void* memory = ::operator new(sizeof(ArrayHeader) + capacity * sizeof(T));
    auto* header = new (memory) ArrayHeader();
    header->fCapacity = static_cast<Uint32>(capacity);
    return header;
}

template <typename T> void destroyRange(T* first, Uint32 count) noexcept
{
    if constexpr (!std::is_trivially_destructible_v<T>) {
        for (Uint32 i = 0; i < count; ++i) {
            first[i].~T();
        }
    } else {
        (void)first;
        (void)count;
    }
}

inline bool isOnlyHolder(const ArrayHeader& header) noexcept
{
    return header.fRefs.load(std::memory_order_acquire) == 1;
}

template <typename T> void release(ArrayHeader* header) noexcept
{
    if (!header || (!isOnlyHolder(*header) && header->fRefs.fetch_sub(1, std::memory_order_acq_rel) != 1)) {
        return;
    }
    destroyRange(elements<T>(header), header->fSize);
    header->~ArrayHeader();
    ::operator delete(header);
}

inline void checkIndex(Uint32 index, Uint32 size)
{
    if (index >= size) {
        throw IndexOutOfBoundsException();
    }
}

} // namespace array_detail

template <typename T> Array<T>::Array(const Array<T>& x) noexcept : fHeader(x.fHeader)
{
    if (fHeader) {
        fHeader->fRefs.fetch_add(1, std::memory_order_relaxed);
    }
}

template <typename T> Array<T>::Array(Uint32 size) : Array(size, T()) {}

template <typename T> Array<T>::Array(Uint32 size, const T& x)
{
    grow(size, x);
}

template <typename T> Array<T>::Array(const T* items, Uint32 size)
{
    insert(0, items, size);
}

template <typename T> Array<T>::~Array()
{
    array_detail::release<T>(fHeader);
}

template <typename T> Array<T>& Array<T>::operator=(const Array<T>& x) noexcept
{
    Array<T> copy(x);
    swap(copy);
    return *this;
}

template <typename T> void Array<T>::clear()
{
    Array<T> empty;
    swap(empty);
}

template <typename T> Uint32 Array<T>::size() const noexcept
{
    return fHeader ? fHeader->fSize : 0;
}

template <typename T> Uint32 Array<T>::getCapacity() const noexcept
{
    return fHeader ? fHeader->fCapacity : 0;
}

template <typename T> const T* Array<T>::getData() const noexcept
{
    return fHeader ? array_detail::elements<T>(fHeader) : nullptr;
}

// Makes the elements this array's own with room for `capacity`; moves them when they already were.
template <typename T> void Array<T>::reserveCapacity(Uint32 capacity)
{
    const bool own = fHeader && array_detail::isOnlyHolder(*fHeader);
    if (own ? fHeader->fCapacity >= capacity : (!fHeader && capacity == 0)) {
        return;
    }
    const Uint32 count = size();
    Array<T> bigger;
    bigger.fHeader = array_detail::allocate<T>(capacity < count ? count : capacity);
    T* to = array_detail::elements<T>(bigger.fHeader);
    const T* from = getData();
    for (Uint32 i = 0; i < count; ++i, ++bigger.fHeader->fSize) {
        if (own) {
            new (to + i) T(std::move(const_cast<T&>(from[i])));
        } else {
            new (to + i) T(from[i]);
        }
    }
    swap(bigger);
}

template <typename T> T* Array<T>::writable()
{
    reserveCapacity(size());
    return fHeader ? array_detail::elements<T>(fHeader) : nullptr;
}

// Opens a gap of default elements, in a copy when the array was shared. Returns: the gap.
template <typename T> T* Array<T>::makeRoom(Uint32 index, Uint32 count)
{
    const Uint32 oldSize = size();
    if (index > oldSize || count > PEG_NOT_FOUND - 1 - oldSize) {
        throw IndexOutOfBoundsException();
    }
    const Uint32 newSize = oldSize + count;
    if (getCapacity() < newSize) {
        reserveCapacity(newSize < 2 * getCapacity() ? 2 * getCapacity() : newSize);
    }
    T* items = writable();
    for (; fHeader && fHeader->fSize < newSize; ++fHeader->fSize) {
        new (items + fHeader->fSize) T();
    }
    for (Uint32 i = oldSize; i > index; --i) {
        items[i - 1 + count] = std::move(items[i - 1]);
    }
    return items + index;
}

template <typename T> void Array<T>::grow(Uint32 size, const T& x)
{
    const T copy(x); // NOLINT(performance-unnecessary-copy-initialization): x may be one of ours
    T* gap = makeRoom(this->size(), size);
    for (Uint32 i = 0; i < size; ++i) {
        gap[i] = copy;
    }
}

template <typename T> T& Array<T>::operator[](Uint32 index)
{
    array_detail::checkIndex(index, size());
    return writable()[index];
}

template <typename T> const T& Array<T>::operator[](Uint32 index) const
{
    array_detail::checkIndex(index, size());
    return getData()[index];
}

template <typename T> void Array<T>::append(const T& x)
{
    insert(size(), x);
}

template <typename T> void Array<T>::append(const T* x, Uint32 size)
{
    insert(this->size(), x, size);
}

template <typename T> void Array<T>::appendArray(const Array<T>& x)
{
    const Array<T> kept(x); // NOLINT(performance-unnecessary-copy-initialization): x may be *this
    insert(size(), kept.getData(), kept.size());
}

template <typename T> void Array<T>::prepend(const T& x)
{
    insert(0, x);
}

template <typename T> void Array<T>::prepend(const T* x, Uint32 size)
{
    insert(0, x, size);
}

template <typename T> void Array<T>::insert(Uint32 index, const T& x)
{
    T copy(x);
    *makeRoom(index, 1) = std::move(copy);
}

template <typename T> void Array<T>::insert(Uint32 index, const T* x, Uint32 size)
{
    // The caller's elements may be this array's own.
    const T* own = getData();
    if (own && !std::less<const T*>()(x, own) && std::less<const T*>()(x, own + this->size())) {
        const Array<T> copies(x, size);
        return insert(index, copies.getData(), size);
    }
    T* gap = makeRoom(index, size);
    for (Uint32 i = 0; i < size; ++i) {
        gap[i] = x[i];
    }
}

template <typename T> void Array<T>::remove(Uint32 index)
{
    remove(index, 1);
}

template <typename T> void Array<T>::remove(Uint32 index, Uint32 size)
{
    const Uint32 oldSize = this->size();
    if (size == 0) {
        return;
    }
    if (index >= oldSize || size > oldSize - index) {
        throw IndexOutOfBoundsException();
    }
    T* items = writable();
    for (Uint32 i = index; i + size < oldSize; ++i) {
        items[i] = std::move(items[i + size]);
    }
    array_detail::destroyRange(items + (oldSize - size), size);
    fHeader->fSize = oldSize - size;
}

} // namespace Pegasus
