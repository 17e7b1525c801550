// SPDX-License-Identifier: MIT
// Values from the server to the host and back, over every type.
#include "src/instance/ValueConversion.h"

#include "tests/src/support/StatusOf.h"

#include <host/ICIMClass.h>

#include <boost/make_shared.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <limits>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;
using TElements = std::vector<TCIMValue>;

constexpr char kTime[] = "20261121041500.123456+060";
constexpr char kInterval[] = "00000003040506.000000:000";

template <typename T> Pegasus::CIMValue PegArray(std::initializer_list<T> elements)
{
    Pegasus::Array<T> array;
    for (const T& element : elements) {
        array.append(element);
    }
    return Pegasus::CIMValue(array);
}

TCIMValue HostArray(TType::ECIMType type, const TElements& elements)
{
    return TCIMValue(type, 0, elements);
}

TCIMValue HostChar(unsigned short code)
{
    return TCIMValue(TCIMChar16(code));
}

template <typename T> T Min()
{
    return std::numeric_limits<T>::lowest();
}

template <typename T> T Max()
{
    return std::numeric_limits<T>::max();
}

struct TRow
{
    const char* fName;
    Pegasus::CIMValue fPeg;
    TCIMValue fHost;
    Pegasus::CIMValue fBack; // what the host's value becomes again
};

// A row whose value comes back as it went.
TRow Same(const char* name, const Pegasus::CIMValue& peg, const TCIMValue& host)
{
    return {name, peg, host, peg};
}

std::vector<TRow> ScalarRows()
{
    using namespace Pegasus;
    return {
        Same("boolean true", CIMValue(true), TCIMValue(true)),
        Same("boolean false", CIMValue(false), TCIMValue(false)),
        Same("uint8 max", CIMValue(Max<Uint8>()), TCIMValue(Max<unsigned char>())),
        Same("sint8 min", CIMValue(Min<Sint8>()), TCIMValue(Min<signed char>())),
        Same("uint16 max", CIMValue(Max<Uint16>()), TCIMValue(Max<unsigned short>())),
        Same("sint16 min", CIMValue(Min<Sint16>()), TCIMValue(Min<short>())),
        Same("uint32 max", CIMValue(Max<Uint32>()), TCIMValue(Max<unsigned int>())),
        Same("sint32 min", CIMValue(Min<Sint32>()), TCIMValue(Min<int>())),
        Same("uint64 max", CIMValue(Max<Uint64>()), TCIMValue(Max<unsigned long>())),
        Same("sint64 min", CIMValue(Min<Sint64>()), TCIMValue(Min<long>())),
        Same("sint64 -1", CIMValue(Sint64(-1)), TCIMValue(-1L)),
        Same("real32 max", CIMValue(Max<Real32>()), TCIMValue(Max<float>())),
        Same("real64 lowest", CIMValue(Min<Real64>()), TCIMValue(Min<double>())),
        Same("char16 A", CIMValue(Char16(65)), HostChar(65)),
        Same("char16 max", CIMValue(Char16(65535)), HostChar(65535)),
        Same("string", CIMValue(String("caf\xC3\xA9 \xE5\x90\x8D")),
             TCIMValue(std::string("caf\xC3\xA9 \xE5\x90\x8D"))),
        Same("string empty", CIMValue(String()), TCIMValue(std::string())),
        Same("datetime", CIMValue(CIMDateTime(kTime)), TCIMValue(TCIMDateTime(kTime))),
        Same("interval", CIMValue(CIMDateTime(kInterval)), TCIMValue(TCIMDateTime(kInterval))),
    };
}

