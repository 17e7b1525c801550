// SPDX-License-Identifier: MIT
// The client library against a peer in this process that serves a prepared answer from memory.
//
//   client_bench [--quick | --calls]
//
// Prints, for EnumerateInstances answers of growing size: the rate by the client thread's CPU time and by the clock,
// both also as a ratio to a bare expat pass with empty handlers over the same bytes in the same run, and the growth of
// the process's memory. Then what decoding during arrival saves, and GetClass calls on one connection. --quick leaves
// out the biggest answer, --calls all but the calls.
#include "pegasus/client/InstanceReader.h"
#include "pegasus/client/Request.h"
#include "pegasus/client/ResponseReader.h"
#include "pegasus/client/ServerConnection.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/HttpAnswerReader.h"
#include "tests/support/PeerAnswers.h"

#include <Pegasus/Client/CIMClient.h>

#include <expat.h>
#include <pugixml.hpp>

#include <chrono>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <fstream>
#include <string>

#include <malloc.h>

using namespace Pegasus;

namespace {

constexpr const char* kNameSpace = "root/cimv2";
constexpr int kRuns = 5;

double threadCpuSeconds()
{
    timespec now{};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return double(now.tv_sec) + double(now.tv_nsec) * 1e-9;
}

double wallSeconds()
{
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch()).count();
}

// The least of several runs: what the work costs when nothing disturbs it.
struct TCost
{
    double cpu = 1e300;
    double wall = 1e300;

    template <typename Work> void measure(Work&& work)
    {
        const double cpuStart = threadCpuSeconds();
        const double wallStart = wallSeconds();
        work();
        cpu = std::min(cpu, threadCpuSeconds() - cpuStart);
        wall = std::min(wall, wallSeconds() - wallStart);
    }
};

// In kilobytes.
long statusField(const char* name)
{
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(name, 0) == 0) {
            return std::strtol(line.c_str() + std::strlen(name) + 1, nullptr, 10);
        }
    }
    return 0;
}

void resetPeak()
{
    std::ofstream("/proc/self/clear_refs") << 5;
}

// Twelve properties and 1.2 KB of XML, as an inventory provider's instances have.
CIMInstance makeInstance(unsigned index)
{
    const std::string id = "device-" + std::to_string(1000000 + index);
    CIMInstance instance("Bench_Device");
    instance.addProperty(CIMProperty("DeviceID", String(id.c_str())));
    instance.addProperty(CIMProperty("Caption", String("Bench device in slot 17 of rack 4")));
    instance.addProperty(CIMProperty("Vendor", String("Example Vendor Corporation")));
    instance.addProperty(CIMProperty("Model", String("Model X-1000 & Y")));
    instance.addProperty(CIMProperty("Serial", CIMValue(Uint64(index) * 1000003)));
    instance.addProperty(CIMProperty("Index", CIMValue(Uint32(index))));
    instance.addProperty(CIMProperty("Enabled", CIMValue(index % 2 == 0)));
    instance.addProperty(CIMProperty("Health", CIMValue(Uint16(5))));
    instance.addProperty(CIMProperty("Temperature", CIMValue(Real64(36.6))));
    instance.addProperty(CIMProperty("Installed", CIMDateTime("20200102030405.678901+060")));
    instance.addProperty(CIMProperty("Status", CIMValue(CIMTYPE_STRING, false)));
    Array<Uint16> states;
    states.append(2);
    states.append(5);
    instance.addProperty(CIMProperty("OperationalStatus", states));
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding("DeviceID", String(id.c_str()), CIMKeyBinding::STRING));
    instance.setPath(CIMObjectPath(String(), CIMNamespaceName(), "Bench_Device", keys));
    return instance;
}

CIMClass makeClass()
{
    CIMClass cimClass("Bench_Class", "CIM_LogicalDevice");
    for (unsigned i = 0; i < 33; ++i) {
        CIMProperty property(("Property" + std::to_string(i)).c_str(), CIMValue(CIMTYPE_STRING, false));
        property.addQualifier(CIMQualifier("MaxLen", CIMValue(Uint32(64)), CIMFlavor::DEFAULTS));
        cimClass.addProperty(property);
    }
    return cimClass;
}

test::PeerRequest requestFor(const std::string& method)
{
    test::PeerRequest request;
    request.head = "POST /cimom HTTP/1.1\r\nCIMMethod: " + method + "\r\n";
    request.body = "<MESSAGE ID=\"0000\"";
    return request;
}

