// SPDX-License-Identifier: MIT
// A provider that plays what the files beside its library say, so that one library can stand for any vendor's:
//   <Class>.xml     its instances: a CIM-XML message with VALUE.NAMEDINSTANCE elements anywhere in it
//   <name>.status   "CODE TEXT": class or method fails with that, a class behind its instances; "throw": a C++ int
//   <Method>.echo   a prefix: the method gives its inputs back with that before their names
//   <Method>.xml    a CIM-XML message with RETURNVALUE and PARAMVALUE elements: what else the method answers
#include "pegasus/wire/ElementDecoder.h"
#include "tests/pegasus/server/lab/CmpiBuilder.h"

#include <atomic>
#include <filesystem>
#include <fstream>
#include <functional>
#include <sstream>

#include <dlfcn.h>

namespace {

using lab::Argument;
using lab::CmpiBuilder;
using Pegasus::wire::ElementDecoder;
using Pegasus::wire::XmlDocument;
using Pegasus::wire::XmlElement;

std::atomic<const CMPIBroker*> gBroker{nullptr}; // set by each factory, maybe while the other's interface works

const char* textOf(const CMPIString* string)
{
    return string == nullptr ? "" : static_cast<const char*>(string->hdl);
}

CMPIStatus failure(int code, const std::string& text)
{
    const CMPIBroker* broker = gBroker;
    return {static_cast<CMPIrc>(code), broker->eft->newString(broker, text.c_str(), nullptr)};
}

// The content of a file of the library's folder; empty if absent.
std::string contentOf(const std::string& name)
{
    Dl_info library = {};
    ::dladdr(reinterpret_cast<void*>(&contentOf), &library);
    std::ifstream file(std::filesystem::path(library.dli_fname).replace_filename(name), std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

// Calls `take` with each element of one of the names, wherever it is.
void forEach(XmlElement element, std::initializer_list<const char*> names,
             const std::function<void(const XmlElement&)>& take)
{
    for (; element; element = element.nextSibling()) {
        if (std::any_of(names.begin(), names.end(), [&](const char* name) { return element.is(name); })) {
            take(element);
        } else if (element.is("CIM") || element.is("MESSAGE") || element.is("SIMPLERSP") ||
                   element.is("IMETHODRESPONSE") || element.is("METHODRESPONSE") || element.is("IRETURNVALUE"))
        {
            forEach(element.firstChild(), names, take);
        }
    }
}

void readFile(const std::string& name, std::initializer_list<const char*> elements,
              const std::function<void(ElementDecoder&, const XmlElement&)>& take)
{
    std::string text = contentOf(name);
    if (text.empty()) {
        return;
    }
    XmlDocument document;
    ElementDecoder decoder;
    forEach(document.parseMessage(text), elements, [&](const XmlElement& element) { take(decoder, element); });
}

CMPIStatus statusOf(const std::string& name)
{
    std::istringstream line(contentOf(name + ".status"));
    std::string text;
    int code = 0;
    if (line.str() == "throw") {
        throw 7;
    }
    if (!(line >> code)) {
        return {CMPI_RC_OK, nullptr};
    }
    std::getline(line.ignore(1), text);
    return failure(code, text);
}

using InstanceTaker = std::function<void(const CmpiBuilder&, const Pegasus::CIMInstance&)>;

CMPIStatus deliver(const CMPIResult* result, const CMPIObjectPath* of, const InstanceTaker& take)
{
    const CmpiBuilder builder(gBroker, textOf(of->ft->getNameSpace(of, nullptr)));
    const std::string className = textOf(of->ft->getClassName(of, nullptr));
    readFile(className + ".xml", {"VALUE.NAMEDINSTANCE"}, [&](ElementDecoder& decoder, const XmlElement& element) {
        take(builder, decoder.decodeNamedInstance(element));
    });
    const CMPIStatus status = statusOf(className);
    return status.rc == CMPI_RC_OK ? result->ft->returnDone(result) : status;
}

CMPIStatus enumerateInstances(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* of,
                              const char**)
{
    return deliver(result, of, [&](const CmpiBuilder& builder, const Pegasus::CIMInstance& instance) {
        result->ft->returnInstance(result, builder.instance(instance));
    });
}

CMPIStatus enumerateInstanceNames(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                                  const CMPIObjectPath* of)
{
    return deliver(result, of, [&](const CmpiBuilder& builder, const Pegasus::CIMInstance& instance) {
        result->ft->returnObjectPath(result, builder.path(instance.getPath(), &instance));
    });
}

CMPIStatus getInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* wanted,
                       const char**)
{
    CMPIObjectPath* local = wanted->ft->clone(wanted, nullptr);
    local->ft->setHostname(local, "");
    const std::string wantedText = textOf(local->ft->toString(local, nullptr));
    local->ft->release(local);
    return deliver(result, wanted, [&](const CmpiBuilder& builder, const Pegasus::CIMInstance& instance) {
        CMPIInstance* made = builder.instance(instance);
        const CMPIObjectPath* path = made->ft->getObjectPath(made, nullptr);
        if (textOf(path->ft->toString(path, nullptr)) == wantedText) {
            result->ft->returnInstance(result, made);
        }
    });
}

// Deletes nothing: the recorded provider refuses, with the status of its class.
CMPIStatus deleteInstance(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath* of)
{
    return statusOf(textOf(of->ft->getClassName(of, nullptr)));
}

void giveBack(const std::string& prefix, const CMPIArgs* in, CMPIArgs* out)
{
    const CMPICount count = in->ft->getArgCount(in, nullptr);
    for (CMPICount i = 0; i < count; ++i) {
        CMPIString* name = nullptr;
        const CMPIData data = in->ft->getArgAt(in, i, &name, nullptr);
        const bool isNull = (data.state & CMPI_nullValue) != 0;
        out->ft->addArg(out, (prefix + textOf(name)).c_str(), isNull ? nullptr : &data.value, data.type);
    }
}

CMPIStatus invokeMethod(CMPIMethodMI*, const CMPIContext*, const CMPIResult* result, const CMPIObjectPath* of,
                        const char* method, const CMPIArgs* in, CMPIArgs* out)
{
    const CMPIStatus status = statusOf(method);
    if (status.rc != CMPI_RC_OK) {
        return status;
    }
    if (const std::string echo = contentOf(std::string(method) + ".echo"); !echo.empty()) {
        giveBack(echo.substr(0, echo.find('\n')), in, out);
    }
    const CmpiBuilder builder(gBroker, textOf(of->ft->getNameSpace(of, nullptr)));
    const auto take = [&](ElementDecoder& decoder, const XmlElement& element) {
        if (element.is("RETURNVALUE")) {
            const Argument value = builder.argument(decoder.decodeReturnValue(element));
            result->ft->returnData(result, value.pointer(), value.type);
            return;
        }
        const Pegasus::CIMParamValue parameter = decoder.decodeParamValue(element);
        const Argument value = builder.argument(parameter.getValue());
        out->ft->addArg(out, parameter.getParameterName().getCString(), value.pointer(), value.type);
    };
    readFile(std::string(method) + ".xml", {"RETURNVALUE", "PARAMVALUE"}, take);
    return result->ft->returnDone(result);
}

template <typename Interface> CMPIStatus cleanup(Interface*, const CMPIContext*, CMPIBoolean)
{
    return {CMPI_RC_OK, nullptr};
}

// An older provider's tables: the slots for other writing and for querying are there and stay unused.
const CMPIInstanceMIFT kInstanceTable = {CMPIVersion100,
                                         CMPIVersion100,
                                         "instanceLab",
                                         cleanup<CMPIInstanceMI>,
                                         enumerateInstanceNames,
                                         enumerateInstances,
                                         getInstance,
                                         nullptr,
                                         nullptr,
                                         deleteInstance,
                                         nullptr,
                                         nullptr};
const CMPIMethodMIFT kMethodTable = {CMPIVersion100, CMPIVersion100, "methodLab", cleanup<CMPIMethodMI>, invokeMethod};

CMPIInstanceMI gInstanceMI = {nullptr, &kInstanceTable};
CMPIMethodMI gMethodMI = {nullptr, &kMethodTable};

} // namespace

extern "C" {

CMPIInstanceMI* Lab_Create_InstanceMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)
{
    gBroker = broker;
    return &gInstanceMI;
}

CMPIMethodMI* Lab_Create_MethodMI(const CMPIBroker* broker, const CMPIContext*, CMPIStatus*)
{
    gBroker = broker;
    return &gMethodMI;
}
}
