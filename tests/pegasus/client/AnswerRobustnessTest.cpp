// SPDX-License-Identifier: MIT
// Each answer split at every byte, cut at every length, and with every byte changed: it is read the same way, or
// refused, and never taken for another success.
#include "tests/pegasus/client/AnswerReplay.h"
#include "tests/pegasus/client/WireCases.h"

#include <gtest/gtest.h>

#include <ctime>

#include <malloc.h>

namespace {

using test::AnswerCase;
using test::readAnswer;

// What all trials with one answer may read together: the work would grow with the square of the size.
constexpr std::size_t kMaxReadBytes = 2 << 20;

// The bytes of an answer that are tried: each of them, or so many as the limit allows, spread evenly.
std::vector<std::size_t> placesIn(const AnswerCase& answer)
{
    const std::size_t size = std::max<std::size_t>(answer.bytes.size(), 1);
    const std::size_t step = size * size / kMaxReadBytes + 1;
    std::vector<std::size_t> places;
    for (std::size_t at = 0; at < answer.bytes.size(); at += step) {
        places.push_back(at);
    }
    return places;
}

std::vector<std::size_t> everyByteOf(const AnswerCase& answer)
{
    std::vector<std::size_t> cuts;
    for (std::size_t at = 1; at < answer.bytes.size(); ++at) {
        cuts.push_back(at);
    }
    return cuts;
}

std::vector<AnswerCase> allAnswers()
{
    std::vector<AnswerCase> cases = test::sampleAnswers();
    for (const test::WireCase& wireCase : test::loadWireCases()) {
        const std::string id = wireCase.request.messageId();
        if (!wireCase.response.empty()) {
            cases.push_back({wireCase.name, id, wireCase.request.method(),
                             wireCase.request.body.find("<IMETHODCALL") != std::string::npos, wireCase.response});
        }
    }
    return cases;
}

bool isRefused(const std::string& result)
{
    return result == "incomplete" || result.rfind("EXC ", 0) == 0;
}

} // namespace

TEST(AnswerRobustness, SamplesAreReadAtAll)
{
    for (const AnswerCase& answer : test::sampleAnswers()) {
        EXPECT_FALSE(isRefused(readAnswer(answer))) << answer.name << ": " << readAnswer(answer);
    }
}

TEST(AnswerRobustness, AnswerSplitAnywhereIsReadTheSame)
{
    std::size_t splits = 0;
    for (const AnswerCase& answer : allAnswers()) {
        const std::string whole = readAnswer(answer);
        for (const std::size_t cut : placesIn(answer)) {
            // The same error may name another place.
            const std::string result = readAnswer(answer, {cut});
            ASSERT_TRUE(result == whole || (isRefused(whole) && isRefused(result)))
                << answer.name << " split at " << cut << ": " << result;
            ++splits;
        }
        const std::string byByte = readAnswer(answer, everyByteOf(answer));
        EXPECT_TRUE(byByte == whole || (isRefused(whole) && isRefused(byByte))) << answer.name << ": " << byByte;
    }
    std::printf("counted: %zu answers, split at %zu places\n", allAnswers().size(), splits);
}

TEST(AnswerRobustness, AnswerCutShortIsRefused)
{
    for (AnswerCase answer : allAnswers()) {
        const std::string bytes = answer.bytes;
        // Where the length is missing, the end of the connection ends the body; blanks at its end may be missing.
        const std::size_t needed = bytes.find_last_not_of(" \r\n") + 1;
        for (const std::size_t size : placesIn(answer)) {
            if (size >= needed) {
                break;
            }
            answer.bytes = bytes.substr(0, size);
            ASSERT_TRUE(isRefused(readAnswer(answer))) << answer.name << " cut at " << size;
        }
    }
}

