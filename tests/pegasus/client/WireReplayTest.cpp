// SPDX-License-Identifier: MIT
// Every recorded exchange once more: the recorded answer to the same call gives what the real client made of it, and
// our request is the one that it sent.
#include "tests/pegasus/client/WireCases.h"
#include "tests/support/PeerAnswers.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace {

using test::WireCase;

// Longer outputs were cut off when they were noted.
constexpr std::size_t kCutBytes = 650;
constexpr unsigned kTimeoutMs = 10000;
// For the peers that let a call time out.
constexpr unsigned kShortTimeoutMs = 300;

// A result of the real client that is a fault, and that this one's differs from.
struct Deviation
{
    const char* recorded; // a part of what the real client printed
    const char* answer;   // a part of the answer that it got
    const char* begins;   // what we give instead
    const char* reason;
};

constexpr char kXmlRefusal[] = "Invalid real number value";
constexpr char kReal[] = "refuses an infinity or a NaN, which the standard has";

// The first row that fits a case is its row.
constexpr Deviation kDeviations[] = {
    {"is not valid UTF-8 encoding", "CIMStatusCodeDescription: caf\xC3\xA9 x",
     "EXC Pegasus::CIMException code=1 msg=caf\xC3\xA9 x", "non-ASCII status text hides the status"},
    {"is not valid UTF-8 encoding", "CIMStatusCodeDescription: ", "EXC Pegasus::CIMException code=",
     "a status text in another encoding hides the status"},
    {"Malformed HTTP response message", "CIMStatusCodeDescription: caf\xE9",
     "EXC Pegasus::CIMException code=1 msg=caf\xC3\xA9", "non-ASCII status text hides the status"},
    {"ConnectionTimeoutException", "HTTP/1.1 401 ", "EXC Pegasus::CIMClientHTTPErrorException http=401",
     "waits for an answer that has come"},
    {kXmlRefusal, "inf</VALUE>", "1 instances", kReal},
    {kXmlRefusal, "INF</VALUE>", "1 instances", kReal},
    {kXmlRefusal, "nan</VALUE>", "1 instances", kReal},
    {kXmlRefusal, "NaN</VALUE>", "1 instances", kReal},
};

bool holds(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

const Deviation* deviationOf(const WireCase& wireCase)
{
    const auto* row = std::find_if(std::begin(kDeviations), std::end(kDeviations), [&wireCase](const Deviation& each) {
        return holds(wireCase.printed, each.recorded) && holds(wireCase.response, each.answer);
    });
    return row == std::end(kDeviations) ? nullptr : row;
}

// The recorded client timed out: its peer was silent, or slow.
bool isLate(const WireCase& wireCase)
{
    return holds(wireCase.printed, "ConnectionTimeoutException") && !deviationOf(wireCase);
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
    if (const Deviation* deviation = deviationOf(wireCase)) {
        EXPECT_EQ(result.rfind(deviation->begins, 0), 0u) << result << "\nthe real client " << deviation->reason;
        return;
    }
    const std::string expected = comparable(withoutTiming(wireCase.printed));
    const std::string actual = comparable(onOneLine(result));
    // Of many instances only their number was noted.
    const bool isNumber =
        expected.size() < 20 && expected.find("instances") == expected.find_first_not_of("0123456789");
    const bool isWhole = wireCase.printed.size() < kCutBytes && !isNumber;
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
    const std::string recordedId = "MESSAGE ID=\"" + wireCase.request.messageId() + "\"";
    const std::string id = "MESSAGE ID=\"" + request.messageId() + "\"";
    std::string bytes = wireCase.response;
    test::PeerAnswer answer;
    if (const std::size_t at = bytes.find(recordedId); at != std::string::npos) {
        bytes.replace(at, recordedId.size(), id);
    } else if (holds(bytes, "transfer-encoding: chunked")) { // small chunks may cut the id in two
        const std::size_t size = std::stoul(bytes.substr(bytes.find("\r\n\r\n") + 4), nullptr, 16);
        std::string whole = unchunked(bytes);
        const std::size_t place = whole.find(recordedId);
        if (place != std::string::npos) {
            bytes = test::chunkedAnswer(whole.replace(place, recordedId.size(), id), size).bytes;
        }
    }
    answer.bytes = bytes;
    answer.closesAfterwards = !holds(wireCase.note, "connection kept open");
    answer.neverAnswers = bytes.empty() && isLate(wireCase);
    return isLate(wireCase) && !bytes.empty() ? test::inPieces(answer, 1, std::chrono::milliseconds(20)) : answer;
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
    std::size_t deviations = 0;
    std::vector<std::string> unsupported;
    for (const WireCase& wireCase : cases) {
        SCOPED_TRACE(wireCase.name);
        test::ScriptedPeer peer([&](const test::PeerRequest& request) { return recordedAnswer(wireCase, request); });
        const std::string result =
            test::replayCall(wireCase, peer.port(), isLate(wireCase) ? kShortTimeoutMs : kTimeoutMs);
        if (result == "unsupported") {
            unsupported.push_back(wireCase.name + ": " + wireCase.request.method());
            continue;
        }
        ++replayed;
        deviations += deviationOf(wireCase) ? 1 : 0;
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
        passed, replayed, deviations, unsupported.size());
    for (const std::string& each : unsupported) {
        std::printf("the client has no operation for %s\n", each.c_str());
    }
    EXPECT_GT(replayed, unsupported.size()) << "most cases are not client calls";
}
