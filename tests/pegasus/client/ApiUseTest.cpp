// SPDX-License-Identifier: MIT
// The public classes as a user's program sees them: what is derived from what, values of every type, handles that are
// shared. ApiNames.cpp has every name.
#include <Pegasus/Client/CIMClient.h>

#include <gtest/gtest.h>

#include <sstream>
#include <type_traits>

PEGASUS_USING_PEGASUS;
PEGASUS_USING_STD;

PEGASUS_NAMESPACE_BEGIN
inline Uint32 inTheNamespace()
{
    return PEG_NOT_FOUND;
}
PEGASUS_NAMESPACE_END

namespace {

// ---- the exceptions and their one common root

template <typename T>
constexpr bool kIsDirectException = is_base_of_v<Exception, T> && !is_base_of_v<std::exception, T>;
static_assert(kIsDirectException<IndexOutOfBoundsException> && kIsDirectException<AlreadyExistsException> &&
              kIsDirectException<InvalidNameException> && kIsDirectException<InvalidNamespaceNameException> &&
              kIsDirectException<UninitializedObjectException> && kIsDirectException<TypeMismatchException> &&
              kIsDirectException<DynamicCastFailedException> && kIsDirectException<InvalidDateTimeFormatException> &&
              kIsDirectException<DateTimeOutOfRangeException> && kIsDirectException<MalformedObjectNameException> &&
              kIsDirectException<BindFailedException> && kIsDirectException<InvalidLocatorException> &&
              kIsDirectException<CannotCreateSocketException> && kIsDirectException<CannotConnectException> &&
              kIsDirectException<AlreadyConnectedException> && kIsDirectException<NotConnectedException> &&
              kIsDirectException<ConnectionTimeoutException> &&
              kIsDirectException<InvalidEnumerationContextException> && kIsDirectException<SSLException> &&
              kIsDirectException<CIMException> && kIsDirectException<CIMClientMalformedHTTPException> &&
              kIsDirectException<CIMClientHTTPErrorException> && kIsDirectException<CIMClientXmlException> &&
              kIsDirectException<CIMClientResponseException>);
static_assert(!is_copy_constructible_v<CIMClient> && !is_polymorphic_v<CIMClient>);
static_assert(!is_constructible_v<CIMClass, CIMConstClass> && is_constructible_v<CIMConstClass, CIMClass>);
static_assert(!is_convertible_v<CIMObject, CIMInstance> && is_constructible_v<CIMInstance, CIMObject>);

// ---- every kind of value there and back

template <typename T> void expectThereAndBack(const T& x)
{
    const CIMValue value(x);
    CIMValue again;
    again.set(x);
    T back{};
    again.get(back);
    EXPECT_EQ(CIMValue(back), value);
    Array<T> array(2, x);
    array.append(x);
    CIMValue arrayValue(array);
    Array<T> arrayBack;
    arrayValue.get(arrayBack);
    EXPECT_EQ(arrayBack.size(), 3u);
    EXPECT_EQ(CIMValue(arrayBack), arrayValue);
}

} // namespace

TEST(ApiUse, ValuesOfEveryType)
{
    expectThereAndBack(Boolean(true));
    expectThereAndBack(Uint8(1));
    expectThereAndBack(Sint8(-1));
    expectThereAndBack(Uint16(1));
    expectThereAndBack(Sint16(-1));
    expectThereAndBack(Uint32(1));
    expectThereAndBack(Sint32(-1));
    expectThereAndBack(Uint64(1));
    expectThereAndBack(Sint64(-1));
    expectThereAndBack(Real32(1));
    expectThereAndBack(Real64(1));
    expectThereAndBack(Char16('a'));
    expectThereAndBack(String("a"));
    expectThereAndBack(CIMDateTime("20200101000000.000000+000"));
    expectThereAndBack(CIMObjectPath("A.K=1"));
    expectThereAndBack(CIMInstance("A"));
    expectThereAndBack(CIMObject(CIMClass("A")));
}

TEST(ApiUse, ObjectsAreSharedByHandlesAndNotByClones)
{
    CIMClass cimClass("T_Fan", "CIM_Fan");
    CIMProperty property("P", CIMValue(Uint32(1)), 0, CIMName(), "CIM_Fan", true);
    property.addQualifier(CIMQualifier("Key", CIMValue(true), CIMFlavor::DEFAULTS));
    cimClass.addQualifier(CIMQualifier("Version", String("1")))
        .addProperty(property)
        .addMethod(CIMMethod("M", CIMTYPE_UINT32).addParameter(CIMParameter("a", CIMTYPE_STRING)));
    const CIMConstClass readOnly = cimClass;
    CIMClass copy = cimClass.clone();
    property.setName("Renamed");
    EXPECT_EQ(readOnly.getProperty(0).getName(), CIMName("Renamed"));
    EXPECT_EQ(copy.getProperty(0).getName(), CIMName("P"));
    EXPECT_FALSE(copy.identical(readOnly));

    const CIMInstance instance = cimClass.buildInstance(false, false, CIMPropertyList());
    EXPECT_EQ(instance.getPropertyCount(), 1u);
    EXPECT_EQ(CIMConstProperty(instance.getProperty(0)).getQualifierCount(), 0u);
    EXPECT_EQ(instance.buildPath(cimClass).toString(), String("T_Fan.Renamed=1"));
    copy.removeMethod(0);
    copy.removeProperty(0);
    copy.removeQualifier(0);
    EXPECT_TRUE(copy.identical(CIMClass("t_fan", "cim_fan")));
}

TEST(ApiUse, TextsAndArraysMayBeGivenTheirOwnParts)
{
    String text("abc");
    for (int i = 0; i < 4; ++i) {
        text.append(text.getChar16Data() + 1, text.size() - 1);
    }
    EXPECT_EQ(text.size(), 33u); // each time its size less one more
    text.append(text);
    EXPECT_EQ(text.subString(33), text.subString(0, 33));

    Array<String> array;
    array.append("a");
    array.append("b");
    for (int i = 0; i < 4; ++i) {
        array.append(array.getData(), array.size());
    }
    array.append(array[0]);
    array.appendArray(array);
    array.prepend(array[1]);
    EXPECT_EQ(array.size(), 67u);
    EXPECT_EQ(array[0], String("b"));
    EXPECT_EQ(array[33], String("a"));
    array.remove(1, 66);
    EXPECT_EQ(array.size(), 1u);
}

TEST(ApiUse, StreamsAndMacros)
{
    ostringstream out;
    out << String("é\xE5\x90\x8D") << Uint16(Char16('A'));
    EXPECT_EQ(out.str(), "é\xE5\x90\x8D"
                         "65");
    EXPECT_EQ(inTheNamespace(), Uint32(-1));
    EXPECT_EQ(PEGASUS_UINT64_LITERAL(1), Uint64(1));
    EXPECT_EQ(cimTypeToString(CIMTYPE_INSTANCE), PEGASUS_STD(string)("instance"));
}