TEST(AnswerRobustness, ChangedMarkupIsRefusedOrMeansTheSame)
{
    std::size_t changes = 0;
    for (AnswerCase answer : allAnswers()) {
        const std::string bytes = answer.bytes;
        const std::string whole = readAnswer(answer);
        // Another wrong byte may make good what was wrong.
        const std::vector<bool> isMarkup =
            isRefused(whole) ? std::vector<bool>(bytes.size(), false) : test::markupBytes(bytes);
        for (const std::size_t at : placesIn(answer)) {
            for (const int flip : {0x01, 0x20, 0x80}) {
                answer.bytes = bytes;
                answer.bytes[at] = static_cast<char>(answer.bytes[at] ^ flip);
                const std::string result = readAnswer(answer); // must end, whatever the byte
                ASSERT_EQ(result, readAnswer(answer, {}, {}, test::Decoding::kElements))
                    << answer.name << " byte " << at << " ^ " << flip;
                ASSERT_TRUE(!isMarkup[at] || isRefused(result) || result == whole)
                    << answer.name << " byte " << at << " ^ " << flip << ":\n"
                    << result;
                ++changes;
            }
        }
    }
    std::printf("counted: %zu changed bytes in answers\n", changes);
}

namespace {

struct LimitCase
{
    const char* name;
    void (*lower)(Pegasus::client::ClientLimits&);
    const char* answer;
    const char* complaint;
};

const LimitCase kLimits[] = {
    {"header bytes", [](auto& l) { l.http.maxHeaderBytes = 64; }, "class", "a header of more than 64 bytes"},
    {"body bytes", [](auto& l) { l.http.maxBodyBytes = 100; }, "class", "a body of more than 100 bytes"},
    {"body bytes in chunks", [](auto& l) { l.http.maxBodyBytes = 100; }, "instances in chunks",
     "a body of more than 100 bytes"},
    {"depth", [](auto& l) { l.xml.maxDepth = 7; }, "instances", "nested more than 7 deep"},
    {"depth of the envelope", [](auto& l) { l.xml.maxDepth = 3; }, "class", "nested more than 3 deep"},
    {"attributes", [](auto& l) { l.xml.maxAttributes = 2; }, "class", "more than 2 attributes"},
    {"tag bytes", [](auto& l) { l.xml.maxTagBytes = 40; }, "class", "a tag of more than 40 bytes"},
    {"text", [](auto& l) { l.xml.maxTextBytes = 8; }, "class", "text of more than 8 bytes"},
    {"element bytes", [](auto& l) { l.xml.maxElementBytes = 300; }, "instances", "an element of more than 300 bytes"},
    {"elements", [](auto& l) { l.xml.maxElements = 5; }, "class", "more than 5 elements in one"},
    {"array elements", [](auto& l) { l.xml.maxArrayElements = 1; }, "instances", "an array of more than 1 elements"},
    {"properties", [](auto& l) { l.xml.maxMembers = 2; }, "class", "more than 2 members of one owner"},
    {"qualifiers", [](auto& l) { l.xml.maxMembers = 0; }, "class", "more than 0 members of one owner"},
    {"decoded bytes", [](auto& l) { l.xml.maxDecodedBytes = 3000; }, "instances",
     "objects of more than 3000 bytes in one answer (maxDecodedBytes)"},
    {"decoded bytes of one object", [](auto& l) { l.xml.maxDecodedBytes = 300; }, "class",
     "objects of more than 300 bytes in one answer (maxDecodedBytes)"},
    {"decoded bytes of an error", [](auto& l) { l.xml.maxDecodedBytes = 100; }, "error element",
     "objects of more than 100 bytes in one answer (maxDecodedBytes)"},
    {"key bindings", [](auto& l) { l.xml.maxKeyBindings = 1; }, "instances", "more than 1 key bindings"},
    {"embedded objects", [](auto& l) { l.xml.maxEmbedding = 0; }, "instances", "embedded more than 0 deep"},
};

} // namespace

