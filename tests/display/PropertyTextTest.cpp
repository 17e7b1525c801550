// SPDX-License-Identifier: MIT
// One table of declarations and values for the properties of classes and for those of instances, so that both show a
// value alike.
#include "host/inmem/TInmemClass.h"
#include "src/schema/TPEGASUSProperty.h"

#include <host/ICIMProperty.h>
#include <host/ICIMPropertyDecl.h>
#include <host/TInmemInstance.h>

#include <boost/make_shared.hpp>
#include <gtest/gtest.h>

#include <climits>
#include <cstdint>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;
using TTexts = std::vector<std::string>;
using TQualifiers = std::map<std::string, TCIMValue>;

TCIMValue Strings(const TTexts& texts)
{
    return TCIMValue(TType::kString, 0, std::vector<TCIMValue>(texts.begin(), texts.end()));
}

TQualifiers Map(const TTexts& valueMap, const TTexts& values)
{
    return {{"ValueMap", Strings(valueMap)}, {"Values", Strings(values)}};
}

TQualifiers Bits(const TTexts& bitMap, const TTexts& bitValues)
{
    return {{"BitMap", Strings(bitMap)}, {"BitValues", Strings(bitValues)}};
}

// An entry alone: "hit" where it covers the value, the plain text elsewhere.
TQualifiers Only(const char* entry)
{
    return Map({entry}, {"hit"});
}

TQualifiers Units(const char* units, const char* programmatic)
{
    return {{"Units", TCIMValue(units)}, {"PUnit", TCIMValue(programmatic)}};
}

TCIMValue Array(TType::ECIMType type, const std::vector<TCIMValue>& elements)
{
    return TCIMValue(TType(type), 0, elements);
}

TCIMValue Character(unsigned short code)
{
    return TCIMValue(TCIMChar16(code));
}

struct TRow
{
    const char* fName;
    TCIMValue fValue;
    TQualifiers fQualifiers;
    TTexts fTexts;
};

const TQualifiers kReserved = Map({"0", "1", "..", "0x8000..0xFFFF"}, {"Unknown", "Other", "DMTF", "Vendor"});
const TQualifiers kRanges = Map({"1..5", "..", "3", "9..", "..-4"}, {"few", "rest", "three", "many", "below"});

