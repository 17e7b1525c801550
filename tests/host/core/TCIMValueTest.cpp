// SPDX-License-Identifier: MIT
#include <host/TCIMValue.h>
#include <host/TVRXException.h>

#include <boost/make_shared.hpp>
#include <gtest/gtest.h>

#include <cmath>
#include <limits>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;

constexpr unsigned long kMaxUint64 = std::numeric_limits<unsigned long>::max();
constexpr long kMinSint64 = std::numeric_limits<long>::min();

TCIMReference ReferenceTo(const std::string& path)
{
    TCIMReference reference;
    reference.SetPath(path);
    return reference;
}

template <typename Call> std::uint32_t StatusOf(const Call& call)
{
    try {
        call();
        return TVRXStatusCode::kSuccess;
    } catch (const TVRXException& e) {
        return e.GetStatusCode();
    }
}

struct TScalarRow
{
    const char* fName;
    TCIMValue fValue;
    TType::ECIMType fType;
    std::string fDecimal;
    std::string fHex; // empty: as the decimal one
};

const TScalarRow kScalars[] = {
    {"boolean", TCIMValue(true), TType::kBoolean, "true", ""},
    {"uint8", TCIMValue(static_cast<unsigned char>(255)), TType::kUint8, "255", "ff"},
    {"sint8", TCIMValue(static_cast<signed char>(-128)), TType::kSint8, "-128", "-80"},
    {"uint16", TCIMValue(static_cast<unsigned short>(65535)), TType::kUint16, "65535", "ffff"},
    {"sint16", TCIMValue(static_cast<short>(-32768)), TType::kSint16, "-32768", "-8000"},
    {"uint32", TCIMValue(4294967295u), TType::kUint32, "4294967295", "ffffffff"},
    {"sint32", TCIMValue(-2147483647), TType::kSint32, "-2147483647", "-7fffffff"},
    {"uint64", TCIMValue(kMaxUint64), TType::kUint64, "18446744073709551615", "ffffffffffffffff"},
    {"sint64", TCIMValue(kMinSint64), TType::kSint64, "-9223372036854775808", "-8000000000000000"},
    {"real32", TCIMValue(0.1f), TType::kReal32, "0.1", ""},
    {"real64", TCIMValue(1e300), TType::kReal64, "1e+300", ""},
    {"real64 whole", TCIMValue(-2.0), TType::kReal64, "-2", ""},
    {"char16", TCIMValue(TCIMChar16(0x20ac)), TType::kChar16, "8364", "20ac"},
    {"string", TCIMValue("a, b"), TType::kString, "a, b", ""},
    {"empty string", TCIMValue(""), TType::kString, "", ""},
    {"datetime", TCIMValue(TCIMDateTime("20261121041500.000000+060")), TType::kDatetime, "20261121041500.000000+060",
     ""},
    {"reference", TCIMValue(ReferenceTo("root/cimv2:A.k=1")), TType::kReference, "root/cimv2:A.k=1", ""},
};

TEST(TCIMValue, EveryScalarKnowsItsTypeAndItsTexts)
{
    for (const TScalarRow& row : kScalars) {
        SCOPED_TRACE(row.fName);
        EXPECT_EQ(row.fValue.GetType(), row.fType);
        EXPECT_FALSE(row.fValue.IsArray());
        EXPECT_FALSE(row.fValue.IsNull());
        EXPECT_EQ(row.fValue.ToString(10), row.fDecimal);
        EXPECT_EQ(row.fValue.ToString(16), row.fHex.empty() ? row.fDecimal : row.fHex);
    }
}

TEST(TCIMValue, SetReadsWhatToStringWrote)
{
    for (const TScalarRow& row : kScalars) {
        SCOPED_TRACE(row.fName);
        TCIMValue value(row.fType, 0);
        ASSERT_TRUE(value.IsNull());
        value.Set(row.fDecimal);
        EXPECT_EQ(value, row.fValue);
    }
}

struct TBadTextRow
{
    const char* fName;
    TType::ECIMType fType;
    const char* fText;
};

const TBadTextRow kBadTexts[] = {{"boolean word", TType::kBoolean, "yes"},
                                 {"boolean empty", TType::kBoolean, ""},
                                 {"uint8 too large", TType::kUint8, "256"},
                                 {"uint8 negative", TType::kUint8, "-1"},
                                 {"sint8 too small", TType::kSint8, "-129"},
                                 {"uint64 too large", TType::kUint64, "18446744073709551616"},
                                 {"trailing text", TType::kUint32, "12x"},
                                 {"leading blank", TType::kUint32, " 12"},
                                 {"plus sign", TType::kSint32, "+1"},
                                 {"no digits", TType::kSint32, ""},
                                 {"real with a comma", TType::kReal64, "1,5"},
                                 {"char16 too large", TType::kChar16, "65536"},
                                 {"char16 letter", TType::kChar16, "A"},
                                 {"datetime short", TType::kDatetime, "20261121"},
                                 {"array with text", TType::kStringArray, "a,b"}};

