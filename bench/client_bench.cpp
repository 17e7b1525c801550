// The client library against a peer in this process that serves a prepared answer from memory.
//
//   client_bench [--quick]
//
// Prints, for EnumerateInstances answers of growing size: the rate by the client thread's CPU time and by the clock,
// both also as a ratio to a bare expat pass with empty handlers over the same bytes in the same run, and the growth of
// the process's memory. Then GetClass calls on one connection. --quick leaves out the biggest answer.
#include <Pegasus/Client/CIMClient.h>

#include "support/PeerAnswers.h"

#include <chrono>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <expat.h>
#include <fstream>
#include <malloc.h>
#include <pugixml.hpp>
#include <string>

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

/// The least of several runs: what the work costs when nothing disturbs it.
struct Cost
{
    double cpu = 1e300;
    double wall = 1e300;

    template <class Work> void measure(Work&& work)
    {
        const double cpuStart = threadCpuSeconds();
        const double wallStart = wallSeconds();
        work();
        cpu = std::min(cpu, threadCpuSeconds() - cpuStart);
        wall = std::min(wall, wallSeconds() - wallStart);
    }
};

/// In kilobytes.
long statusField(const char* name)
{
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind(name, 0) == 0)
            return std::strtol(line.c_str() + std::strlen(name) + 1, nullptr, 10);
    }
    return 0;
}

void resetPeak()
{
    std::ofstream("/proc/self/clear_refs") << 5;
}

/// Twelve properties and 1.2 KB of XML, as an inventory provider's instances have.
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

/// The answer to whatever is asked: prepared once, with the id of the request put in.
class PreparedAnswer
{
  public:
    explicit PreparedAnswer(const std::string& method, std::vector<CIMInstance> instances)
    {
        test::PeerRequest request;
        request.head = "POST /cimom HTTP/1.1\r\nCIMMethod: " + method + "\r\n";
        request.body = "<MESSAGE ID=\"0000\"";
        fAnswer =
            method == "GetClass" ? test::classAnswer(request, makeClass()) : test::instancesAnswer(request, instances);
        fIdAt = fAnswer.bytes.find("0000");
        fBodyAt = fAnswer.bytes.find("\r\n\r\n") + 4;
    }

    test::PeerAnswer answer(const test::PeerRequest& request)
    {
        // Ids have four digits for the first 9000 calls of a process.
        fAnswer.bytes.replace(fIdAt, 4, request.messageId());
        test::PeerAnswer answer;
        answer.prepared = &fAnswer.bytes;
        return answer;
    }
    std::string body() const { return fAnswer.bytes.substr(fBodyAt); }

  private:
    test::PeerAnswer fAnswer;
    std::size_t fIdAt = 0;
    std::size_t fBodyAt = 0;
};

void XMLCALL onStart(void*, const XML_Char*, const XML_Char**) {}
void XMLCALL onEnd(void*, const XML_Char*) {}
void XMLCALL onText(void*, const XML_Char*, int) {}

Cost bareExpat(const std::string& xml)
{
    Cost cost;
    for (int run = 0; run < kRuns; ++run) {
        cost.measure([&] {
            XML_Parser parser = XML_ParserCreate(nullptr);
            XML_SetElementHandler(parser, onStart, onEnd);
            XML_SetCharacterDataHandler(parser, onText);
            constexpr std::size_t kPiece = 64 * 1024;
            for (std::size_t at = 0; at < xml.size(); at += kPiece) {
                const std::size_t size = std::min(kPiece, xml.size() - at);
                XML_Parse(parser, xml.data() + at, static_cast<int>(size), at + size == xml.size());
            }
            XML_ParserFree(parser);
        });
    }
    return cost;
}

/// The other parser, the whole text in place: what choosing it is based on.
Cost barePugixml(const std::string& xml)
{
    Cost cost;
    for (int run = 0; run < kRuns; ++run) {
        std::string copy = xml;
        cost.measure([&] {
            pugi::xml_document document;
            document.load_buffer_inplace(copy.data(), copy.size(), pugi::parse_cdata | pugi::parse_embed_pcdata);
        });
    }
    return cost;
}

void benchInstances(unsigned count)
{
    std::vector<CIMInstance> instances;
    for (unsigned i = 0; i < count; ++i)
        instances.push_back(makeInstance(i));
    PreparedAnswer prepared("EnumerateInstances", std::move(instances));
    instances.clear();
    instances.shrink_to_fit();
    const std::string body = prepared.body();
    const double megabytes = double(body.size()) / 1e6;
    const Cost expat = bareExpat(body);
    const Cost pugixml = barePugixml(body);

    test::ScriptedPeer peer([&](const test::PeerRequest& request) { return prepared.answer(request); });
    CIMClient client;
    client.setTimeout(600000);
    client.connect("127.0.0.1", peer.port(), String(), String());
    Cost cost;
    long growth = 0;
    for (int run = 0; run < kRuns; ++run) {
        ::malloc_trim(0);
        resetPeak();
        const long before = statusField("VmRSS");
        Array<CIMInstance> result;
        cost.measure([&] { result = client.enumerateInstances(kNameSpace, "Bench_Device"); });
        if (result.size() != count)
            std::printf("WRONG: %u instances\n", result.size());
        // Later runs find memory that the allocator kept; the most is what counts.
        growth = std::max(growth, statusField("VmHWM") - before);
    }
    std::printf("%8u %8.2f %10.0f %10.0f %10.0f %10.0f %8.2f %8.2f %10.2f\n", count, megabytes, megabytes / expat.cpu,
                megabytes / pugixml.cpu, megabytes / cost.cpu, megabytes / cost.wall, expat.cpu / cost.cpu,
                expat.cpu / cost.wall, double(growth) * 1024 / double(body.size()));
}

void benchGetClass()
{
    constexpr int kCalls = 5000;
    PreparedAnswer prepared("GetClass", {});
    test::ScriptedPeer peer([&](const test::PeerRequest& request) { return prepared.answer(request); });
    CIMClient client;
    client.connect("127.0.0.1", peer.port(), String(), String());
    Cost cost;
    cost.measure([&] {
        for (int call = 0; call < kCalls; ++call)
            (void)client.getClass(kNameSpace, "Bench_Class", false);
    });
    std::printf("GetClass, 33 properties, %zu bytes of XML: %.0f calls/s of the client's CPU, %.0f by the clock\n",
                prepared.body().size(), kCalls / cost.cpu, kCalls / cost.wall);
}

} // namespace

int main(int argc, char** argv)
{
    const bool quick = argc > 1 && std::strcmp(argv[1], "--quick") == 0;
    std::printf("EnumerateInstances; rates in MB/s of XML, the least cost of %d runs\n", kRuns);
    std::printf("%8s %8s %10s %10s %10s %10s %8s %8s %10s\n", "count", "MB", "expat", "pugixml", "client cpu", "clock",
                "cpu/exp", "clk/exp", "mem/bytes");
    for (const unsigned count : {1000u, 10000u, 100000u}) {
        if (!quick || count < 100000)
            benchInstances(count);
    }
    benchGetClass();
    return 0;
}
