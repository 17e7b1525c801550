// SPDX-License-Identifier: MIT
// The client's decoder alone, without a socket: answers of many instances and of a class, in memory.
//
//   decode_bench [KIND [PASSES]]
//
// Prints a line for each kind: the decoder's processor time and a bare expat pass's over the same bytes, taken in
// turns, and their ratio. With PASSES it decodes so many times and measures nothing: for a profiler.
#include "bench/ReadValues.h"
#include "pegasus/client/InstanceReader.h"
#include "pegasus/client/ResponseReader.h"
#include "pegasus/wire/ElementEncoder.h"

#include <expat.h>

#include <algorithm>
#include <cstdio>
#include <ctime>
#include <functional>
#include <string>

using namespace Pegasus;

namespace {

constexpr int kRounds = 25;
constexpr std::size_t kPieceBytes = 64UL * 1024; // what one read of the client gives at most

double processorSeconds()
{
    timespec now{};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return double(now.tv_sec) + double(now.tv_nsec) * 1e-9;
}

void addProperty(CIMInstance& instance, const char* name, const CIMValue& value)
{
    instance.addProperty(CIMProperty(name, value));
}

void addKey(CIMInstance& instance, const char* className, const char* key, const std::string& id)
{
    Array<CIMKeyBinding> keys;
    keys.append(CIMKeyBinding(key, String(id.c_str()), CIMKeyBinding::STRING));
    instance.setPath(CIMObjectPath(String(), CIMNamespaceName(), className, keys));
}

// Twelve properties and 1.2 KB of XML, as an inventory provider's instances have.
CIMInstance makeDevice(unsigned index)
{
    const std::string id = "device-" + std::to_string(1000000 + index);
    CIMInstance instance("Bench_Device");
    addProperty(instance, "DeviceID", String(id.c_str()));
    addProperty(instance, "Caption", String("Bench device in slot 17 of rack 4"));
    addProperty(instance, "Vendor", String("Example Vendor Corporation"));
    addProperty(instance, "Model", String("Model X-1000 & Y"));
    addProperty(instance, "Serial", CIMValue(Uint64(index) * 1000003));
    addProperty(instance, "Index", CIMValue(Uint32(index)));
    addProperty(instance, "Enabled", CIMValue(index % 2 == 0));
    addProperty(instance, "Health", CIMValue(Uint16(5)));
    addProperty(instance, "Temperature", CIMValue(Real64(36.6)));
    addProperty(instance, "Installed", CIMDateTime("20200102030405.678901+060"));
    addProperty(instance, "Status", CIMValue(CIMTYPE_STRING, false));
    Array<Uint16> states;
    states.append(2);
    states.append(5);
    addProperty(instance, "OperationalStatus", states);
    addKey(instance, "Bench_Device", "DeviceID", id);
    return instance;
}

// Seventeen properties and 2 KB of XML, most of them texts.
CIMInstance makeAsset(unsigned index)
{
    const std::string id = "asset-" + std::to_string(1000000 + index);
    CIMInstance instance("Bench_Asset");
    addProperty(instance, "InstanceID", String(id.c_str()));
    for (unsigned i = 0; i < 12; ++i) {
        const std::string text =
            "Text number " + std::to_string(i) + " of asset " + std::to_string(index) + ", as a label";
        addProperty(instance, ("DescriptiveText" + std::to_string(i)).c_str(), String(text.c_str()));
    }
    addProperty(instance, "Capacity", CIMValue(Uint64(index) * 4096));
    addProperty(instance, "IsPresent", CIMValue(true));
    addProperty(instance, "HealthState", CIMValue(Uint16(5)));
    addProperty(instance, "InstallDate", CIMDateTime("20200102030405.678901+060"));
    addKey(instance, "Bench_Asset", "InstanceID", id);
    return instance;
}

// The same properties, of which three have values: a provider's instances have all that their class declares.
CIMInstance makeSparse(unsigned index)
{
    CIMInstance full = makeAsset(index);
    CIMInstance instance("Bench_Asset");
    for (Uint32 i = 0; i < full.getPropertyCount(); ++i) {
        const CIMProperty property = full.getProperty(i);
        instance.addProperty(i < 3 ? property : CIMProperty(property.getName(), CIMValue(property.getType(), false)));
    }
    instance.setPath(full.getPath());
    return instance;
}

// Every fourth property is missing, each time others: the tags of an instance are seldom those of an earlier one.
CIMInstance makeVaried(unsigned index)
{
    CIMInstance instance = makeAsset(index);
    for (Uint32 i = instance.getPropertyCount(); i-- > 1;) {
        if ((index * 2654435761u >> i) % 4 == 0) {
            instance.removeProperty(i);
        }
    }
    return instance;
}

CIMClass makeClass()
{
    CIMClass cimClass("Bench_Class", "CIM_LogicalDevice");
    for (unsigned i = 0; i < 17; ++i) {
        CIMProperty property(("Property" + std::to_string(i)).c_str(), CIMValue(CIMTYPE_STRING, false));
        property.addQualifier(CIMQualifier("Description", String("What this property holds, in one sentence.")));
        property.addQualifier(CIMQualifier("MaxLen", CIMValue(Uint32(64)), CIMFlavor::DEFAULTS));
        cimClass.addProperty(property);
    }
    return cimClass;
}

std::string answerOf(const char* operation, const std::string& content)
{
    return "<?xml version=\"1.0\" encoding=\"utf-8\"?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">\n<MESSAGE ID=\"1\" "
           "PROTOCOLVERSION=\"1.0\">\n<SIMPLERSP>\n<IMETHODRESPONSE NAME=\"" +
           std::string(operation) + "\">\n<IRETURNVALUE>\n" + content +
           "</IRETURNVALUE>\n</IMETHODRESPONSE>\n</SIMPLERSP>\n</MESSAGE>\n</CIM>\n";
}

std::string instances(CIMInstance (*make)(unsigned), unsigned count)
{
    std::string content;
    for (unsigned i = 0; i < count; ++i) {
        wire::appendNamedInstance(content, make(i));
    }
    return answerOf("EnumerateInstances", content);
}

std::string classes(unsigned count)
{
    std::string content;
    for (unsigned i = 0; i < count; ++i) {
        wire::appendClass(content, makeClass());
    }
    return answerOf("EnumerateClasses", content);
}

// Decodes and drops an answer, as a call of the client does. Returns: how many objects there were.
template <typename Object>
Uint32 decode(const std::string& answer, const char* operation,
              Object (wire::ElementDecoder::*function)(const wire::XmlElement&))
{
    const client::ExpectedResponse expected{"1", operation, true};
    wire::ElementDecoder decoder;
    Array<Object> objects;
    client::ResponseReader reader(expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) {
        objects.append((decoder.*function)(element));
    });
    for (std::size_t at = 0; at < answer.size(); at += kPieceBytes) {
        reader.feed(std::string_view(answer).substr(at, kPieceBytes));
    }
    reader.finish();
    return objects.size();
}

