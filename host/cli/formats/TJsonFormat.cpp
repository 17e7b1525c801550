// SPDX-License-Identifier: MIT
#include "host/cli/formats/Differences.h"
#include "host/cli/formats/JsonValues.h"

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

class TJsonFormat : public IFormat
{
  public:
    explicit TJsonFormat(const TFormatOptions& options) : fOptions(options) {}

    std::string Finish(const TDocument& document) override
    {
        TJson json = Head(document.fHead);
        AddBody(json, document);
        AddLosses(json, document);
        return JsonText(json, 2);
    }

  private:
    TJson Head(const TDocumentHead& head) const
    {
        TJson json = {{"format", kFormatVersion}, {"tool", {{"name", "vrxhost"}, {"version", VRX_VERSION}}}};
        json["command"] = head.fCommand;
        json["host"] = JsonHost(head.fHost);
        if (!fOptions.fStable) {
            json["run"] = head.fRunId;
            json["started"] = head.fStarted;
            json["ended"] = head.fEnded;
        }
        return json;
    }

    void AddBody(TJson& json, const TDocument& document) const
    {
        for (const TInvocation& invocation : document.fInvocations) {
            json["invocation"] = Invocation(invocation);
        }
        for (const TCheck& check : document.fChecks) {
            json["checks"].push_back(Check(check, fOptions.fStable));
        }
        if (document.fComparison) {
            json["compared"] = JsonComparison(*document.fComparison);
            return;
        }
        if (!document.fFacts.empty()) {
            json["facts"] = TJson::array();
            for (const TFact& fact : document.fFacts) {
                json["facts"].push_back({{"label", fact.fLabel}, {"text", fact.fText}});
            }
        }
        if (document.fIsOneClass) {
            for (const auto& provider : document.fProviders) {
                json.update(Class(provider.fClasses.front(), document.fDetail));
            }
            return;
        }
        json["providers"] = TJson::array();
        for (const auto& provider : document.fProviders) {
            json["providers"].push_back(Provider(provider, document.fDetail));
        }
    }

    TJson Provider(const TProviderRecord& provider, EDetail detail) const
    {
        TJson json = {{"name", provider.fName}, {"module", provider.fModule}, {"description", provider.fDescription}};
        MarkPartial(json, provider);
        json["classes"] = TJson::array();
        for (const auto& each : provider.fClasses) {
            json["classes"].push_back(Class(each, detail));
        }
        return json;
    }

    TJson Class(const TClassRecord& each, EDetail detail) const
    {
        TJson json = {{"name", each.fName}};
        MarkPartial(json, each);
        if (detail == EDetail::kNames) {
            return json;
        }
        json["superclass"] = each.fAncestors.empty() ? TJson() : TJson(each.fAncestors.front());
        json["properties"] = JsonDeclarations(each);
        if (detail == EDetail::kDeclarations) {
            json["methods"] = TJson::array();
            for (const auto& method : each.fMethods) {
                json["methods"].push_back(Method(method));
            }
            return json;
        }
        json["instances"] = TJson::array();
        for (const auto& instance : each.fInstances) {
            json["instances"].push_back(
                {{"path", instance.fPath}, {"properties", JsonProperties(each, instance, fOptions)}});
        }
        return json;
    }

    const TFormatOptions fOptions;
};

} // namespace

std::unique_ptr<IFormat> MakeJsonFormat(const TFormatOptions& options)
{
    return std::make_unique<TJsonFormat>(options);
}

} // namespace vrxhost
