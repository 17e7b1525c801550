// SPDX-License-Identifier: MIT
#include "src/instance/ValueConversion.h"

#include "src/common/Constants.h"
#include "src/common/Text.h"

#include <host/ICIMClass.h>
#include <host/ICIMNamespace.h>

#include <sstream>

namespace NKOLVRX20 {

namespace {

using TType = TCIMValue::TCIMType;

// One element of a host value from one of the client library's, one function for each type whose host type differs.
// The library's 64-bit integers are long long, which TCIMValue lacks a constructor for; long has the same 64 bits.
TCIMValue ToHost(Pegasus::Uint64 element)
{
    return TCIMValue(static_cast<unsigned long>(element));
}

TCIMValue ToHost(Pegasus::Sint64 element)
{
    return TCIMValue(static_cast<long>(element));
}

// By the decimal text of the code ("65" for 'A'): the form in which hosts take a character from a server.
TCIMValue ToHost(const Pegasus::Char16& element)
{
    return TCIMValue(TCIMChar16(std::to_string(static_cast<Pegasus::Uint16>(element))));
}

TCIMValue ToHost(const Pegasus::CIMDateTime& element)
{
    return TCIMValue(TCIMDateTime(ToStdString(element.toString())));
}

// For the elements of arrays. The stream operator writes UTF-8 in this client library; in OpenPegasus its encoding
// depends on how the library was built, and hosts rely on that text. A scalar is UTF-8 with either, and ASCII is the
// same with all.
TCIMValue ToHost(const Pegasus::String& element)
{
    if (auto ascii = AsciiText(element)) {
        return TCIMValue(*ascii);
    }
    std::ostringstream text;
    text << element;
    return TCIMValue(text.str());
}

// Booleans, integers up to 32 bits and reals: TCIMValue has a constructor for the very type.
template <typename TPlain> TCIMValue ToHost(TPlain element)
{
    return TCIMValue(element);
}

// Throws: Pegasus::TypeMismatchException when the value is of another type. Callers assign to the output only after
// this has returned, so that a failure leaves the output as it was.
template <typename TPeg> TPeg Get(const Pegasus::CIMValue& value)
{
    TPeg held{};
    value.get(held);
    return held;
}

template <typename TPeg> TCIMValue ScalarToHost(const Pegasus::CIMValue& value, const ICIMClass*)
{
    return ToHost(Get<TPeg>(value));
}

// By comparison: a value of another type counts as false; in all other cases it throws.
TCIMValue BooleanToHost(const Pegasus::CIMValue& value, const ICIMClass*)
{
    return TCIMValue(value == Pegasus::CIMValue(true));
}

TCIMValue StringToHost(const Pegasus::CIMValue& value, const ICIMClass*)
{
    return TCIMValue(ToStdString(Get<Pegasus::String>(value)));
}

// The keys stay in the path's text, as the client library writes it. The reference is bound to the namespace of the
// class even when the path names another one: the host has one namespace for all server namespaces.
TCIMValue ReferenceToHost(const Pegasus::CIMValue& value, const ICIMClass* forClass)
{
    TCIMReference reference((boost::shared_ptr<ICIMNamespace>()), TCIMContext());
    reference.SetNamespace(forClass->GetNamespace({}));
    reference.SetPath(ToStdString(Get<Pegasus::CIMObjectPath>(value).toString()));
    return TCIMValue(reference);
}

template <typename TPeg, TType::ECIMType kElement>
TCIMValue ArrayToHost(const Pegasus::CIMValue& value, const ICIMClass*)
{
    const auto held = Get<Pegasus::Array<TPeg>>(value);
    std::vector<TCIMValue> elements;
    elements.reserve(held.size());
    for (Pegasus::Uint32 i = 0; i < held.size(); ++i) {
        elements.push_back(ToHost(held[i]));
    }
    // The host wants the element's code here, where a declaration has the array's; the 0 is reserved.
    return TCIMValue(kElement, 0, elements);
}

// The conversions by the server's type code. Objects, instances and arrays of references are beyond the tables: the
// host has no type for them.
using TConversion = TCIMValue (*)(const Pegasus::CIMValue& value, const ICIMClass* forClass);
constexpr TConversion kScalarConversions[] = {
    BooleanToHost,
    ScalarToHost<Pegasus::Uint8>,
    ScalarToHost<Pegasus::Sint8>,
    ScalarToHost<Pegasus::Uint16>,
    ScalarToHost<Pegasus::Sint16>,
    ScalarToHost<Pegasus::Uint32>,
    ScalarToHost<Pegasus::Sint32>,
    ScalarToHost<Pegasus::Uint64>,
    ScalarToHost<Pegasus::Sint64>,
    ScalarToHost<Pegasus::Real32>,
    ScalarToHost<Pegasus::Real64>,
    ScalarToHost<Pegasus::Char16>,
    StringToHost,
    ScalarToHost<Pegasus::CIMDateTime>,
    ReferenceToHost,
};
constexpr TConversion kArrayConversions[] = {
    ArrayToHost<Pegasus::Boolean, TType::kBoolean>, ArrayToHost<Pegasus::Uint8, TType::kUint8>,
    ArrayToHost<Pegasus::Sint8, TType::kSint8>,     ArrayToHost<Pegasus::Uint16, TType::kUint16>,
    ArrayToHost<Pegasus::Sint16, TType::kSint16>,   ArrayToHost<Pegasus::Uint32, TType::kUint32>,
    ArrayToHost<Pegasus::Sint32, TType::kSint32>,   ArrayToHost<Pegasus::Uint64, TType::kUint64>,
    ArrayToHost<Pegasus::Sint64, TType::kSint64>,   ArrayToHost<Pegasus::Real32, TType::kReal32>,
    ArrayToHost<Pegasus::Real64, TType::kReal64>,   ArrayToHost<Pegasus::Char16, TType::kChar16>,
    ArrayToHost<Pegasus::String, TType::kString>,   ArrayToHost<Pegasus::CIMDateTime, TType::kDatetime>,
};

template <std::size_t kCount> TConversion ConversionIn(const TConversion (&table)[kCount], Pegasus::CIMType type)
{
    const auto code = static_cast<std::size_t>(type);
    return code < kCount ? table[code] : nullptr;
}

// Datetimes and references travel as their texts, which the client library parses again and may refuse.
Pegasus::String DecimalText(const TCIMValue& value)
{
    return Pegasus::String(value.ToString(kDecimal).c_str());
}

// GetType is the element's code for an array, so that this switch and the one for arrays have the same cases.
void ScalarToPegasus(const TCIMValue& in, Pegasus::CIMValue& out)
{
    switch (in.GetType()) {
    case TType::kBoolean:
        out = Pegasus::CIMValue(static_cast<Pegasus::Boolean>(static_cast<bool>(in)));
        break;
    case TType::kUint8:
        out.set(static_cast<Pegasus::Uint8>(static_cast<unsigned char>(in)));
        break;
    case TType::kSint8:
        out.set(static_cast<Pegasus::Sint8>(static_cast<signed char>(in)));
        break;
    case TType::kUint16:
        out.set(static_cast<Pegasus::Uint16>(static_cast<unsigned short>(in)));
        break;
    case TType::kSint16:
        out.set(static_cast<Pegasus::Sint16>(static_cast<short>(in)));
        break;
    case TType::kUint32:
        out.set(static_cast<Pegasus::Uint32>(static_cast<unsigned int>(in)));
        break;
    case TType::kSint32:
        out.set(static_cast<Pegasus::Sint32>(static_cast<int>(in)));
        break;
    case TType::kUint64:
        out.set(static_cast<Pegasus::Uint64>(static_cast<unsigned long>(in)));
        break;
    case TType::kSint64:
        out.set(static_cast<Pegasus::Sint64>(static_cast<long>(in)));
        break;
    case TType::kReal32:
        out.set(static_cast<Pegasus::Real32>(static_cast<float>(in)));
        break;
    case TType::kReal64:
        out.set(static_cast<Pegasus::Real64>(static_cast<double>(in)));
        break;
    case TType::kChar16: // by its code; the decimal text is for the other direction only
        out.set(Pegasus::Char16(static_cast<unsigned short>(in)));
        break;
    case TType::kString:
        out.set(DecimalText(in));
        break;
    case TType::kDatetime:
        out.set(Pegasus::CIMDateTime(DecimalText(in)));
        break;
    case TType::kReference:
        out.set(Pegasus::CIMObjectPath(DecimalText(in)));
        break;
    default:
        break;
    }
}

// Unlike a scalar, an element has to be a string: the conversion throws TVRXException 14 where ToString would convert.
void StringArrayToPegasus(const TCIMValue& in, Pegasus::CIMValue& out)
{
    Pegasus::Array<Pegasus::String> elements;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(in)) {
        elements.append(Pegasus::String(static_cast<std::string>(element).c_str()));
    }
    out.set(elements);
}

void DatetimeArrayToPegasus(const TCIMValue& in, Pegasus::CIMValue& out)
{
    Pegasus::Array<Pegasus::CIMDateTime> elements;
    for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(in)) {
        elements.append(Pegasus::CIMDateTime(DecimalText(element)));
    }
    out.set(elements);
}

