// SPDX-License-Identifier: MIT
// A plug-in for the tests of vrxhost. It behaves well by default; the host setting "fake.fault" names a fault to show,
// and what can only be wrong in the library itself is a macro:
//   FAKE_WITHOUT_ENTRY_POINTS   the entry points are missing
// A namespace that is cleared leaves a file "cleared" in the working directory, so that a test sees that the host did
// shut down.
#include "host/inmem/TInmemClass.h"
#include "host/inmem/TInmemNamespace.h"
#include "host/inmem/TInmemProvider.h"

#include <host/INamespaceProvider.h>
#include <host/INamespaceProviderManager.h>
#include <host/IProvider.h>
#include <host/TConfig.h>
#include <host/TInmemInstance.h>
#include <host/TOSSpecific.h>
#include <host/TRootObject.h>

#include <boost/make_shared.hpp>

#include <csignal>
#include <cstdio>
#include <fstream>
#include <future>
#include <stdexcept>
#include <thread>

#include <poll.h>
#include <unistd.h>

#ifndef FAKE_WITHOUT_ENTRY_POINTS

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;

bool HasFault(const char* name)
{
    return TConfig::GetInstance()->getValue("fake.fault") == name;
}

void Log(ILogger::EVRXLogSeverity severity, const std::string& text)
{
    TRootObject::GetCoreLogger()->Log(severity, text);
}

template <typename Value> void Put(TInmemInstance& instance, const char* name, const Value& value)
{
    instance.SetPropertyValue(name, TCIMValue(value), TCIMContext());
}

TCIMReference ReferenceTo(const std::string& path, const boost::shared_ptr<ICIMNamespace>& ns)
{
    TCIMReference reference(ns, TCIMContext());
    reference.SetPath(path);
    return reference;
}

// Echoes calls, and runs fEnumerate when that is set.
class TFakeClass : public TInmemClass
{
  public:
    using TInmemClass::InvokeMethod;
    using TInmemClass::TInmemClass;
    using TInmemClass::operator=;

    std::function<void(TInstanceVisitor)> fEnumerate;

    void EnumerateInstances(TInstanceVisitor visitor, bool deep, TCIMContext context) override
    {
        return fEnumerate ? fEnumerate(visitor) : TInmemClass::EnumerateInstances(visitor, deep, context);
    }
    // Returns its first input; the outputs are the path, and the inputs again.
    TCIMValue InvokeMethod(const TCIMReference& target, const std::string& name, const TCIMContext& inputs,
                           TCIMContext& outputs, TCIMContext) override
    {
        outputs = inputs;
        outputs["Target"] = TCIMValue(target.GetPath() + " " + name);
        return inputs.empty() ? TCIMValue() : inputs.begin()->second;
    }
};

// A class in which every type occurs, nulls and arrays too.
boost::shared_ptr<TFakeClass> EveryTypeClass(const boost::shared_ptr<ICIMNamespace>& ns)
{
    const auto each = boost::make_shared<TFakeClass>("Fake_EveryType", boost::make_shared<TFakeClass>("CIM_Thing"));
    each->SetNamespace(ns);
    each->Declare("ID", TType::kString, true);
    each->Declare("Speed", TType::kUint64)->SetQualifier("Units", TCIMValue("Bits per second"));
    each->Declare("MixedCase", TType::kSint8)->SetQualifier("Counter", TCIMValue(true));
    each->Declare("Names", TType::kStringArray);
    const auto reset = each->DeclareMethod("Reset", TType::kUint32);
    reset->Declare("Force", TType::kBoolean);
    reset->Declare("Ports", TType::kUint16Array);
    reset->SetQualifier("ValueMap", TCIMValue(TType::kString, 0, {TCIMValue("true")}));
    reset->SetQualifier("Values", TCIMValue(TType::kString, 0, {TCIMValue("Done")}));

    const auto instance = boost::make_shared<TInmemInstance>(each, TCIMContext());
    Put(*instance, "id", "one \"two\"\x1b[31m");
    Put(*instance, "speed", 18446744073709551615ul);
    Put(*instance, "mixedcase", static_cast<signed char>(-128));
    Put(*instance, "names", TCIMValue(TType::kString, 0, {TCIMValue("a"), TCIMValue("b\xff")}));
    Put(*instance, "Boolean", true);
    Put(*instance, "Character", TCIMChar16(0x20ac));
    Put(*instance, "Date", TCIMDateTime("20261121041500.000000+060"));
    Put(*instance, "Empty", TCIMValue(TType(TType::kUint32Array), 0));
    Put(*instance, "Minimum", -9223372036854775807l - 1);
    Put(*instance, "Nothing", TCIMValue());
    TCIMValue nullReference;
    nullReference.SetReferencedClass(each);
    Put(*instance, "NullReference", nullReference);
    Put(*instance, "Real32", 0.1f);
    Put(*instance, "Real64", 1e300);
    Put(*instance, "Reference", ReferenceTo("root/cimv2:A.k=\"1\"", ns));
    each->AddInstance(instance);
    return each;
}

