// SPDX-License-Identifier: MIT
// Instances that are known by their tags: what is taken, what is left to the decoder, and that a packed instance is an
// instance like any other.
#include "pegasus/wire/instances/KnownInstances.h"

#include "pegasus/wire/ElementDecoder.h"

#include <gtest/gtest.h>

#include <thread>

#include <malloc.h>

using namespace Pegasus;
using Result = wire::XmlOffer::Result;

namespace {

const std::string kStart = "<VALUE.NAMEDINSTANCE>\n<INSTANCENAME CLASSNAME=\"T\">\n"
                           "<KEYBINDING NAME=\"Z\">\n<KEYVALUE VALUETYPE=\"string\">";
const std::string kSecondKey = "</KEYVALUE>\n</KEYBINDING><KEYBINDING NAME=\"A\"><KEYVALUE VALUETYPE=\"numeric\">";
const std::string kInstance = "</KEYVALUE></KEYBINDING>\n</INSTANCENAME>\n<INSTANCE CLASSNAME=\"T\" >\n";
const std::string kText = "<PROPERTY NAME=\"Text\" TYPE=\"string\"";
const std::string kNumber = "<PROPERTY NAME=\"Number\" CLASSORIGIN=\"B\" PROPAGATED=\"true\" TYPE=\"uint8\"";
const std::string kTime = "<PROPERTY NAME=\"Time\" TYPE=\"datetime\"";
const std::string kList = "<PROPERTY.ARRAY NAME=\"List\" TYPE=\"sint16\" ARRAYSIZE=\"3\"";
const std::string kEnd = "</INSTANCE>\n</VALUE.NAMEDINSTANCE>";

std::string value(const std::string& text)
{
    return ">\n<VALUE>" + text + "</VALUE>\n</PROPERTY>\n";
}

std::string element(const std::string& text, const std::string& number, const std::string& time,
                    const std::string& list)
{
    return kStart + "k&lt;" + kSecondKey + "12" + kInstance + kText + text + kNumber + number + kTime + time + kList +
           list + kEnd;
}

std::string elementWith(const std::string& text)
{
    return element(value(text), value("7"), "/>", "></PROPERTY.ARRAY>");
}

// The objects of an element as the decoder makes them.
CIMInstance decoded(const std::string& text, wire::KnownInstances* known = nullptr)
{
    wire::XmlDocument document;
    const wire::XmlElement root = document.parseFragment(text);
    const CIMInstance instance = wire::ElementDecoder().decodeNamedInstance(root);
    if (known != nullptr) {
        known->learn(root, instance);
    }
    return instance;
}

CIMInstance taken(const std::string& text)
{
    wire::KnownInstances known;
    decoded(text, &known);
    CIMInstance instance;
    EXPECT_EQ(known.take(text, instance).size, text.size());
    return instance;
}

struct Case
{
    const char* what;
    std::string text;
    Result result;
};

} // namespace

TEST(KnownInstances, AreTakenWhereTheirTagsAreEqualAndTheirValuesAreSound)
{
    const std::string null = ">\n</PROPERTY>\n";
    const std::string list = "><VALUE.ARRAY> <VALUE>-1</VALUE>\n<VALUE>0x7F</VALUE> </VALUE.ARRAY></PROPERTY.ARRAY>";
    const std::string time = value("20200102030405.678901+060");
    const Case cases[] = {
        {"other values", element(value(" b &amp; &#xE9; é\r\n "), value("255"), time, list), Result::kTaken},
        {"equal values", element(value("b"), value("7"), time, list), Result::kTaken},
        {"nulls", element(null, "/>", null, "/>"), Result::kTaken},
        {"empty values", element(value(""), null, value(""), "><VALUE.ARRAY></VALUE.ARRAY></PROPERTY.ARRAY>"),
         Result::kTaken},
        {"blanks elsewhere", element("> <VALUE>b</VALUE></PROPERTY>\t", null, null, "/>\n\n"), Result::kTaken},
        {"no property", kStart + "k" + kSecondKey + "1" + kInstance + kEnd, Result::kTaken},
        {"missing properties", kStart + "k" + kSecondKey + "1" + kInstance + kNumber + "/>" + kEnd, Result::kTaken},
        {"properties in another order",
         kStart + "k" + kSecondKey + "1" + kInstance + kNumber + "/>" + kText + "/>" + kEnd, Result::kRefused},
        {"a property twice", element("/>" + kText + "/>", "/>", "/>", "/>"), Result::kRefused},
        {"another tag", element(value("b"), value("7").insert(0, " A=\"\""), null, list), Result::kRefused},
        {"a CDATA section", elementWith("<![CDATA[b]]>"), Result::kRefused},
        {"a comment", elementWith("b<!-- c -->"), Result::kRefused},
        {"text beside a value", element(">b<VALUE>b</VALUE></PROPERTY>", null, null, list), Result::kRefused},
        {"two values", element("><VALUE>b</VALUE><VALUE>b</VALUE></PROPERTY>", null, null, list), Result::kRefused},
        {"an unknown reference", elementWith("&b;"), Result::kRefused},
        {"text that is not UTF-8", elementWith("\xC3("), Result::kRefused},
        {"a zero byte", elementWith(std::string("b\0b", 3)), Result::kRefused},
        {"a number too big", element(value("b"), value("256"), null, list), Result::kRefused},
        {"an empty number", element(value("b"), value(""), null, list), Result::kRefused},
        {"a bad datetime", element(value("b"), null, value("2020"), list), Result::kRefused},
        {"a null in an array", element(null, null, null, "><VALUE.ARRAY><VALUE.NULL/></VALUE.ARRAY></PROPERTY.ARRAY>"),
         Result::kRefused},
    };
    // What was learned first has values that others share, or lack.
    for (const std::string& first : {elementWith("a"), element(value("b"), value("7"), time, list)}) {
        wire::KnownInstances known;
        decoded(first, &known);
        for (const Case& row : cases) {
            CIMInstance instance;
            const wire::XmlOffer offer = known.take(row.text + "\n<more", instance);
            ASSERT_EQ(offer.result, row.result) << row.what;
            if (offer.result != Result::kTaken) {
                continue;
            }
            EXPECT_EQ(offer.size, row.text.size()) << row.what;
            EXPECT_TRUE(instance.identical(decoded(row.text))) << row.what;
            for (std::size_t size = 0; size < row.text.size(); ++size) {
                ASSERT_EQ(known.take(row.text.substr(0, size), instance).result, Result::kCut)
                    << row.what << " at " << size;
            }
        }
    }
}

