// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/ArrayImpl.h"
#include "pegasus/common/RepPointerImpl.h"

#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMValue.h>

#include <new>
#include <utility>

namespace Pegasus {

// The CIM type of elements of the C++ type T.
template <typename T> struct CIMTypeOf;
#define PEGASUS_CIM_TYPE_OF(T, NUMBER)                                                                                 \
    template <> struct CIMTypeOf<T>                                                                                    \
    {                                                                                                                  \
        static constexpr CIMType kType = NUMBER;                                                                       \
    }
PEGASUS_CIM_TYPE_OF(Boolean, CIMTYPE_BOOLEAN);
PEGASUS_CIM_TYPE_OF(Uint8, CIMTYPE_UINT8);
PEGASUS_CIM_TYPE_OF(Sint8, CIMTYPE_SINT8);
PEGASUS_CIM_TYPE_OF(Uint16, CIMTYPE_UINT16);
PEGASUS_CIM_TYPE_OF(Sint16, CIMTYPE_SINT16);
PEGASUS_CIM_TYPE_OF(Uint32, CIMTYPE_UINT32);
PEGASUS_CIM_TYPE_OF(Sint32, CIMTYPE_SINT32);
PEGASUS_CIM_TYPE_OF(Uint64, CIMTYPE_UINT64);
PEGASUS_CIM_TYPE_OF(Sint64, CIMTYPE_SINT64);
PEGASUS_CIM_TYPE_OF(Real32, CIMTYPE_REAL32);
PEGASUS_CIM_TYPE_OF(Real64, CIMTYPE_REAL64);
PEGASUS_CIM_TYPE_OF(Char16, CIMTYPE_CHAR16);
PEGASUS_CIM_TYPE_OF(String, CIMTYPE_STRING);
PEGASUS_CIM_TYPE_OF(CIMDateTime, CIMTYPE_DATETIME);
PEGASUS_CIM_TYPE_OF(CIMObjectPath, CIMTYPE_REFERENCE);
PEGASUS_CIM_TYPE_OF(CIMObject, CIMTYPE_OBJECT);
PEGASUS_CIM_TYPE_OF(CIMInstance, CIMTYPE_INSTANCE);
#undef PEGASUS_CIM_TYPE_OF

// What a non-null value holds: one T, or one Array<T>, in place where it is no bigger than a pointer.
struct CIMValueRep : RefCounted
{
    Uint8 fType = CIMTYPE_BOOLEAN;
    bool fIsArray = false;
    bool fIsNull = true;
    Uint32 fNullArraySize = 0; // the size given with a null array
    alignas(8) unsigned char fStorage[8] = {};

    CIMValueRep() = default;
    CIMValueRep(const CIMValueRep&) = delete;
    ~CIMValueRep();

    template <typename Held> static constexpr bool kInPlace = sizeof(Held) <= sizeof(fStorage);

    template <typename Held> Held& held() noexcept
    {
        if constexpr (kInPlace<Held>) {
            return *std::launder(reinterpret_cast<Held*>(fStorage));
        } else {
            return **std::launder(reinterpret_cast<Held**>(fStorage));
        }
    }
    template <typename Held> const Held& held() const noexcept { return const_cast<CIMValueRep*>(this)->held<Held>(); }

    template <typename Held> void hold(Held value)
    {
        if constexpr (kInPlace<Held>) {
            new (fStorage) Held(std::move(value));
        } else {
            new (fStorage) Held*(new Held(std::move(value)));
        }
        fIsNull = false;
    }
    template <typename Held> void drop() noexcept
    {
        if constexpr (kInPlace<Held>) {
            held<Held>().~Held();
        } else {
            delete &held<Held>();
        }
    }
};

// Calls `visitor` with a tag of the element type that `type` stands for.
template <typename T> struct TypeTag
{
    using Type = T;
};
template <typename Visitor> decltype(auto) visitType(CIMType type, Visitor&& visitor)
{
    switch (type) {
    case CIMTYPE_UINT8:
        return visitor(TypeTag<Uint8>());
    case CIMTYPE_SINT8:
        return visitor(TypeTag<Sint8>());
    case CIMTYPE_UINT16:
        return visitor(TypeTag<Uint16>());
    case CIMTYPE_SINT16:
        return visitor(TypeTag<Sint16>());
    case CIMTYPE_UINT32:
        return visitor(TypeTag<Uint32>());
    case CIMTYPE_SINT32:
        return visitor(TypeTag<Sint32>());
    case CIMTYPE_UINT64:
        return visitor(TypeTag<Uint64>());
    case CIMTYPE_SINT64:
        return visitor(TypeTag<Sint64>());
    case CIMTYPE_REAL32:
        return visitor(TypeTag<Real32>());
    case CIMTYPE_REAL64:
        return visitor(TypeTag<Real64>());
    case CIMTYPE_CHAR16:
        return visitor(TypeTag<Char16>());
    case CIMTYPE_STRING:
        return visitor(TypeTag<String>());
    case CIMTYPE_DATETIME:
        return visitor(TypeTag<CIMDateTime>());
    case CIMTYPE_REFERENCE:
        return visitor(TypeTag<CIMObjectPath>());
    case CIMTYPE_OBJECT:
        return visitor(TypeTag<CIMObject>());
    case CIMTYPE_INSTANCE:
        return visitor(TypeTag<CIMInstance>());
    default:
        return visitor(TypeTag<Boolean>());
    }
}

inline CIMValueRep::~CIMValueRep()
{
    if (fIsNull) {
        return;
    }
    visitType(CIMType(fType), [this](auto tag) {
        using T = typename decltype(tag)::Type;
        if (fIsArray) {
            drop<Array<T>>();
        } else {
            drop<T>();
        }
    });
}

// The library's own access to values; it does not copy what they hold.
struct ValueAccess
{
    // A value that takes the object as it is.
    template <typename T> static CIMValue make(T scalar) { return makeHeld<T, T>(std::move(scalar), false); }
    template <typename T> static CIMValue make(Array<T> array) { return makeHeld<T, Array<T>>(std::move(array), true); }
    // Requires: a non-null value of exactly this type. T may be an Array.
    template <typename Held> static const Held& held(const CIMValue& value) { return value.fRep->held<Held>(); }

  private:
    template <typename T, typename Held> static CIMValue makeHeld(Held held, bool isArray)
    {
        CIMValue value;
        value.fRep = RepPointer<CIMValueRep>(new CIMValueRep());
        value.fRep->fType = CIMTypeOf<T>::kType;
        value.fRep->fIsArray = isArray;
        value.fRep->hold(std::move(held));
        return value;
    }
};

} // namespace Pegasus
