// SPDX-License-Identifier: MIT
#include "host/cli/formats/Differences.h"
#include "host/cli/formats/JsonWriter.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace vrxhost {
namespace {

TJson Method(const TMethodRecord& method)
{
    TJson parameters = TJson::array();
    for (const auto& parameter : method.fParameters) {
        parameters.push_back(
            {{"name", parameter.fName}, {"type", parameter.fType}, {"in", parameter.fIsIn}, {"out", parameter.fIsOut}});
    }
    return {{"name", method.fName}, {"type", method.fReturnType}, {"parameters", std::move(parameters)}};
}

TJson Invocation(const TInvocation& invocation)
{
    const auto value = [](const TPropertyRecord& record) {
        return TJson{{"value", JsonValue(record.fValue)}, {"text", record.fText}};
    };
    TJson outputs = TJson::object();
    for (const TPropertyRecord& output : invocation.fOutputs) {
        outputs[output.fName] = value(output);
    }
    return {{"method", invocation.fMethod}, {"returned", value(invocation.fReturned)}, {"outputs", std::move(outputs)}};
}

TJson Check(const TCheck& check, bool isStable)
{
    TJson json = {{"subject", check.fSubject}, {"ok", check.fIsOk}, {"text", check.fText}};
    if (check.fIsNote) {
        json["note"] = true;
    }
    if (!check.fAdvice.empty()) {
        json["advice"] = check.fAdvice;
    }
    if (!check.fLog.empty()) {
        json["log"] = check.fLog;
    }
    if (!check.fTook.empty() && !isStable) {
        json["took"] = check.fTook;
    }
    return json;
}

// What is known at the beginning stands first, then the classes as they come, then what is known at the end.
class TJsonFormat : public IFormat, public IInstanceSink
{
  public:
    TJsonFormat(const TFormatOptions& options, TDocumentWriter write) : fOptions(options), fWrite(std::move(write)) {}

    // The other commands show names and declarations alone, or one instance that may turn out to be missing.
    IInstanceSink* BeginStream(const TDocumentHead& head) override
    {
        constexpr const char* kStreamed[] = {"inventory", "instances", "summary", "doctor"};
        fHead = head;
        return std::find(std::begin(kStreamed), std::end(kStreamed), head.fCommand) == std::end(kStreamed) ? nullptr
                                                                                                           : this;
    }

    void BeginProvider(const TProviderRecord& provider, std::size_t) override
    {
        OpenProvider(provider);
        fWrite(fJson.Take());
    }

    void BeginClass(const std::string&, const TClassRecord& each) override
    {
        OpenClass(each, EDetail::kInstances);
        fWrite(fJson.Take());
    }

    void Add(const TClassRecord& each, const TInstanceRecord& instance) override
    {
        AddInstance(each, instance);
        fWrite(fJson.Take());
    }

    void EndClass(const TClassRecord& each) override
    {
        CloseClass(each);
        fWrite(fJson.Take());
    }

    std::string Finish(const TDocument& document) override
    {
        if (fJson.GetDepth() == 0) {
            fHead = document.fHead;
            AddBody(document);
        }
        CloseProvider();
        fJson.CloseTo(kTop);
        AddResults(document);
        if (!fOptions.fStable) {
            fJson.Add("ended", document.fHead.fEnded);
        }
        TJson losses;
        AddLosses(losses, document);
        fJson.AddMembers(losses);
        fJson.CloseTo(0);
        return fJson.Take() + "\n";
    }

  private:
    // How many objects and arrays are open inside of each.
    static constexpr std::size_t kTop = 1;
    static constexpr std::size_t kProviders = kTop + 1;
    static constexpr std::size_t kProvider = kProviders + 1;
    static constexpr std::size_t kClasses = kProvider + 1;
    static constexpr std::size_t kClass = kClasses + 1;

    void OpenDocument()
    {
        if (fJson.GetDepth() > 0) {
            return;
        }
        fJson.BeginObject();
        fJson.Add("format", kFormatVersion);
        fJson.Add("tool", {{"name", "vrxhost"}, {"version", VRX_VERSION}});
        fJson.Add("command", fHead.fCommand);
        fJson.Add("host", JsonHost(fHead.fHost));
        if (!fOptions.fStable) {
            fJson.Add("run", fHead.fRunId);
            fJson.Add("started", fHead.fStarted);
        }
    }