void ArrayToPegasus(const TCIMValue& in, Pegasus::CIMValue& out)
{
    switch (in.GetType()) {
    case TType::kBoolean:
        vrxArrayToPeg(in, out, bool(), Pegasus::Boolean());
        break;
    case TType::kUint8:
        vrxArrayToPeg(in, out, static_cast<unsigned char>(0), Pegasus::Uint8());
        break;
    case TType::kSint8:
        vrxArrayToPeg(in, out, static_cast<signed char>(0), Pegasus::Sint8());
        break;
    case TType::kUint16: // 8-bit elements on purpose: vendors' methods with 16-bit arrays rely on it
        vrxArrayToPeg(in, out, static_cast<unsigned short>(0), Pegasus::Uint8());
        break;
    case TType::kSint16: // as above
        vrxArrayToPeg(in, out, short(), Pegasus::Sint8());
        break;
    case TType::kUint32:
        vrxArrayToPeg(in, out, 0U, Pegasus::Uint32());
        break;
    case TType::kSint32:
        vrxArrayToPeg(in, out, 0, Pegasus::Sint32());
        break;
    case TType::kUint64:
        vrxArrayToPeg(in, out, 0UL, Pegasus::Uint64());
        break;
    case TType::kSint64:
        vrxArrayToPeg(in, out, 0L, Pegasus::Sint64());
        break;
    case TType::kReal32:
        vrxArrayToPeg(in, out, 0.0F, Pegasus::Real32());
        break;
    case TType::kReal64:
        vrxArrayToPeg(in, out, 0.0, Pegasus::Real64());
        break;
    case TType::kChar16:
        vrxArrayToPeg(in, out, static_cast<unsigned short>(0), Pegasus::Char16());
        break;
    case TType::kString:
        StringArrayToPegasus(in, out);
        break;
    case TType::kDatetime:
        DatetimeArrayToPegasus(in, out);
        break;
    default:
        break;
    }
}

} // namespace