// The same for instances, which the client collects in its own way. They are read where `andRead` says so: every value
// of every instance once, as a host does.
Uint32 decodeInstances(const std::string& answer, bool andRead)
{
    const client::ExpectedResponse expected{"1", "EnumerateInstances", true};
    wire::ElementDecoder decoder;
    wire::KnownInstances known;
    client::InstanceReader instances(known);
    client::ResponseReader reader(expected, decoder, [&](const wire::XmlElement& element, wire::ElementDecoder&) {
        instances.read(element, decoder);
    });
    reader.setOfferHandler(
        [&](std::string_view text, wire::ElementDecoder&) { return instances.offer(text, decoder); });
    for (std::size_t at = 0; at < answer.size(); at += kPieceBytes) {
        reader.feed(std::string_view(answer).substr(at, kPieceBytes));
    }
    reader.finish();
    return andRead ? bench::readValues(instances.instances()) : instances.instances().size();
}

void bareExpat(const std::string& answer)
{
    const XML_Parser parser = XML_ParserCreate(nullptr);
    XML_SetElementHandler(
        parser, [](void*, const char*, const char**) {}, [](void*, const char*) {});
    XML_SetCharacterDataHandler(parser, [](void*, const char*, int) {});
    for (std::size_t at = 0; at < answer.size(); at += kPieceBytes) {
        const std::size_t size = std::min(kPieceBytes, answer.size() - at);
        XML_Parse(parser, answer.data() + at, static_cast<int>(size), at + size == answer.size());
    }
    XML_ParserFree(parser);
}

struct Kind
{
    const char* name;
    std::string (*makeAnswer)(unsigned count);
    std::function<Uint32(const std::string&)> decode;
};

constexpr unsigned kCount = 1000; // objects in an answer

void measure(const Kind& kind, const std::string& answer)
{
    double decoding = 1e300;
    double expat = 1e300;
    for (int round = 0; round < kRounds; ++round) {
        const double start = processorSeconds();
        if (kind.decode(answer) != kCount) {
            std::printf("WRONG: %s\n", kind.name);
        }
        const double between = processorSeconds();
        bareExpat(answer);
        decoding = std::min(decoding, between - start);
        expat = std::min(expat, processorSeconds() - between);
    }
    std::printf("%-14s %6zu bytes each: decoded in %6.2f us, expat %6.2f us, ratio %.2f\n", kind.name,
                answer.size() / kCount, decoding * 1e6 / kCount, expat * 1e6 / kCount, expat / decoding);
}

} // namespace

int main(int argc, char** argv)
{
    const auto asInstances = [](const std::string& answer) { return decodeInstances(answer, false); };
    const auto andRead = [](const std::string& answer) { return decodeInstances(answer, true); };
    const auto asClasses = [](const std::string& answer) {
        return decode<CIMClass>(answer, "EnumerateClasses", &wire::ElementDecoder::decodeClass);
    };
    const auto devices = [](unsigned count) { return instances(makeDevice, count); };
    const auto assets = [](unsigned count) { return instances(makeAsset, count); };
    const auto sparse = [](unsigned count) { return instances(makeSparse, count); };
    const auto varied = [](unsigned count) { return instances(makeVaried, count); };
    const Kind kinds[] = {
        {"devices", devices, asInstances}, {"devices, read", devices, andRead}, {"assets", assets, asInstances},
        {"assets, read", assets, andRead}, {"sparse", sparse, asInstances},     {"sparse, read", sparse, andRead},
        {"varied", varied, asInstances},   {"varied, read", varied, andRead},   {"classes", classes, asClasses}};
    for (const Kind& kind : kinds) {
        if (argc > 1 && kind.name != std::string(argv[1])) {
            continue;
        }
        const std::string answer = kind.makeAnswer(kCount);
        if (argc > 2) {
            for (int pass = 0; pass < std::stoi(argv[2]); ++pass) {
                kind.decode(answer);
            }
        } else {
            measure(kind, answer);
        }
    }
    return 0;
}