    void OpenProviders()
    {
        OpenDocument();
        if (fJson.GetDepth() == kTop) {
            fJson.BeginArray("providers");
        }
    }

    void OpenProvider(const TProviderRecord& provider)
    {
        OpenProviders();
        CloseProvider();
        fIsPartial = false;
        fJson.BeginObject();
        fJson.AddMembers(
            {{"name", provider.fName}, {"module", provider.fModule}, {"description", provider.fDescription}});
        fJson.BeginArray("classes");
    }

    // A provider is partial as soon as one of its classes is.
    void CloseProvider()
    {
        if (fJson.GetDepth() > kProviders) {
            fJson.CloseTo(kProvider);
            AddPartial(fIsPartial);
            fJson.CloseTo(kProviders);
        }
    }

    // The one class of a document is the document's own object.
    void OpenClass(const TClassRecord& each, EDetail detail)
    {
        OpenDocument();
        if (fJson.GetDepth() > kTop) {
            fJson.BeginObject();
        }
        fJson.Add("name", each.fName);
        if (detail == EDetail::kNames) {
            return;
        }
        fJson.Add("superclass", each.fAncestors.empty() ? TJson() : TJson(each.fAncestors.front()));
        fJson.Add("properties", JsonDeclarations(each));
        if (detail == EDetail::kInstances) {
            fJson.BeginArray("instances");
            return;
        }
        TJson methods = TJson::array();
        for (const TMethodRecord& method : each.fMethods) {
            methods.push_back(Method(method));
        }
        fJson.Add("methods", methods);
    }

    void AddInstance(const TClassRecord& each, const TInstanceRecord& instance)
    {
        fJson.BeginObject();
        fJson.Add("path", instance.fPath);
        fJson.Add("properties", JsonProperties(each, instance, fOptions));
        fJson.CloseTo(fJson.GetDepth() - 1);
    }

    void CloseClass(const TClassRecord& each)
    {
        const bool isOnlyOne = fJson.GetDepth() <= kProviders;
        fJson.CloseTo(isOnlyOne ? kTop : kClass);
        AddPartial(each.fIsPartial);
        fJson.CloseTo(isOnlyOne ? kTop : kClasses);
        fIsPartial |= each.fIsPartial;
    }

    void AddPartial(bool isPartial)
    {
        if (isPartial) {
            fJson.Add("partial", true);
        }
    }

    void AddBody(const TDocument& document)
    {
        OpenDocument();
        if (document.fComparison) {
            return;
        }
        if (!document.fIsOneClass) {
            OpenProviders();
        }
        for (const TProviderRecord& provider : document.fProviders) {
            if (!document.fIsOneClass) {
                OpenProvider(provider);
            }
            for (const TClassRecord& each : provider.fClasses) {
                OpenClass(each, document.fDetail);
                for (const TInstanceRecord& instance : each.fInstances) {
                    AddInstance(each, instance);
                }
                CloseClass(each);
            }
        }
    }

    void AddResults(const TDocument& document)
    {
        TJson json = TJson::object();
        for (const TFact& fact : document.fFacts) {
            json["facts"].push_back({{"label", fact.fLabel}, {"text", fact.fText}});
        }
        for (const TCheck& check : document.fChecks) {
            json["checks"].push_back(Check(check, fOptions.fStable));
        }
        for (const TInvocation& invocation : document.fInvocations) {
            json["invocation"] = Invocation(invocation);
        }
        if (document.fComparison) {
            json["compared"] = JsonComparison(*document.fComparison);
        }
        fJson.AddMembers(json);
    }

    const TFormatOptions fOptions;
    const TDocumentWriter fWrite;
    TDocumentHead fHead;
    TJsonWriter fJson;
    bool fIsPartial = false; // the provider whose object is open
};

} // namespace

std::unique_ptr<IFormat> MakeJsonFormat(const TFormatOptions& options, TDocumentWriter write)
{
    return std::make_unique<TJsonFormat>(options, std::move(write));
}

} // namespace vrxhost