std::string instancesBody(unsigned count)
{
    std::string content;
    for (unsigned i = 0; i < count; ++i) {
        wire::appendNamedInstance(content, makeInstance(i));
    }
    return test::intrinsicBody(requestFor("EnumerateInstances"), content);
}

std::string classBody()
{
    std::string content;
    wire::appendClass(content, makeClass());
    return test::intrinsicBody(requestFor("GetClass"), content);
}

// How an answer is sent.
struct TSending
{
    std::size_t chunkBytes = 0; // 0: with a length
    std::size_t pieceBytes = 0; // so many in one send; 0: all at once
    std::chrono::milliseconds pause{0};
};

// The answer to whatever is asked: prepared once, with the id of the request put in.
class TPreparedAnswer
{
  public:
    TPreparedAnswer(const std::string& body, const TSending& sending = TSending())
        : fAnswer(sending.chunkBytes ? test::chunkedAnswer(body, sending.chunkBytes) : test::httpAnswer(body)),
          fSending(sending), fIdAt(fAnswer.bytes.find("0000"))
    {
    }

    test::PeerAnswer answer(const test::PeerRequest& request)
    {
        // Ids have four digits for the first 9000 calls of a process.
        fAnswer.bytes.replace(fIdAt, 4, request.messageId());
        test::PeerAnswer answer;
        answer.prepared = &fAnswer.bytes;
        answer.pieceBytes = fSending.pieceBytes;
        answer.pauseBetweenPieces = fSending.pause;
        return answer;
    }

  private:
    test::PeerAnswer fAnswer;
    TSending fSending;
    std::size_t fIdAt;
};

void XMLCALL onStart(void*, const XML_Char*, const XML_Char**) {}
void XMLCALL onEnd(void*, const XML_Char*) {}
void XMLCALL onText(void*, const XML_Char*, int) {}

TCost bareExpat(const std::string& xml)
{
    TCost cost;
    for (int run = 0; run < kRuns; ++run) {
        cost.measure([&] {
            XML_Parser parser = XML_ParserCreate(nullptr);
            XML_SetElementHandler(parser, onStart, onEnd);
            XML_SetCharacterDataHandler(parser, onText);
            constexpr std::size_t kPiece = 64UL * 1024;
            for (std::size_t at = 0; at < xml.size(); at += kPiece) {
                const std::size_t size = std::min(kPiece, xml.size() - at);
                XML_Parse(parser, xml.data() + at, static_cast<int>(size), at + size == xml.size());
            }
            XML_ParserFree(parser);
        });
    }
    return cost;
}

// The other parser, the whole text in place: what choosing it is based on.
TCost barePugixml(const std::string& xml)
{
    TCost cost;
    for (int run = 0; run < kRuns; ++run) {
        std::string copy = xml;
        cost.measure([&] {
            pugi::xml_document document;
            document.load_buffer_inplace(copy.data(), copy.size(), pugi::parse_cdata | pugi::parse_embed_pcdata);
        });
    }
    return cost;
}

void benchInstances(unsigned count, const char* how, const TSending& sending = TSending())
{
    std::string body = instancesBody(count);
    const double bytes = double(body.size());
    const double megabytes = bytes / 1e6;
    TPreparedAnswer prepared(body, sending);
    const TCost expat = bareExpat(body);
    const TCost pugixml = barePugixml(body);
    body = std::string();

    test::ScriptedPeer peer([&](const test::PeerRequest& request) { return prepared.answer(request); });
    CIMClient client;
    client.setTimeout(600000);
    client.connect("127.0.0.1", peer.port(), String(), String());
    TCost cost;
    long growth = 0;
    for (int run = 0; run < kRuns; ++run) {
        ::malloc_trim(0);
        resetPeak();
        const long before = statusField("VmRSS");
        Array<CIMInstance> result;
        cost.measure([&] { result = client.enumerateInstances(kNameSpace, "Bench_Device"); });
        if (result.size() != count) {
            std::printf("WRONG: %u instances\n", result.size());
        }
        // Later runs find memory that the allocator kept; the most is what counts.
        growth = std::max(growth, statusField("VmHWM") - before);
    }
    std::printf("%8u %-12s %8.2f %10.0f %10.0f %10.0f %10.0f %8.2f %8.2f %10.2f\n", count, how, megabytes,
                megabytes / expat.cpu, megabytes / pugixml.cpu, megabytes / cost.cpu, megabytes / cost.wall,
                expat.cpu / cost.cpu, expat.cpu / cost.wall, double(growth) * 1024 / bytes);
}