// As many instances as the setting "fake.count" says; each with the text of "fake.text", or one that fills pipes
// quickly.
boost::shared_ptr<TFakeClass> ManyClass()
{
    const auto many = boost::make_shared<TFakeClass>("Fake_Many");
    many->Declare("Number", TType::kSint32);
    const int count = std::atoi(TConfig::GetInstance()->getValue("fake.count").c_str());
    const std::string text = TConfig::GetInstance()->getValue("fake.text");
    for (int i = 0; i < count; ++i) {
        const auto instance = boost::make_shared<TInmemInstance>(many, TCIMContext());
        Put(*instance, "Number", i);
        Put(*instance, "Text", text.empty() ? std::string(100, 'x') : text);
        many->AddInstance(instance);
    }
    return many;
}

boost::shared_ptr<TFakeClass> BrokenClass()
{
    const auto broken = boost::make_shared<TFakeClass>("Fake_Broken");
    if (HasFault("class-throws")) {
        broken->fEnumerate = [](TInstanceVisitor) { throw 5; };
    }
    if (HasFault("interrupt-enumeration")) {
        broken->fEnumerate = [broken = broken.get()](TInstanceVisitor visitor) {
            ::kill(::getpid(), SIGINT);
            while (visitor(boost::make_shared<TInmemInstance>(broken->shared_from_this(), TCIMContext()))) {
                continue;
            }
        };
    }
    // Delivers until there is a file "go", or the visitor has had enough.
    if (HasFault("slow-class")) {
        broken->fEnumerate = [broken = broken.get()](TInstanceVisitor visitor) {
            while (::access("go", F_OK) != 0 &&
                   visitor(boost::make_shared<TInmemInstance>(broken->shared_from_this(), TCIMContext())))
            {
                ::poll(nullptr, 0, 10);
            }
        };
    }
    return broken;
}

class TFakeNamespace : public TInmemNamespace
{
  public:
    ~TFakeNamespace() override
    {
        for (const auto& each : fClasses) {
            each->ClearInstances(); // a class and its instances hold each other
        }
        std::ofstream("cleared") << "cleared";
        if (HasFault("interrupt-at-shutdown")) {
            ::kill(::getpid(), SIGINT);
        }
        if (HasFault("program-at-shutdown")) {
            TOSSpecific::SpawnProcess("touch shut-down-program-ran", 10);
        }
    }

    void Fill(const boost::shared_ptr<ICIMNamespace>& self)
    {
        fClasses = {EveryTypeClass(self), BrokenClass(), ManyClass()};
        const auto provider = boost::make_shared<TInmemProvider>("fake", "libfake", "a fake");
        for (const auto& each : fClasses) {
            provider->AddClass(each);
        }
        fProviders.push_back(provider);
        if (HasFault("threads")) {
            fProviders.insert(fProviders.end(), 7, fProviders.front());
        }
    }

    void EnumerateProviders(TProviderVisitor visitor, TCIMContext context) override
    {
        if (context.at("pluginType") != TCIMValue(static_cast<signed char>(7))) {
            return;
        }
        std::vector<std::future<bool>> threads;
        for (const auto& provider : fProviders) {
            if (HasFault("threads")) {
                threads.push_back(std::async(std::launch::async, visitor, provider));
            } else {
                visitor(provider);
            }
        }
        for (auto& thread : threads) {
            thread.wait();
        }
    }

  private:
    std::vector<boost::shared_ptr<ICIMClass>> fClasses;
    std::vector<boost::shared_ptr<IProvider>> fProviders;
};

// What the real plug-in logs when a class, instances and a provider description are lost, and programs that fail.
void LogLosses()
{
    Log(ILogger::kInfo, "Loading... /x/linux/a.classes.xml");
    Log(ILogger::kError, "Performance Data RDD Parser line 1:Unrecognized identifier:vrx");
    Log(ILogger::kError, "Performance Data RDD Parser line 3:syntax error");
    for (const char* name : {"CIM_Gone", "CIM_Gone", "CIM_Lost"}) {
        Log(ILogger::kInfo,
            std::string("TPEGASUSNamespace::GetClass from Pegasus for: ") + name + " returned exception: not found");
    }
    Log(ILogger::kInfo,
        "Catching exeption: AllocateClass  --- CIM_Odd  CIM_Base\twith reason: The value has the wrong type");
    std::string output;
    TOSSpecific::SpawnProcess("cimmof",
                              {"-c", "echo 'Parsing error: bad.mof:3' >&2; exit 250", "/x/provider/linux/bad.mof"},
                              "/bin/sh", {}, output, 10);
}