TEST(TCIMValue, SetRefusesOtherTextsAndKeepsTheValue)
{
    for (const TBadTextRow& row : kBadTexts) {
        SCOPED_TRACE(row.fName);
        TCIMValue value(row.fType, 0);
        const TCIMValue before = value;
        EXPECT_EQ(StatusOf([&] { value.Set(row.fText); }), TVRXStatusCode::kTypeMismatch);
        EXPECT_EQ(value, before);
    }
}

TEST(TCIMValue, ASettextOnANullWithoutTypeMakesAString)
{
    TCIMValue value;
    value.Set("");
    EXPECT_EQ(value, TCIMValue(""));
}

struct TNumberRow
{
    const char* fName;
    TCIMValue fValue;
    bool fBoolean;
    unsigned char fUint8;
    short fSint16;
    unsigned int fUint32;
    long fSint64;
    double fReal64;
};

const TNumberRow kNumbers[] = {
    {"true", TCIMValue(true), true, 1, 1, 1, 1, 1},
    {"zero", TCIMValue(0), false, 0, 0, 0, 0, 0},
    {"uint16 wraps", TCIMValue(static_cast<unsigned short>(258)), true, 2, 258, 258, 258, 258},
    {"minus one", TCIMValue(-1), true, 255, -1, 4294967295u, -1, -1},
    {"70000", TCIMValue(70000), true, 112, 4464, 70000, 70000, 70000},
    {"uint64 maximum", TCIMValue(kMaxUint64), true, 255, -1, 4294967295u, -1, 18446744073709551615.0},
    {"real truncates", TCIMValue(-2.9), true, 0, -2, 0, -2, -2.9},
    {"real saturates", TCIMValue(1e30), true, 255, 32767, 4294967295u, std::numeric_limits<long>::max(), 1e30},
    {"infinity", TCIMValue(-HUGE_VAL), true, 0, -32768, 0, kMinSint64, -HUGE_VAL},
    {"char16", TCIMValue(TCIMChar16(65)), true, 65, 65, 65, 65, 65},
};

TEST(TCIMValue, NumbersConvertAmongEachOther)
{
    for (const TNumberRow& row : kNumbers) {
        SCOPED_TRACE(row.fName);
        EXPECT_EQ(static_cast<bool>(row.fValue), row.fBoolean);
        EXPECT_EQ(static_cast<unsigned char>(row.fValue), row.fUint8);
        EXPECT_EQ(static_cast<short>(row.fValue), row.fSint16);
        EXPECT_EQ(static_cast<unsigned int>(row.fValue), row.fUint32);
        EXPECT_EQ(static_cast<long>(row.fValue), row.fSint64);
        EXPECT_EQ(static_cast<double>(row.fValue), row.fReal64);
    }
    EXPECT_EQ(static_cast<int>(TCIMValue(std::nan(""))), 0);
    EXPECT_EQ(static_cast<unsigned long>(TCIMValue(kMaxUint64)), kMaxUint64);
}