// What a client does that reads the whole answer before it decodes it.
Array<CIMInstance> readThenDecode(client::ServerConnection& connection, const std::string& request)
{
    const auto deadline = base::Deadline::after(std::chrono::minutes(10));
    connection.send(request, deadline);
    std::string text;
    wire::HttpAnswerReader response(
        wire::HttpAnswerLimits(), [](const wire::HttpAnswerFields&) {}, [&](std::string_view body) { text += body; });
    std::vector<char> buffer(64UL * 1024);
    while (!response.isComplete()) {
        std::size_t received = 0;
        connection.receive(buffer.data(), buffer.size(), deadline, received);
        response.feed(std::string_view(buffer.data(), received));
    }
    const client::ExpectedResponse expected{"1000", "EnumerateInstances", true};
    wire::ElementDecoder decoder;
    wire::KnownInstances known;
    client::InstanceReader instances(known);
    client::ResponseReader reader(expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) {
        instances.read(element, decoder);
    });
    reader.setOfferHandler(
        [&](std::string_view bytes, wire::ElementDecoder&) { return instances.offer(bytes, decoder); });
    reader.feed(text);
    reader.finish();
    return instances.instances();
}

// A server that needs time for its answer: what decoding meanwhile is worth.
void benchOverlap()
{
    constexpr unsigned kCount = 10000;
    TPreparedAnswer prepared(instancesBody(kCount), {0, 64UL * 1024, std::chrono::milliseconds(1)});
    test::ScriptedPeer peer([&](const test::PeerRequest& request) { return prepared.answer(request); });
    CIMClient client;
    client.setTimeout(600000);
    client.connect("127.0.0.1", peer.port(), String(), String());
    client::ServerAddress address;
    address.host = "127.0.0.1";
    address.port = peer.port();
    client::ServerConnection connection;
    connection.setAddress(address);
    connection.open(base::Deadline::after(std::chrono::seconds(10)));
    wire::IntrinsicCall call("EnumerateInstances", kNameSpace);
    const client::Request request = client::makeRequest(call);
    const std::string message = client::encodeHttpRequest(request, "1000", address.text(), {});
    TCost overlapped;
    TCost inTurn;
    for (int run = 0; run < kRuns; ++run) {
        overlapped.measure([&] { (void)client.enumerateInstances(kNameSpace, "Bench_Device"); });
        inTurn.measure([&] { (void)readThenDecode(connection, message); });
    }
    std::printf("%u instances from a peer that sends 64 KB and then pauses 1 ms: %.0f ms, %.0f ms when the answer is "
                "read first and decoded then\n",
                kCount, overlapped.wall * 1e3, inTurn.wall * 1e3);
}

void benchGetClass()
{
    constexpr int kCalls = 2000;
    const std::string body = classBody();
    TPreparedAnswer prepared(body);
    const TCost expat = bareExpat(body);
    test::ScriptedPeer peer([&](const test::PeerRequest& request) { return prepared.answer(request); });
    CIMClient client;
    client.connect("127.0.0.1", peer.port(), String(), String());
    TCost cost;
    for (int run = 0; run < 4; ++run) {
        cost.measure([&] {
            for (int call = 0; call < kCalls; ++call) {
                (void)client.getClass(kNameSpace, "Bench_Class", false);
            }
        });
    }
    std::printf("GetClass, 33 properties, %zu bytes of XML: %.0f calls/s of the client's CPU, %.0f by the clock; one "
                "call's CPU is %.2f bare expat passes\n",
                body.size(), kCalls / cost.cpu, kCalls / cost.wall, cost.cpu / kCalls / expat.cpu);
}

} // namespace

int main(int argc, char** argv)
{
    const std::string option = argc > 1 ? argv[1] : "";
    if (option == "--calls") {
        benchGetClass();
        return 0;
    }
    std::printf("EnumerateInstances; rates in MB/s of XML, the least cost of %d runs\n", kRuns);
    std::printf("%8s %-12s %8s %10s %10s %10s %10s %8s %8s %10s\n", "count", "sent", "MB", "expat", "pugixml",
                "client cpu", "clock", "cpu/exp", "clk/exp", "mem/bytes");
    for (const unsigned count : {1000u, 10000u, 100000u}) {
        if (option != "--quick" || count < 100000) {
            benchInstances(count, "with length");
        }
    }
    benchInstances(10000, "2 KB chunks", {2048, 0, {}});
    benchInstances(10000, "4 KB sends", {2048, 4096, {}});
    benchOverlap();
    benchGetClass();
    return 0;
}