// The first allocations, as many as the setting says, find that another server answers on the port.
void MeetForeignServers()
{
    static int fgAllocations = 0;
    std::ofstream("allocations") << ++fgAllocations;
    if (fgAllocations <= std::atoi(TConfig::GetInstance()->getValue("fake.foreign-servers").c_str())) {
        std::string output;
        TOSSpecific::SpawnProcess("cimserver", {"-c", "exit 1"}, "/bin/sh", {}, output, 10);
        Log(ILogger::kInfo, "TPEGASUSNamespace::GetClass from Pegasus for: A returned exception: not this server's");
    }
    Log(ILogger::kInfo, "TPEGASUSNamespace::connect succeeded \n");
}

} // namespace

class TPEGASUSNamespaceProvider : public INamespaceProvider
{
  public:
    static void Initialize();
    static void ClearNamespace();

    static const boost::shared_ptr<TPEGASUSNamespaceProvider>& Instance()
    {
        static const auto instance = boost::make_shared<TPEGASUSNamespaceProvider>();
        return instance;
    }

    std::string GetName(TCIMContext) const override { return "pegasus"; }
    boost::shared_ptr<ICIMNamespace> AllocateNamespace(TCIMContext context, bool, std::string) const override;
    int GetType(TCIMContext) const override { return 0; }
    bool IsIndicationsSupported(TCIMContext) const override { return false; }

  private:
    mutable boost::shared_ptr<TFakeNamespace> fNamespace;
};

void TPEGASUSNamespaceProvider::Initialize()
{
    if (HasFault("initialize-throws")) {
        throw std::runtime_error("no initialisation today");
    }
    if (!HasFault("registers-nothing")) {
        TRootObject::GetNamespaceProviderManager()->RegisterNamespaceProvider(Instance());
    }
}

void TPEGASUSNamespaceProvider::ClearNamespace()
{
    Instance()->fNamespace.reset();
    if (HasFault("clear-throws")) {
        throw std::runtime_error("no shutdown today");
    }
}

boost::shared_ptr<ICIMNamespace> TPEGASUSNamespaceProvider::AllocateNamespace(TCIMContext context, bool,
                                                                              std::string) const
{
    fNamespace = boost::make_shared<TFakeNamespace>();
    MeetForeignServers();
    if (HasFault("exits")) {
        std::exit(1);
    }
    if (HasFault("throws-standard")) {
        throw std::runtime_error("out of luck");
    }
    if (HasFault("throws-status")) {
        throw TVRXException(TVRXStatusCode::kServerConnectionFailed);
    }
    if (HasFault("throws-directory")) {
        throw TVRXException(TVRXStatusCode::kDirectoryNotOpened);
    }
    if (HasFault("throws-int")) {
        throw 5;
    }
    if (HasFault("returns-null")) {
        return boost::shared_ptr<ICIMNamespace>();
    }
    if (HasFault("prints")) {
        std::puts("printed by the plug-in"), std::fflush(stdout);
    }
    if (HasFault("leaves-a-thread")) {
        std::thread([] { ::pause(); }).detach();
    }
    if (HasFault("losses")) {
        LogLosses();
    }
    const std::string fault = TConfig::GetInstance()->getValue("fake.fault");
    if (fault.rfind("log:", 0) == 0) {
        Log(ILogger::kInfo, fault.substr(4));
    }
    if (HasFault("interrupt-program") || HasFault("program-at-shutdown")) {
        ::kill(::getpid(), SIGTERM);
        TOSSpecific::SpawnProcess("tail -f /dev/null", 300);
    }
    if (HasFault("interrupt-twice")) {
        for (;;) {
            ::kill(::getpid(), SIGINT);
        }
    }
    // The keys hold addresses of the host's pointers; one that is wrong ends the test here.
    for (const char* key : {"repository", "upcall"}) {
        if (!*reinterpret_cast<boost::shared_ptr<ICIMNamespace>*>(static_cast<unsigned long>(context.at(key)))) {
            throw std::logic_error("a null namespace");
        }
    }
    Log(ILogger::kInfo, "consumer " + context.at("consumer").ToString(10));
    fNamespace->Fill(fNamespace);
    return fNamespace;
}

} // namespace NKOLVRX20

#endif
