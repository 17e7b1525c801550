// SPDX-License-Identifier: MIT
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/common/CIMValueRep.h"

namespace Pegasus {

template class RepPointer<CIMValueRep>;

namespace {

// Objects travel by clone, so that the holder's later changes stay with the holder; everything else is a value already.
template <typename T> T passed(const T& x)
{
    if constexpr (std::is_same_v<T, CIMObject> || std::is_same_v<T, CIMInstance>) {
        if (x.isUninitialized()) {
            throw UninitializedObjectException();
        }
        return x.clone();
    } else {
        return x;
    }
}

template <typename T> Array<T> passed(const Array<T>& x)
{
    if constexpr (std::is_same_v<T, CIMObject> || std::is_same_v<T, CIMInstance>) {
        Array<T> copies;
        copies.reserveCapacity(x.size());
        for (Uint32 i = 0; i < x.size(); ++i) {
            copies.append(passed(x[i]));
        }
        return copies;
    } else {
        return x;
    }
}

RepPointer<CIMValueRep> makeNull(CIMType type, Boolean isArray, Uint32 arraySize)
{
    RepPointer<CIMValueRep> rep(new CIMValueRep());
    rep->fType = static_cast<Uint8>(type);
    rep->fIsArray = isArray;
    rep->fNullArraySize = isArray ? arraySize : 0;
    return rep;
}

// A scalar null carries its type only, and classes are full of them. A representation is always replaced as a whole, so
// all nulls of a type can have the same.
struct SharedNulls
{
    SharedNulls()
    {
        for (int type = CIMTYPE_BOOLEAN; type <= CIMTYPE_INSTANCE; ++type) {
            ofType[type] = makeNull(CIMType(type), false, 0);
        }
    }
    RepPointer<CIMValueRep> ofType[CIMTYPE_INSTANCE + 1];
};

template <typename T> void getScalar(const RepPointer<CIMValueRep>& rep, T& x)
{
    const CIMType type = rep ? CIMType(rep->fType) : CIMTYPE_BOOLEAN;
    if (type != CIMTypeOf<T>::kType || (rep && rep->fIsArray)) {
        throw TypeMismatchException();
    }
    if (rep && !rep->fIsNull) {
        x = passed(rep->held<T>());
    }
}

template <typename T> void getArray(const RepPointer<CIMValueRep>& rep, Array<T>& x)
{
    if (!rep || !rep->fIsArray || CIMType(rep->fType) != CIMTypeOf<T>::kType) {
        throw TypeMismatchException();
    }
    if (!rep->fIsNull) {
        x = passed(rep->held<Array<T>>());
    }
}

template <typename T> Boolean sameElement(const T& x, const T& y)
{
    if constexpr (std::is_same_v<T, CIMObject> || std::is_same_v<T, CIMInstance>) {
        return x.identical(y);
    } else if constexpr (std::is_same_v<T, CIMDateTime>) {
        return x.isInterval() == y.isInterval() && x.equal(y);
    } else {
        return x == y;
    }
}

template <typename T> Boolean sameElements(const Array<T>& x, const Array<T>& y)
{
    if (x.size() != y.size()) {
        return false;
    }
    for (Uint32 i = 0; i < x.size(); ++i) {
        if (!sameElement(x[i], y[i])) {
            return false;
        }
    }
    return true;
}

void appendText(std::string& out, Boolean x)
{
    out += x ? "TRUE" : "FALSE";
}

void appendText(std::string& out, Real32 x)
{
    out += base::formatReal(Real64(x));
}

void appendText(std::string& out, Real64 x)
{
    out += base::formatReal(x);
}

void appendText(std::string& out, const Char16& x)
{
    base::appendUtf8(out, &x, 1);
}

void appendText(std::string& out, const String& x)
{
    base::appendUtf8(out, x);
}

template <typename T> void appendText(std::string& out, const T& x)
{
    if constexpr (std::is_integral_v<T>) {
        out += std::to_string(x);
    } else if constexpr (std::is_same_v<T, CIMInstance>) {
        base::appendUtf8(out, CIMObject(x).toString());
    } else {
        base::appendUtf8(out, x.toString());
    }
}

} // namespace

CIMValue::CIMValue(CIMType type, Boolean isArray, Uint32 arraySize)
{
    setNullValue(type, isArray, arraySize);
}

CIMValue::CIMValue(Boolean x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Uint8 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Sint8 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Uint16 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Sint16 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Uint32 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Sint32 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Uint64 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Sint64 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Real32 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(Real64 x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Char16& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const String& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const CIMDateTime& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const CIMObjectPath& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const CIMObject& x) : CIMValue(ValueAccess::make(passed(x))) {}
CIMValue::CIMValue(const CIMInstance& x) : CIMValue(ValueAccess::make(passed(x))) {}
CIMValue::CIMValue(const Array<Boolean>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Uint8>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Sint8>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Uint16>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Sint16>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Uint32>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Sint32>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Uint64>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Sint64>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Real32>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Real64>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<Char16>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<String>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<CIMDateTime>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<CIMObjectPath>& x) : CIMValue(ValueAccess::make(x)) {}
CIMValue::CIMValue(const Array<CIMObject>& x) : CIMValue(ValueAccess::make(passed(x))) {}
CIMValue::CIMValue(const Array<CIMInstance>& x) : CIMValue(ValueAccess::make(passed(x))) {}

void CIMValue::assign(const CIMValue& x)
{
    *this = x;
}

void CIMValue::clear()
{
    fRep = RepPointer<CIMValueRep>();
}

Boolean CIMValue::typeCompatible(const CIMValue& x) const
{
    return getType() == x.getType() && isArray() == x.isArray();
}

Boolean CIMValue::isArray() const
{
    return fRep && fRep->fIsArray;
}

Boolean CIMValue::isNull() const
{
    return !fRep || fRep->fIsNull;
}

Uint32 CIMValue::getArraySize() const
{
    if (!isArray()) {
        return 0;
    }
    if (fRep->fIsNull) {
        return fRep->fNullArraySize;
    }
    return visitType(getType(), [this](auto tag) { return fRep->held<Array<typename decltype(tag)::Type>>().size(); });
}

CIMType CIMValue::getType() const
{
    return fRep ? CIMType(fRep->fType) : CIMTYPE_BOOLEAN;
}

void CIMValue::setNullValue(CIMType type, Boolean isArray, Uint32 arraySize)
{
    static const SharedNulls kShared;
    const bool isPlain = !isArray && type >= CIMTYPE_BOOLEAN && type <= CIMTYPE_INSTANCE;
    fRep = isPlain ? kShared.ofType[type] : makeNull(type, isArray, arraySize);
}

// NOLINTBEGIN(bugprone-macro-parentheses): T is a type
#define PEGASUS_VALUE_SET_GET(PARAMETER, T)                                                                            \
    void CIMValue::set(PARAMETER x)                                                                                    \
    {                                                                                                                  \
        *this = CIMValue(x);                                                                                           \
    }                                                                                                                  \
    void CIMValue::set(const Array<T>& x)                                                                              \
    {                                                                                                                  \
        *this = CIMValue(x);                                                                                           \
    }                                                                                                                  \
    void CIMValue::get(T& x) const                                                                                     \
    {                                                                                                                  \
        getScalar(fRep, x);                                                                                            \
    }                                                                                                                  \
    void CIMValue::get(Array<T>& x) const                                                                              \
    {                                                                                                                  \
        getArray(fRep, x);                                                                                             \
    }
// NOLINTEND(bugprone-macro-parentheses)
PEGASUS_VALUE_SET_GET(Boolean, Boolean)
PEGASUS_VALUE_SET_GET(Uint8, Uint8)
PEGASUS_VALUE_SET_GET(Sint8, Sint8)
PEGASUS_VALUE_SET_GET(Uint16, Uint16)
PEGASUS_VALUE_SET_GET(Sint16, Sint16)
PEGASUS_VALUE_SET_GET(Uint32, Uint32)
PEGASUS_VALUE_SET_GET(Sint32, Sint32)
PEGASUS_VALUE_SET_GET(Uint64, Uint64)
PEGASUS_VALUE_SET_GET(Sint64, Sint64)
PEGASUS_VALUE_SET_GET(Real32, Real32)
PEGASUS_VALUE_SET_GET(Real64, Real64)
PEGASUS_VALUE_SET_GET(const Char16&, Char16)
PEGASUS_VALUE_SET_GET(const String&, String)
PEGASUS_VALUE_SET_GET(const CIMDateTime&, CIMDateTime)
PEGASUS_VALUE_SET_GET(const CIMObjectPath&, CIMObjectPath)
PEGASUS_VALUE_SET_GET(const CIMObject&, CIMObject)
PEGASUS_VALUE_SET_GET(const CIMInstance&, CIMInstance)
#undef PEGASUS_VALUE_SET_GET

Boolean CIMValue::equal(const CIMValue& x) const
{
    if (!typeCompatible(x) || isNull() != x.isNull()) {
        return false;
    }
    if (isNull() || fRep.get() == x.fRep.get()) {
        return true;
    }
    return visitType(getType(), [&](auto tag) {
        using T = typename decltype(tag)::Type;
        return isArray() ? sameElements(fRep->held<Array<T>>(), x.fRep->held<Array<T>>())
                         : sameElement(fRep->held<T>(), x.fRep->held<T>());
    });
}

String CIMValue::toString() const
{
    if (isNull()) {
        return String();
    }
    std::string out;
    visitType(getType(), [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if (!isArray()) {
            return appendText(out, fRep->held<T>());
        }
        const Array<T>& array = fRep->held<Array<T>>();
        for (Uint32 i = 0; i < array.size(); ++i) {
            appendText(out, array[i]);
            out += ' ';
        }
    });
    return base::fromUtf8(out);
}

Boolean operator==(const CIMValue& x, const CIMValue& y)
{
    return x.equal(y);
}

Boolean operator!=(const CIMValue& x, const CIMValue& y)
{
    return !x.equal(y);
}

} // namespace Pegasus