TEST(AnswerLimits, EachLimitHasAnErrorOfItsOwn)
{
    for (const LimitCase& limit : kLimits) {
        Pegasus::client::ClientLimits limits;
        limit.lower(limits);
        bool found = false;
        for (const AnswerCase& answer : test::sampleAnswers()) {
            if (answer.name != limit.answer) {
                continue;
            }
            found = true;
            EXPECT_NE(readAnswer(answer, {}, limits).find(limit.complaint), std::string::npos)
                << limit.name << ": " << readAnswer(answer, {}, limits);
            const std::string byByte = readAnswer(answer, everyByteOf(answer), limits);
            EXPECT_NE(byByte.find(limit.complaint), std::string::npos) << limit.name << ": " << byByte;
        }
        EXPECT_TRUE(found) << limit.name;
    }
}

TEST(AnswerLimits, PassedDeadlineEndsTheDecodingBeforeTheNextElement)
{
    const Pegasus::client::ExpectedResponse expected{"1", "EnumerateClassNames"};
    Pegasus::wire::ElementDecoder decoder;
    std::size_t count = 0;
    Pegasus::client::ResponseReader reader(
        expected, decoder, [&](const auto&, auto&) { ++count; },
        Pegasus::base::Deadline::after(std::chrono::milliseconds(0)));
    EXPECT_THROW(reader.feed("<?xml version=\"1.0\"?><CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\"><MESSAGE ID=\"1\" "
                             "PROTOCOLVERSION=\"1.0\"><SIMPLERSP><IMETHODRESPONSE NAME=\"EnumerateClassNames\">"
                             "<IRETURNVALUE><CLASSNAME NAME=\"A\"/></IRETURNVALUE>"),
                 Pegasus::ConnectionTimeoutException);
    EXPECT_EQ(count, 0u);
}

namespace {

// Returns: the message of the error; else the seconds that it took to decode so many members and the last one.
std::string decodeMembers(std::size_t count, const std::string& last, double& seconds)
{
    std::string text = "<INSTANCE CLASSNAME=\"A\">";
    for (std::size_t i = 0; i < count; ++i) {
        text += "<PROPERTY NAME=\"P" + std::to_string(i) + "\" TYPE=\"string\"/>";
    }
    text += last + "</INSTANCE>";
    Pegasus::wire::XmlDocument document;
    const std::clock_t start = std::clock();
    try {
        Pegasus::wire::ElementDecoder().decodeInstance(document.parseFragment(text));
    } catch (const Pegasus::wire::XmlError& error) {
        return std::string(error.getMessage().getCString());
    }
    seconds += double(std::clock() - start) / CLOCKS_PER_SEC;
    return "";
}

} // namespace

// 50,000 members took 25 s when each was compared with all before it.
TEST(AnswerLimits, TimeGrowsWithTheNumberOfMembersAndNotWithItsSquare)
{
    const std::size_t limit = Pegasus::wire::XmlLimits().maxMembers;
    double atLimit = 0;
    double inEighths = 0;
    EXPECT_EQ(decodeMembers(limit, "", atLimit), "");
    for (int i = 0; i < 8; ++i) {
        EXPECT_EQ(decodeMembers(limit / 8, "", inEighths), "");
    }
    EXPECT_LT(atLimit, 4 * inEighths + 0.01);
    EXPECT_NE(decodeMembers(limit, "<PROPERTY NAME=\"Q\" TYPE=\"string\"/>", atLimit).find("more than 16384 members"),
              std::string::npos);
    EXPECT_NE(decodeMembers(limit / 2, "<PROPERTY NAME=\"p9\" TYPE=\"string\"/>", atLimit).find("named \"p9\""),
              std::string::npos);
}