TEST(TCIMValue, KindsThatDoNotConvertAreRefused)
{
    const TCIMValue text("5"), number(5), nothing, typedNull(TType::kUint32, 0);
    const TCIMValue array(TType::kUint32, 0, {TCIMValue(5u)});
    for (const TCIMValue* value : {&text, &nothing, &typedNull, &array}) {
        EXPECT_EQ(StatusOf([&] { (void)static_cast<int>(*value); }), TVRXStatusCode::kTypeMismatch);
    }
    EXPECT_EQ(StatusOf([&] { (void)static_cast<std::string>(number); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { (void)static_cast<TCIMChar16>(number); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { (void)static_cast<TCIMDateTime>(text); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { (void)static_cast<TCIMReference>(text); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { (void)static_cast<const std::vector<TCIMValue>&>(text); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { number.ToString(1); }), TVRXStatusCode::kTypeMismatch);
    EXPECT_EQ(StatusOf([&] { number.ToString(37); }), TVRXStatusCode::kTypeMismatch);
}

TEST(TCIMValue, TypedNullsAndEmptyArraysForEveryCode)
{
    for (unsigned int code = 0; code <= 31; ++code) {
        SCOPED_TRACE(code);
        const TType type{TType::ECIMType(code)};
        const TCIMValue value(type, 0);
        EXPECT_EQ(value.IsArray(), code >= 16);
        EXPECT_EQ(value.IsNull(), code < 16);
        EXPECT_EQ(value.GetType(), type.GetElementType());
        EXPECT_EQ(value.ToString(10), "");
    }
    EXPECT_EQ(StatusOf([] { TCIMValue(TType::ECIMType(32), 0); }), TVRXStatusCode::kTypeMismatch);
}

TEST(TCIMValue, ArraysHoldElementsOfOneType)
{
    const TCIMValue array(TType::kSint16, 0, {TCIMValue(short(-1)), TCIMValue(TType(TType::kSint16), 0)});
    EXPECT_EQ(array.GetType(), TType::kSint16);
    EXPECT_EQ(array.ToString(10), "-1, ");
    const auto make = [](TType type, const TCIMValue& element) {
        return StatusOf([&] { TCIMValue(type, 0, {element}); });
    };
    EXPECT_EQ(make(TType::kSint16, TCIMValue(1)), TVRXStatusCode::kTypeMismatch) << "element of another type";
    EXPECT_EQ(make(TType::kSint16Array, TCIMValue(short(1))), TVRXStatusCode::kTypeMismatch) << "array code";
    EXPECT_EQ(make(TType::kNone, TCIMValue()), TVRXStatusCode::kTypeMismatch) << "no type";
    EXPECT_EQ(make(TType::kSint16, array), TVRXStatusCode::kTypeMismatch) << "array in an array";
}

TEST(TCIMValue, CopiesAreIndependentAlsoOfAnElementVectorInUse)
{
    TCIMValue array(TType::kString, 0, {TCIMValue("a")});
    const TCIMValue earlier = array;
    std::vector<TCIMValue>& elements = array;
    elements.emplace_back("b");
    const TCIMValue between = array;
    elements.emplace_back("c");
    const TCIMValue moved = std::move(array);
    EXPECT_EQ(earlier.ToString(10), "a");
    EXPECT_EQ(between.ToString(10), "a, b");
    EXPECT_EQ(moved.ToString(10), "a, b, c");
}

TEST(TCIMValue, ComparesByTypeThenNullThenValue)
{
    // Ascending; each entry is less than all that follow and equal to itself alone.
    const std::vector<TCIMValue> ascending = {
        TCIMValue(),
        TCIMValue(false),
        TCIMValue(true),
        TCIMValue(TType(TType::kSint32), 0),
        TCIMValue(-1),
        TCIMValue(2),
        TCIMValue(10),
        TCIMValue(kMinSint64),
        TCIMValue(std::nan("")),
        TCIMValue(-HUGE_VAL),
        TCIMValue("10"),
        TCIMValue("2"),
        TCIMValue(TType(TType::kSint32Array), 0),
        TCIMValue(TType(TType::kSint32), 0, {TCIMValue(1)}),
        TCIMValue(TType(TType::kSint32), 0, {TCIMValue(1), TCIMValue(0)}),
    };
    for (std::size_t i = 0; i < ascending.size(); ++i) {
        for (std::size_t j = 0; j < ascending.size(); ++j) {
            SCOPED_TRACE(std::to_string(i) + " and " + std::to_string(j));
            EXPECT_EQ(ascending[i] < ascending[j], i < j);
            EXPECT_EQ(ascending[i] == ascending[j], i == j);
        }
    }
}

TEST(TCIMValue, EqualValuesMadeApartAreEqual)
{
    EXPECT_EQ(TCIMValue(std::nan("")), TCIMValue(std::nan("")));
    EXPECT_EQ(TCIMValue(0.0), TCIMValue(-0.0));
    EXPECT_EQ(TCIMValue(TType(TType::kChar16), 0, {TCIMValue(TCIMChar16(1))}),
              TCIMValue(TType(TType::kChar16), 0, {TCIMValue(TCIMChar16("1"))}));
}

// A placeholder of the pointer's type shows that the pointer is weak; the test only compares and releases it.
TEST(TCIMValue, ReferencedClassIsKeptWeakly)
{
    int dummy = 0;
    auto owner = boost::make_shared<int>();
    boost::shared_ptr<ICIMClass> target(owner, reinterpret_cast<ICIMClass*>(&dummy));
    TCIMValue value;
    value.SetReferencedClass(target);
    EXPECT_EQ(value.GetType(), TType::kReference);
    EXPECT_TRUE(value.IsNull());
    value.Set("A.k=1");
    EXPECT_EQ(value.GetReferencedClass(), target);
    TCIMValue changed = value;
    changed.SetReferencedClass(nullptr);
    EXPECT_EQ(value.GetReferencedClass(), target) << "a copy was changed";
    target.reset();
    owner.reset();
    EXPECT_FALSE(value.GetReferencedClass());
}

} // namespace
} // namespace NKOLVRX20
