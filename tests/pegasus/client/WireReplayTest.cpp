// Every recorded exchange once more: the recorded answer to the same call gives what the real client made of it, and
// our request is the one that it sent.
#include "tests/pegasus/client/WireCases.h"
#include "tests/support/PeerAnswers.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>

namespace {

using test::WireCase;

// Longer outputs were cut off when they were noted.
constexpr std::size_t kCutBytes = 650;
constexpr unsigned kTimeoutMs = 10000;
// For the peers that let a call time out.
constexpr unsigned kShortTimeoutMs = 300;

struct Deviation
{
    const char* begins; // what we give instead
    const char* reason;
};

// Where the real client's result is a fault and this one's differs.
const std::map<std::string, Deviation>& deviations()
{
    static const std::map<std::string, Deviation> table = {
        {"enuminst-deep-base",
         {"EXC Pegasus::CIMException code=1", "a status text in another encoding hides the status"}},
        {"fault-trailer-utf8",
         {"EXC Pegasus::CIMException code=1 msg=caf\xC3\xA9 x", "non-ASCII status text hides the status"}},
        {"fault-trailer-raw8bit",
         {"EXC Pegasus::CIMException code=1 msg=caf\xC3\xA9", "non-ASCII status text hides the status"}},
        {"fault-401", {"EXC Pegasus::CIMClientHTTPErrorException http=401", "waits for an answer that has come"}},
        {"fault-p-real-inf", {"1 instances", "refuses an infinity, which the standard has"}},
        {"fault-p-real-nan", {"1 instances", "refuses a NaN, which the standard has"}},
        {"fault-p-real-nan2", {"1 instances", "refuses a NaN, which the standard has"}},
    };
    return table;
}

std::string withoutTiming(std::string printed)
{
    const std::size_t after = printed.rfind(" after ");
    if (after != std::string::npos && printed.find_first_not_of("0123456789.s\n", after + 7) == std::string::npos) {
        printed.erase(after);
    }
    while (!printed.empty() && (printed.back() == ' ' || printed.back() == '\n')) {
        printed.pop_back();
    }
    return printed;
}

std::string onOneLine(const std::string& result)
{
    std::string out;
    for (const char c : result) {
        out += c == '\n' ? std::string(" | ") : std::string(1, c);
    }
    return withoutTiming(out);
}

// Blanks are ignored: the notes have runs of them folded in places.
std::string withoutBlanks(std::string text)
{
    text.erase(std::remove_if(text.begin(), text.end(), [](char c) { return c == ' ' || c == '|' || c == '\n'; }),
               text.end());
    return text;
}

// The wording of complaints about XML is our own; the class is the real client's.
std::string comparable(const std::string& text)
{
    const std::string xmlException = "EXC Pegasus::CIMClientXmlException";
    return withoutBlanks(text.rfind(xmlException, 0) == 0 ? xmlException : text);
}

void expectPrinted(const WireCase& wireCase, const std::string& result)
{
    const auto deviation = deviations().find(wireCase.name);
    if (deviation != deviations().end()) {
        EXPECT_EQ(result.rfind(deviation->second.begins, 0), 0u) << result;
        return;
    }
    const std::string expected = comparable(withoutTiming(wireCase.printed));
    const std::string actual = comparable(onOneLine(result));
    // Of a thousand instances only their number was noted.
    const bool isWhole = wireCase.printed.size() < kCutBytes && wireCase.name != "enuminst-bulk1000";
    if (isWhole) {
        EXPECT_EQ(actual, expected);
    } else {
        EXPECT_EQ(actual.substr(0, expected.size()), expected);
    }
}

// Only for this file's own recordings: sizes and chunks are well formed.
std::string unchunked(const std::string& response)
{
    std::string body;
    std::size_t at = response.find("\r\n\r\n") + 4;
    for (std::size_t size = 1; size > 0 && at < response.size();) {
        size = std::stoul(response.substr(at), nullptr, 16);
        at = response.find("\r\n", at) + 2;
        body += response.substr(at, size);
        at += size + 2;
    }
    return body;
}

// The recorded answer with the id of the request that it answers now.
test::PeerAnswer recordedAnswer(const WireCase& wireCase, const test::PeerRequest& request)
{
    test::PeerAnswer answer;
    answer.bytes = wireCase.response;
    if (wireCase.name == "fault-chunk-many") // its chunks cut the id in two
    {
        answer = test::chunkedAnswer(unchunked(wireCase.response), 1 << 20);
    }
    const std::string recordedId = "MESSAGE ID=\"" + wireCase.request.messageId() + "\"";
    const std::size_t id = answer.bytes.find(recordedId);
    if (id != std::string::npos) {
        answer.bytes.replace(id, recordedId.size(), "MESSAGE ID=\"" + request.messageId() + "\"");
    }
    if (wireCase.name == "fault-chunk-many") {
        answer = test::chunkedAnswer(unchunked(answer.bytes), 7);
    }
    answer.closesAfterwards = true;
    answer.neverAnswers = answer.bytes.empty() && wireCase.name == "fault-silent";
    if (wireCase.name == "fault-drip") {
        answer = test::inPieces(answer, 1, std::chrono::milliseconds(20));
    }
    if (wireCase.name == "fault-400-nolength-hold") {
        answer.closesAfterwards = false;
    }
    return answer;
}

std::string withoutId(const test::PeerRequest& request)
{
    std::string body = request.body;
    const std::string id = "MESSAGE ID=\"" + request.messageId() + "\"";
    return body.replace(body.find(id), id.size(), "MESSAGE ID=\"\"");
}

void expectSameRequest(const test::PeerRequest& sent, const test::PeerRequest& recorded)
{
    for (const char* field : {"CIMOperation", "CIMMethod", "CIMObject", "Content-Type", "TE"}) {
        EXPECT_EQ(sent.header(field), recorded.header(field));
    }
    EXPECT_EQ(test::canonicalXml(withoutId(sent)), test::canonicalXml(withoutId(recorded)));
}

int failureCount()
{
    return testing::UnitTest::GetInstance()->current_test_info()->result()->total_part_count();
}

std::string withRecordedId(const std::string& result, const WireCase& wireCase,
                           const std::vector<test::PeerRequest>& requests)
{
    // "Mismatched response message ID: ... expected "1000"" names the id of now.
    std::string out = result;
    const std::string now = "expected \"" + (requests.empty() ? "" : requests.front().messageId()) + "\"";
    const std::size_t at = out.find(now);
    return at == std::string::npos ? out
                                   : out.replace(at, now.size(), "expected \"" + wireCase.request.messageId() + "\"");
}

} // namespace