std::vector<TRow> ArrayRows()
{
    using namespace Pegasus;
    return {
        Same("boolean[]", PegArray<Boolean>({true, false}), HostArray(TType::kBoolean, {true, false})),
        Same("uint8[]", PegArray<Uint8>({0, 255}),
             HostArray(TType::kUint8, {static_cast<unsigned char>(0), static_cast<unsigned char>(255)})),
        Same("sint8[]", PegArray<Sint8>({-128, 127}),
             HostArray(TType::kSint8, {static_cast<signed char>(-128), static_cast<signed char>(127)})),
        TRow{"uint16[] to low bytes", PegArray<Uint16>({258, 3}),
             HostArray(TType::kUint16, {static_cast<unsigned short>(258), static_cast<unsigned short>(3)}),
             PegArray<Uint8>({2, 3})},
        TRow{"sint16[] to low bytes", PegArray<Sint16>({-1, 256}),
             HostArray(TType::kSint16, {static_cast<short>(-1), static_cast<short>(256)}), PegArray<Sint8>({-1, 0})},
        Same("uint32[]", PegArray<Uint32>({0, Max<Uint32>()}), HostArray(TType::kUint32, {0U, Max<unsigned int>()})),
        Same("sint32[]", PegArray<Sint32>({Min<Sint32>()}), HostArray(TType::kSint32, {Min<int>()})),
        Same("uint64[]", PegArray<Uint64>({Max<Uint64>()}), HostArray(TType::kUint64, {Max<unsigned long>()})),
        Same("sint64[]", PegArray<Sint64>({Min<Sint64>()}), HostArray(TType::kSint64, {Min<long>()})),
        Same("real32[]", PegArray<Real32>({1.5F}), HostArray(TType::kReal32, {1.5F})),
        Same("real64[]", PegArray<Real64>({-2.25}), HostArray(TType::kReal64, {-2.25})),
        Same("char16[]", PegArray<Char16>({Char16(65), Char16(65535)}),
             HostArray(TType::kChar16, {HostChar(65), HostChar(65535)})),
        Same("string[]", PegArray<String>({String("a"), String(), String("caf\xC3\xA9")}),
             HostArray(TType::kString, {std::string("a"), std::string(), std::string("caf\xC3\xA9")})),
        Same("datetime[]", PegArray<CIMDateTime>({CIMDateTime(kTime)}),
             HostArray(TType::kDatetime, {TCIMDateTime(kTime)})),
        Same("boolean[] empty", PegArray<Boolean>({}), HostArray(TType::kBoolean, {})),
        Same("uint8[] empty", PegArray<Uint8>({}), HostArray(TType::kUint8, {})),
        Same("sint8[] empty", PegArray<Sint8>({}), HostArray(TType::kSint8, {})),
        TRow{"uint16[] empty", PegArray<Uint16>({}), HostArray(TType::kUint16, {}), PegArray<Uint8>({})},
        TRow{"sint16[] empty", PegArray<Sint16>({}), HostArray(TType::kSint16, {}), PegArray<Sint8>({})},
        Same("uint32[] empty", PegArray<Uint32>({}), HostArray(TType::kUint32, {})),
        Same("sint32[] empty", PegArray<Sint32>({}), HostArray(TType::kSint32, {})),
        Same("uint64[] empty", PegArray<Uint64>({}), HostArray(TType::kUint64, {})),
        Same("sint64[] empty", PegArray<Sint64>({}), HostArray(TType::kSint64, {})),
        Same("real32[] empty", PegArray<Real32>({}), HostArray(TType::kReal32, {})),
        Same("real64[] empty", PegArray<Real64>({}), HostArray(TType::kReal64, {})),
        Same("char16[] empty", PegArray<Char16>({}), HostArray(TType::kChar16, {})),
        Same("string[] empty", PegArray<String>({}), HostArray(TType::kString, {})),
        Same("datetime[] empty", PegArray<CIMDateTime>({}), HostArray(TType::kDatetime, {})),
    };
}

std::vector<TRow> Rows()
{
    std::vector<TRow> rows = ScalarRows();
    const std::vector<TRow> arrays = ArrayRows();
    rows.insert(rows.end(), arrays.begin(), arrays.end());
    return rows;
}

TCIMValue ToHost(const Pegasus::CIMValue& value)
{
    TCIMValue out(std::string("sentinel"));
    pegValToVRX("Property", value, value.getType(), value.isArray(), out, nullptr);
    return out;
}

Pegasus::CIMValue ToPeg(const TCIMValue& value)
{
    Pegasus::CIMValue out(Pegasus::String("sentinel"));
    vrxValToPeg(value, out);
    return out;
}

std::string Text(const Pegasus::CIMValue& value)
{
    return std::string(Pegasus::cimTypeToString(value.getType())) + (value.isArray() ? "[] " : " ") +
           static_cast<const char*>(value.toString().getCString());
}