const TRow kRows[] = {
    {"null", TCIMValue(TType(TType::kUint32), 0), Units("Bytes", ""), {}},
    {"null without type", TCIMValue(), kRanges, {}},
    {"no qualifiers", 5, {}, {"5"}},

    // Literals of each base.
    {"decimal", 10, Only("10"), {"hit"}},
    {"plus sign", 10, Only("+10"), {"hit"}},
    {"minus sign", -10, Only("-10"), {"hit"}},
    {"hexadecimal", 26, Only("0x1a"), {"hit"}},
    {"hexadecimal in upper case", 26, Only("0X1A"), {"hit"}},
    {"hexadecimal that ends like binary", 27, Only("0x1b"), {"hit"}},
    {"negative hexadecimal", -16, Only("-0x10"), {"hit"}},
    {"octal", 8, Only("010"), {"hit"}},
    {"octal is not decimal", 10, Only("010"), {"10"}},
    {"octal of one digit", 1, Only("01"), {"hit"}},
    {"binary", 5, Only("101b"), {"hit"}},
    {"binary in upper case", -5, Only("-101B"), {"hit"}},
    {"no octal digits", 8, Only("08"), {"8"}},
    {"no digits", 0, Only("0x"), {"0"}},
    {"two signs", -1, Only("+-1"), {"-1"}},
    {"blank", 1, Only(" 1"), {"1"}},
    {"empty entry", 0, Only(""), {"0"}},
    {"text", 0, Only("zero"), {"0"}},

    // Bounds up to 64 bits.
    {"highest of 64 bits", ULONG_MAX, Only("18446744073709551615"), {"hit"}},
    {"highest of 64 bits in hexadecimal", ULONG_MAX, Only("0xFFFFFFFFFFFFFFFF"), {"hit"}},
    {"65 bits", 0, Only("0..0x1FFFFFFFFFFFFFFFF"), {"0"}},
    {"2^63 within a range", 1UL << 63, Only("9223372036854775808..9223372036854775809"), {"hit"}},
    {"2^63 is not -2^63", 1UL << 63, Only("-9223372036854775808"), {"9223372036854775808"}},
    {"lowest of 64 bits", LONG_MIN, Only("-9223372036854775808..-9223372036854775807"), {"hit"}},

    // Ranges and precedence.
    {"first of a range", 1, kRanges, {"few"}},
    {"last of a range", 5, kRanges, {"few"}},
    {"exact beats an earlier range", 3, kRanges, {"three"}},
    {"range beats an earlier rest", 9, kRanges, {"many"}},
    {"open end above 63 bits", ULONG_MAX, kRanges, {"many"}},
    {"open beginning", LONG_MIN, kRanges, {"below"}},
    {"rest", 7, kRanges, {"rest"}},
    {"negative rest", -3, kRanges, {"rest"}},
    {"vendor's range in hexadecimal", static_cast<unsigned short>(32769), kReserved, {"Vendor"}},
    {"below the vendor's range", static_cast<unsigned short>(32767), kReserved, {"DMTF"}},
    {"open hexadecimal range", 0x8000, Only("0x8000.."), {"hit"}},
    {"bounds of two bases", 0x0fff, Only("5..0x0FFF"), {"hit"}},
    {"reversed bounds", 4, Only("5..3"), {"4"}},
    {"bad bound", 4, Only("3..x"), {"4"}},

    // Values.
    {"names without case", 1, {{"VALUEMAP", Strings({"1"})}, {"values", Strings({"one"})}}, {"one"}},
    {"entry without a text", 2, Map({"1", "2"}, {"one"}), {"2"}},
    {"index without a map", 1, {{"Values", Strings({"a", "b"})}}, {"b"}},
    {"index beyond the texts", 2, {{"Values", Strings({"a", "b"})}}, {"2"}},
    {"negative index", -1, {{"Values", Strings({"a", "b"})}}, {"-1"}},
    {"string", "k", Map({"j", "k"}, {"J", "K"}), {"K"}},
    {"string of digits", "01", Map({"1", "01"}, {"one", "zero one"}), {"zero one"}},
    {"string and a range", "5", Only("1..9"), {"5"}},
    {"char16", Character('S'), Map({"S", "M"}, {"Small", "Medium"}), {"Small"}},
    {"boolean", true, Only("true"), {"true"}},
    {"real", 1.0, Only("1"), {"1"}},
    {"array", Array(TType::kSint32, {2, 7, -3}), kRanges, {"few", "rest", "rest"}},
    {"array with a null",
     Array(TType::kUint8, {TCIMValue(TType(TType::kUint8), 0), TCIMValue(std::uint8_t(3))}),
     kRanges,
     {"", "three"}},
    {"empty array", Array(TType::kUint8, {}), kRanges, {}},

    // BitValues.
    {"bits", 5, Bits({"0", "1", "2"}, {"a", "b", "c"}), {"a | c"}},
    {"bits without a map", 2, {{"BitValues", Strings({"a", "b"})}}, {"b"}},
    {"bits in hexadecimal", 1 << 16, Bits({"0x10"}, {"p"}), {"p"}},
    {"bit 63", 1UL << 63, Bits({"63"}, {"top"}), {"top"}},
    {"bits beyond the integer", 1, Bits({"64", "0"}, {"none", "a"}), {"a"}},
    {"bits of one entry", 0x70, Bits({"4..6"}, {"p"}), {"p"}},
    {"unnamed bits", 0x31, Bits({"0"}, {"a"}), {"a | 0x30"}},
    {"only unnamed bits", 2, Bits({"0"}, {"a"}), {"2"}},
    {"no bit", 0, Bits({"0"}, {"a"}), {"0"}},
    {"bits of a negative", static_cast<signed char>(-128), Bits({"7", "8"}, {"sign", "none"}), {"sign"}},
    {"bits in an array", Array(TType::kSint32, {1, 2}), Bits({"0", "1"}, {"a", "b"}), {"a", "b"}},

    // Plain texts and units.
    {"units", 1500, Units("MegaBytes", "byte"), {"1500 MegaBytes"}},
    {"programmatic unit", 2.5, Units("", "hertz"), {"2.5 hertz"}},
    {"unit of a number outside the map", 8, {{"Values", Strings({})}, {"Units", "MB"}}, {"8 MB"}},
    {"no unit after text", "t", Units("MB", ""), {"t"}},
    {"no unit after a boolean", true, Units("MB", ""), {"true"}},
    {"units in an array", Array(TType::kSint32, {1, 2}), Units("V", ""), {"1 V", "2 V"}},
    {"characters", Array(TType::kChar16, {Character('S'), Character(0xe9), Character(0x20ac)}), {}, {"S", "é", "€"}},
    {"unpaired surrogate", Character(0xd800), {}, {"\xef\xbf\xbd"}},
    {"datetime", TCIMDateTime("00000003040506.000000:000"), {}, {"3 days 04:05:06"}},
};

boost::shared_ptr<ICIMProperty> PropertyOfAClass(const TCIMValue& value,
                                                 const boost::shared_ptr<ICIMPropertyDecl>& declaration,
                                                 const boost::shared_ptr<ICIMClass>& owner)
{
    return boost::make_shared<TPEGASUSProperty>(value, declaration, owner);
}

boost::shared_ptr<ICIMProperty> PropertyOfAnInstance(const TCIMValue& value,
                                                     const boost::shared_ptr<ICIMPropertyDecl>& declaration,
                                                     const boost::shared_ptr<ICIMClass>& instanceClass)
{
    const auto instance = boost::make_shared<TInmemInstance>(instanceClass, TCIMContext());
    instance->SetPropertyValue(declaration->GetName({}), value, {});
    return instance->GetProperty(declaration->GetName({}), {});
}

TEST(PropertyText, ClassAndInstanceShowAValueAlike)
{
    for (const TRow& row : kRows) {
        SCOPED_TRACE(row.fName);
        const auto owner = boost::make_shared<TInmemClass>("CIM_A");
        const auto declaration = owner->Declare("X", row.fValue.GetType());
        for (const auto& [name, value] : row.fQualifiers) {
            declaration->SetQualifier(name, value);
        }
        std::string joined;
        for (const std::string& text : row.fTexts) {
            joined += (&text == &row.fTexts.front() ? "" : ", ") + text;
        }
        for (const auto make : {PropertyOfAClass, PropertyOfAnInstance}) {
            SCOPED_TRACE(make == PropertyOfAClass ? "of a class" : "of an instance");
            const auto property = make(row.fValue, declaration, owner);
            property->SetPrevValue();
            EXPECT_EQ(property->ToStringVector(), row.fTexts);
            EXPECT_EQ(property->ToString(), joined);
            EXPECT_EQ(property->PrevValueToString(), joined);
        }
    }
}

} // namespace
} // namespace NKOLVRX20