TEST(WireReplay, EveryRecordedExchangeGivesTheRecordedResult)
{
    const std::vector<WireCase> cases = test::loadWireCases();
    if (cases.empty()) {
        GTEST_SKIP() << "no recorded exchanges: configure with -DVRX_VECTORS_DIR=<folder>";
    }
    std::size_t passed = 0;
    std::size_t replayed = 0;
    std::size_t unsupported = 0;
    for (const WireCase& wireCase : cases) {
        SCOPED_TRACE(wireCase.name);
        test::ScriptedPeer peer([&](const test::PeerRequest& request) { return recordedAnswer(wireCase, request); });
        const bool isLate = wireCase.name == "fault-silent" || wireCase.name == "fault-drip";
        const std::string result = test::replayCall(wireCase, peer.port(), isLate ? kShortTimeoutMs : kTimeoutMs);
        if (result == "unsupported") {
            ++unsupported;
            continue;
        }
        ++replayed;
        const int failuresBefore = failureCount();
        const std::vector<test::PeerRequest> requests = peer.requests();
        ASSERT_FALSE(requests.empty()) << result;
        expectSameRequest(requests.front(), wireCase.request);
        if (!wireCase.printed.empty()) {
            expectPrinted(wireCase, withRecordedId(result, wireCase, requests));
        }
        passed += failureCount() == failuresBefore ? 1 : 0;
    }
    std::printf(
        "counted: %zu of %zu recorded exchanges give the same objects or exception and the same request (%zu of "
        "them a listed better one); %zu are of operations that the client does not have\n",
        passed, replayed, deviations().size(), unsupported);
}