TEST(ValueConversionTest, EveryTypeArrivesAndGoesBack)
{
    for (const TRow& row : Rows()) {
        SCOPED_TRACE(row.fName);
        EXPECT_EQ(row.fHost.ToString(10), ToHost(row.fPeg).ToString(10));
        EXPECT_TRUE(row.fHost == ToHost(row.fPeg));
        EXPECT_TRUE(row.fBack == ToPeg(row.fHost)) << Text(row.fBack) << " != " << Text(ToPeg(row.fHost));
    }
}

TEST(ValueConversionTest, StringsOfAnArrayComeAsTheClientLibrarysStreamWritesThem)
{
    const TElements elements = ToHost(PegArray<Pegasus::String>({Pegasus::String("caf\xC3\xA9 \xE5\x90\x8D")}));
    EXPECT_EQ("caf\xC3\xA9 \xE5\x90\x8D", static_cast<std::string>(elements.at(0)));
}

TEST(ValueConversionTest, WhatTheHostHasNoTypeForLeavesTheOutputAsItWas)
{
    const Pegasus::CIMInstance instance("CIM_X");
    struct
    {
        const char* fName;
        Pegasus::CIMValue fPeg;
    } const rows[] = {
        {"instance", Pegasus::CIMValue(instance)},
        {"object", Pegasus::CIMValue(Pegasus::CIMObject(instance))},
        {"instance[]", PegArray<Pegasus::CIMInstance>({instance})},
        {"object[]", PegArray<Pegasus::CIMObject>({Pegasus::CIMObject(instance)})},
        {"reference[]", PegArray<Pegasus::CIMObjectPath>({Pegasus::CIMObjectPath("CIM_X.A=1")})},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.fName);
        EXPECT_EQ("sentinel", static_cast<std::string>(ToHost(row.fPeg)));
    }
    const auto sentinel = Pegasus::CIMValue(Pegasus::String("sentinel"));
    EXPECT_TRUE(sentinel == ToPeg(TCIMValue()));
    EXPECT_TRUE(sentinel == ToPeg(HostArray(TType::kReference, {TCIMReference()})));
}

TEST(ValueConversionTest, AWrongDeclaredTypeLeavesAsTheLibrarysExceptionAndTheOutputAsItWas)
{
    const auto text = Pegasus::CIMValue(Pegasus::String("text"));
    TCIMValue out(std::string("sentinel"));
    EXPECT_THROW(pegValToVRX("P", text, Pegasus::CIMTYPE_UINT32, false, out, nullptr), Pegasus::TypeMismatchException);
    EXPECT_THROW(pegValToVRX("P", text, Pegasus::CIMTYPE_STRING, true, out, nullptr), Pegasus::TypeMismatchException);
    EXPECT_EQ("sentinel", static_cast<std::string>(out));
    Pegasus::CIMValue peg(Pegasus::String("sentinel"));
    EXPECT_EQ(14U, StatusOf([&] { vrxValToPeg(TCIMValue(TType::kUint32, 0), peg); })); // null
    EXPECT_TRUE(peg == Pegasus::CIMValue(Pegasus::String("sentinel")));
    // Declared boolean: a value is true when it equals a boolean true, whatever its own type.
    pegValToVRX("P", text, Pegasus::CIMTYPE_BOOLEAN, false, out, nullptr);
    EXPECT_TRUE(out == TCIMValue(false));
}

TEST(ValueConversionTest, AReferenceGoesToTheServerAsItsPath)
{
    TCIMReference reference;
    reference.SetPath("//h/root/other:CIM_X.A=1");
    EXPECT_TRUE(ToPeg(reference) == Pegasus::CIMValue(Pegasus::CIMObjectPath("//h/root/other:CIM_X.A=1")));
}

TEST(ValueConversionTest, TypesMapByTheirCodes)
{
    for (int code = 0; code <= 17; ++code) {
        SCOPED_TRACE(code);
        const auto type = static_cast<Pegasus::CIMType>(code);
        EXPECT_EQ(code <= 14 ? code + 1 : 0, static_cast<int>(pegTypeToVRXType(type, false)));
        EXPECT_EQ(code <= 14 ? code + 17 : 16, static_cast<int>(pegTypeToVRXType(type, true)));
    }
}

} // namespace
} // namespace NKOLVRX20