void ToHostValue(const Pegasus::CIMValue& value, Pegasus::CIMType type, bool isArray, const ICIMClass* forClass,
                 TCIMValue& out)
{
    const TConversion convert =
        isArray ? ConversionIn(kArrayConversions, type) : ConversionIn(kScalarConversions, type);
    if (convert) {
        out = convert(value, forClass);
    }
}

void pegValToVRX(std::string, Pegasus::CIMValue value, Pegasus::CIMType type, bool isArray, TCIMValue& out,
                 boost::shared_ptr<ICIMClass> forClass)
{
    ToHostValue(value, type, isArray, forClass.get(), out);
}

void vrxValToPeg(const TCIMValue& in, Pegasus::CIMValue& out)
{
    if (in.IsArray()) {
        ArrayToPegasus(in, out);
    } else {
        ScalarToPegasus(in, out);
    }
}

TCIMValue::TCIMType pegTypeToVRXType(Pegasus::CIMType type, bool isArray)
{
    // The host's code is the server's plus 1, because the host's 0 means "no type".
    const int code = type >= Pegasus::CIMTYPE_BOOLEAN && type <= Pegasus::CIMTYPE_REFERENCE ? int(type) + 1 : 0;
    return TType::ECIMType(code + (isArray ? int(TType::kArrayOffset) : 0));
}

} // namespace NKOLVRX20