namespace {

// Returns: the bytes that a list of such objects takes for 100 that were counted. A sanitizer's allocator reports 0.
template <typename T>
std::size_t memoryInPercent(T (Pegasus::wire::ElementDecoder::*decode)(const Pegasus::wire::XmlElement&),
                            const std::string& start, const std::string& end)
{
    constexpr int kObjects = 4096; // a power of two: the list has no room to spare
    Pegasus::wire::ElementDecoder decoder;
    Pegasus::wire::XmlDocument document;
    const auto decoded = [&](int number) {
        const std::string text = start + std::to_string(100000 + number) + end;
        return (decoder.*decode)(document.parseFragment(text));
    };
    for (int i = 0; i < 2 * kObjects; ++i) {
        decoded(i); // then the decoder has the memory that it keeps
    }
    const std::size_t countedBefore = decoder.decodedBytes();
    const std::size_t before = ::mallinfo2().uordblks;
    Pegasus::Array<T> objects;
    for (int i = 0; i < kObjects; ++i) {
        objects.append(decoded(i));
    }
    return (::mallinfo2().uordblks - before) * 100 / (decoder.decodedBytes() - countedBefore);
}

} // namespace

// Lists of small objects of each kind, every one with a name or a value of its own.
TEST(AnswerLimits, ObjectsTakeNoMoreMemoryThanWasCounted)
{
    using Decoder = Pegasus::wire::ElementDecoder;
    const std::string path = "<INSTANCENAME CLASSNAME=\"I\"><KEYBINDING NAME=\"";
    const std::string pathEnd = "</KEYBINDING></INSTANCENAME>";
    const std::string reference = "<VALUE.REFERENCE><CLASSNAME NAME=\"N";
    const std::string referenceEnd = "\"/></VALUE.REFERENCE>";
    const std::string output = "<PARAMVALUE NAME=\"A\" PARAMTYPE=\"";
    const std::pair<const char*, std::size_t> rows[] = {
        {"class names", memoryInPercent(&Decoder::decodeClassName, "<CLASSNAME NAME=\"N", "\"/>")},
        {"classes", memoryInPercent(&Decoder::decodeClass, "<CLASS NAME=\"N", "\"/>")},
        {"properties", memoryInPercent(&Decoder::decodeClass, "<CLASS NAME=\"C\"><PROPERTY.ARRAY NAME=\"N",
                                       "\" TYPE=\"uint8\"/></CLASS>")},
        {"methods", memoryInPercent(&Decoder::decodeClass, "<CLASS NAME=\"C\"><METHOD NAME=\"N",
                                    "\" TYPE=\"uint8\"><PARAMETER NAME=\"A\" TYPE=\"uint8\"/></METHOD></CLASS>")},
        {"instances", memoryInPercent(&Decoder::decodeInstance, "<INSTANCE CLASSNAME=\"N", "\"/>")},
        {"paths", memoryInPercent(&Decoder::decodeInstanceName, path + "N", "\"><KEYVALUE/>" + pathEnd)},
        {"references as keys",
         memoryInPercent(&Decoder::decodeInstanceName, path + "K\">" + reference, referenceEnd + pathEnd)},
        {"qualifier declarations",
         memoryInPercent(&Decoder::decodeQualifierDeclaration,
                         "<QUALIFIER.DECLARATION ISARRAY=\"true\" TYPE=\"uint8\" NAME=\"N", "\"/>")},
        {"outputs", memoryInPercent(&Decoder::decodeParamValue, "<PARAMVALUE NAME=\"N", "\"/>")},
        {"references", memoryInPercent(&Decoder::decodeParamValue, output + "reference\">" + reference,
                                       referenceEnd + "</PARAMVALUE>")},
        {"datetimes", memoryInPercent(&Decoder::decodeParamValue, output + "datetime\"><VALUE>20200101000000.",
                                      "+000</VALUE></PARAMVALUE>")},
        {"arrays", memoryInPercent(&Decoder::decodeParamValue, output + "string\"><VALUE.ARRAY><VALUE>",
                                   "</VALUE></VALUE.ARRAY></PARAMVALUE>")},
    };
    for (const auto& [kind, percent] : rows) {
        EXPECT_LE(percent, 100u) << kind;
    }
}