// An element that is all there is cut for nobody: whoever waits for more of it may wait for ever.
TEST(KnownInstances, ALimitRefusesTheTextThatExceedsItAndNoOther)
{
    wire::XmlLimits limits;
    limits.maxTextBytes = 20;
    wire::KnownInstances known(limits);
    decoded(elementWith("a"), &known);
    CIMInstance instance;
    EXPECT_EQ(known.take(elementWith(std::string(20, 'b')), instance).result, Result::kTaken);
    EXPECT_EQ(known.take(elementWith(std::string(21, 'b')), instance).result, Result::kRefused);
}

// Whatever a pattern lacks would be dropped from the instances that it takes.
TEST(KnownInstances, OthersAreNotLearned)
{
    const std::string texts[] = {
        element("><QUALIFIER NAME=\"Q\" TYPE=\"boolean\"><VALUE>true</VALUE></QUALIFIER></PROPERTY>", "/>", "/>", "/>"),
        element(" EmbeddedObject=\"instance\"/>", "/>", "/>", "/>"),
        element("/><PROPERTY.REFERENCE NAME=\"R\"/>", "/>", "/>", "/>"),
        element("/><PROPERTY NAME=\"C\" TYPE=\"char16\"/>", "/>", "/>", "/>"),
        element(" A=\"" + std::string(20000, 'a') + "\"/>", "/>", "/>", "/>"),
        "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"T\"><KEYBINDING NAME=\"K\"><KEYVALUE/></KEYBINDING>"
        "</INSTANCENAME><INSTANCE CLASSNAME=\"T\"><PROPERTY NAME=\"P\" TYPE=\"string\"/></INSTANCE>"
        "</VALUE.NAMEDINSTANCE>",
        "<VALUE.NAMEDINSTANCE><INSTANCENAME CLASSNAME=\"T\"/><INSTANCE CLASSNAME=\"T\"/></VALUE.NAMEDINSTANCE>",
    };
    for (const std::string& text : texts) {
        wire::KnownInstances known;
        decoded(text, &known);
        CIMInstance instance;
        EXPECT_EQ(known.take(text, instance).result, Result::kRefused) << text;
    }
}

// Instances that have some of the properties of their class each.
TEST(KnownInstances, PropertiesOfSeveralInstancesAreKnownTogether)
{
    const std::string head = kStart + "k" + kSecondKey + "1" + kInstance;
    const std::string other = "<PROPERTY NAME=\"number\" TYPE=\"string\"/>";
    wire::KnownInstances known;
    decoded(head + kText + "/>" + kTime + "/>" + kEnd, &known);
    decoded(head + kText + "/>" + kNumber + "/>" + kTime + "/>" + kList + "/>" + kEnd, &known);
    CIMInstance instance;
    const std::string all = elementWith("b");
    ASSERT_EQ(known.take(all, instance).result, Result::kTaken);
    EXPECT_TRUE(instance.identical(decoded(all)));
    // A property with another tag makes a pattern of its own: both tags in one instance are two properties of a name.
    decoded(head + kText + "/>" + other + kEnd, &known);
    EXPECT_EQ(known.take(head + kText + "/>" + other + kEnd, instance).result, Result::kTaken);
    EXPECT_EQ(known.take(all, instance).result, Result::kTaken);
    EXPECT_EQ(known.take(head + kNumber + "/>" + other + kEnd, instance).result, Result::kRefused);
}

// A class after another one, and back; a long list of classes pushes out the oldest.
TEST(KnownInstances, SeveralClassesAreKnownAtOnce)
{
    wire::KnownInstances known;
    const auto ofClass = [](int number) {
        std::string text = elementWith("a");
        for (std::size_t at = 0; (at = text.find("\"T\"", at)) != std::string::npos; ++at) {
            text.replace(at, 3, "\"T" + std::to_string(number) + "\"");
        }
        return text;
    };
    for (int number = 0; number < 12; ++number) {
        decoded(ofClass(number), &known);
    }
    std::string results;
    for (const int number : {11, 5, 11, 5, 3, 0}) {
        CIMInstance instance;
        results += known.take(ofClass(number), instance).result == Result::kTaken ? 't' : 'r';
    }
    EXPECT_EQ(results, "ttttrr");
}

// What docs/limits.md promises of maxDecodedBytes. A sanitizer's allocator reports nothing, and the test passes.
TEST(KnownInstances, CountTheMemoryThatTheyHaveAndAFourthOfWhatTheyMayGet)
{
    const auto repeated = [](const std::string& text, int count) {
        std::string all;
        for (int i = 0; i < count; ++i) {
            all += text;
        }
        return all;
    };
    const auto properties = [](const std::string& type, const std::string& content) {
        std::string all;
        for (int i = 0; i < 50; ++i) {
            all += "<PROPERTY NAME=\"P" + std::to_string(i) + "\" TYPE=\"" + type + "\">" + content + "</PROPERTY>";
        }
        return all;
    };
    const auto array = [&](const std::string& type, const std::string& content) {
        return "<PROPERTY.ARRAY NAME=\"A\" TYPE=\"" + type + "\"><VALUE.ARRAY>" + repeated(content, 1000) +
               "</VALUE.ARRAY></PROPERTY.ARRAY>";
    };
    const std::string texts[] = {
        properties("string", ""),
        properties("string", "<VALUE></VALUE>"),
        properties("string", "<VALUE>a</VALUE>"),
        properties("string", "<VALUE>" + repeated("long ", 100) + "</VALUE>"),
        properties("boolean", "<VALUE>TRUE</VALUE>"),
        properties("datetime", "<VALUE>20200102030405.678901+060</VALUE>"),
        array("string", "<VALUE></VALUE>"),
        array("string", "<VALUE>a</VALUE>"),
        array("uint8", "<VALUE>1</VALUE>"),
        array("datetime", "<VALUE>20200102030405.678901+060</VALUE>"),
        array("datetime", "<VALUE></VALUE>"),
    };
    for (const std::string& text : texts) {
        const std::string whole = kStart + "k" + kSecondKey + "1" + kInstance + text + kEnd;
        wire::KnownInstances known;
        decoded(whole, &known);
        CIMInstance first;
        known.take(whole, first); // so that only the instances take memory below
        std::vector<CIMInstance> instances(20);
        const std::size_t before = ::mallinfo2().uordblks;
        for (CIMInstance& instance : instances) {
            ASSERT_EQ(known.take(whole, instance).result, Result::kTaken) << text;
        }
        const std::size_t counted = instances.size() * known.bytes();
        EXPECT_LE(::mallinfo2().uordblks - before, counted) << text;
        for (const CIMInstance& instance : instances) {
            static_cast<void>(instance.getPropertyCount());
        }
        EXPECT_LE(::mallinfo2().uordblks - before, 4 * counted) << text;
    }
}

// Handles share what they stand for, and a clone does not.
TEST(PackedInstance, IsChangedThroughItsHandlesAsAnyOther)
{
    wire::KnownInstances known;
    decoded(elementWith("a"), &known);
    CIMInstance instance;
    CIMInstance other; // shares the text
    known.take(elementWith("a"), instance);
    known.take(elementWith("a"), other);
    const CIMInstance same = instance;
    const CIMInstance copy = instance.clone();
    CIMProperty text = instance.getProperty(instance.findProperty("text"));
    text.setValue(CIMValue(String("b")));
    instance.removeProperty(instance.findProperty("Time"));
    instance.addProperty(CIMProperty("New", CIMValue(true)));
    EXPECT_EQ(same.getProperty(0).getValue(), CIMValue(String("b")));
    EXPECT_EQ(same.getPropertyCount(), 4u);
    EXPECT_TRUE(same.identical(instance));
    EXPECT_TRUE(copy.identical(decoded(elementWith("a"))));
    EXPECT_TRUE(other.identical(copy));
    known.take(elementWith("a"), other);
    EXPECT_TRUE(other.identical(copy)) << "the layout has changed with an instance of it";
    EXPECT_THROW(taken(elementWith("a")).setPath(CIMObjectPath("Other.A=1")), TypeMismatchException);
}

// Run under the thread sanitizer.
TEST(PackedInstance, MayBeReadByManyThreadsAtOnce)
{
    const CIMInstance expected = decoded(elementWith("a"));
    for (int round = 0; round < 20; ++round) {
        const CIMConstInstance instance = taken(elementWith("a"));
        std::vector<std::thread> threads;
        for (int i = 0; i < 4; ++i) {
            threads.emplace_back([&] {
                EXPECT_EQ(instance.getPath(), expected.getPath());
                EXPECT_TRUE(instance.identical(expected));
            });
        }
        for (std::thread& thread : threads) {
            thread.join();
        }
    }
}
