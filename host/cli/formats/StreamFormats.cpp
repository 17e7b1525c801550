// SPDX-License-Identifier: MIT
// Formats that write each instance as it comes, so that memory does not grow with their number.
#include "host/cli/formats/Differences.h"
#include "host/cli/formats/JsonValues.h"
#include "host/cli/formats/TextLayout.h"
#include "host/cli/formats/ValueText.h"
#include "host/cli/model/Printable.h"

#include <utility>

namespace vrxhost {
namespace {

// What the two have in common: where the text goes, and how much has gone.
class TStreamFormat : public IFormat, public IInstanceSink
{
  public:
    TStreamFormat(const TFormatOptions& options, TDocumentWriter write) : fOptions(options), fWrite(std::move(write)) {}

    IInstanceSink* BeginStream(const TDocumentHead& head) override
    {
        fHead = head;
        return this;
    }

  protected:
    void Write(const std::string& text) const { fWrite(text); }

    const TFormatOptions fOptions;
    TDocumentHead fHead;
    std::string fProvider;
    std::size_t fClassCount = 0;
    std::size_t fInstanceCount = 0;

  private:
    TDocumentWriter fWrite;
};

// One JSON object a line: a class record before the instances of a class, which they refer to by name; a record an
// instance, which stands on its own; a closing record, without which the document is not whole.
class TNdjsonFormat : public TStreamFormat
{
  public:
    using TStreamFormat::TStreamFormat;

    void BeginClass(const std::string& provider, const TClassRecord& each) override
    {
        fProvider = provider;
        ++fClassCount;
        TJson json = Record("class");
        json["class"] = each.fName;
        MarkPartial(json, each);
        json["superclass"] = each.fAncestors.empty() ? TJson() : TJson(each.fAncestors.front());
        json["properties"] = JsonDeclarations(each);
        Write(JsonText(json, -1));
    }

    void Add(const TClassRecord& each, const TInstanceRecord& instance) override
    {
        ++fInstanceCount;
        TJson json = Record("instance");
        json["class"] = each.fName;
        json["path"] = instance.fPath;
        json["key"] = TJson::object();
        for (const TPropertyRecord& property : instance.fProperties) {
            const TPropertyDeclRecord* const declaration = each.Find(property.fName);
            if (declaration && declaration->fIsKey) {
                json["key"][property.fName] = JsonValue(property.fValue);
            }
        }
        json["properties"] = JsonProperties(each, instance, fOptions);
        Write(JsonText(json, -1));
    }

    std::string Finish(const TDocument& document) override
    {
        fHead = document.fHead;
        fProvider.clear();
        const std::string differences = document.fComparison ? DifferenceRecords(*document.fComparison) : "";
        TJson json = Record("end");
        json["tool"] = {{"name", "vrxhost"}, {"version", VRX_VERSION}};
        json["command"] = fHead.fCommand;
        json["hostFacts"] = JsonHost(fHead.fHost);
        json["classes"] = fClassCount;
        json["instances"] = fInstanceCount;
        AddLosses(json, document);
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                if (each.fIsPartial) {
                    json["partial"].push_back({{"provider", provider.fName}, {"class", each.fName}});
                }
            }
        }
        if (document.fComparison) {
            const TComparison& compared = *document.fComparison;
            json["compared"] = {{"from", compared.fFrom}, {"to", compared.fTo}};
            json["differences"] = compared.fDifferences.size();
        }
        return differences + JsonText(json, -1);
    }

  private:
    std::string DifferenceRecords(const TComparison& comparison)
    {
        std::string lines;
        for (const TDifference& each : comparison.fDifferences) {
            TJson json = Record("difference");
            json["difference"] = JsonDifference(each);
            lines += JsonText(json, -1);
        }
        return lines;
    }

    TJson Record(const char* kind)
    {
        ++fRecordCount;
        TJson json = {{"record", kind}, {"format", kFormatVersion}};
        json["host"] = fHead.fHost.fMachineId.empty() ? fHead.fHost.fName : fHead.fHost.fMachineId;
        if (!fOptions.fStable) {
            json["run"] = fHead.fRunId;
            json["seq"] = fRecordCount;
            json["time"] = TimeNow();
        }
        if (!fProvider.empty()) {
            json["provider"] = fProvider;
        }
        return json;
    }

    std::size_t fRecordCount = 0;
};

// One property a line, since classes differ in their columns (RFC 4180, lines end with a line feed).
class TCsvFormat : public TStreamFormat
{
  public:
    using TStreamFormat::TStreamFormat;

    IInstanceSink* BeginStream(const TDocumentHead& head) override
    {
        Write("provider,class,path,property,type,value,text\n");
        return TStreamFormat::BeginStream(head);
    }

    void BeginClass(const std::string& provider, const TClassRecord&) override { fProvider = provider; }

    void Add(const TClassRecord& each, const TInstanceRecord& instance) override
    {
        std::string lines;
        for (const TPropertyRecord& property : instance.fProperties) {
            if (property.fValue.IsNull() || !IsKept(each, property, fOptions)) {
                continue;
            }
            const TPropertyDeclRecord* const declaration = each.Find(property.fName);
            lines += Quoted(fProvider) + "," + Quoted(each.fName) + "," + Quoted(instance.fPath) + "," +
                     Quoted(property.fName) + "," + (declaration ? declaration->fType : "") + "," +
                     ValueField(property.fValue) + "," + Quoted(property.fText) + "\n";
        }
        Write(lines);
    }

    // A class that was given up is a line without path.
    std::string Finish(const TDocument& document) override
    {
        if (document.fComparison) {
            return ComparisonLines(*document.fComparison);
        }
        std::string lines;
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                lines += each.fIsPartial
                             ? Quoted(provider.fName) + "," + Quoted(each.fName) + ",,partial,boolean,true,\n"
                             : "";
            }
        }
        return lines;
    }

  private:
    // What a side lacks is an empty field, as its null.
    static std::string ComparisonLines(const TComparison& comparison)
    {
        std::string lines = "class,path,property,kind,from,to,reason\n";
        for (const TDifference& each : comparison.fDifferences) {
            lines += Quoted(each.fClass) + "," + Quoted(each.fPath) + "," + Quoted(each.fDeclaration.fName) + "," +
                     NameOf(each.fKind) + "," + ValueField(each.fFrom.fValue) + "," + ValueField(each.fTo.fValue) +
                     "," + Quoted(each.fReason) + "\n";
        }
        return lines;
    }

    // A text as it is, everything else as in JSON.
    static std::string ValueField(const NKOLVRX20::TCIMValue& value)
    {
        if (value.IsNull()) {
            return "";
        }
        const std::string json = JsonText(JsonValue(value), -1);
        const bool isText = !value.IsArray() && json.front() == '"';
        return Quoted(isText ? value.ToString(10) : json.substr(0, json.size() - 1));
    }

    // Control bytes as escapes, so that a record stays one line.
    static std::string Quoted(const std::string& field)
    {
        const std::string text = Printable(field);
        if (text.find_first_of(",\"") == std::string::npos) {
            return text;
        }
        std::string quoted = "\"";
        for (const char c : text) {
            quoted += c == '"' ? "\"\"" : std::string(1, c);
        }
        return quoted + "\"";
    }
};

} // namespace

IInstanceSink* IFormat::BeginStream(const TDocumentHead&)
{
    return nullptr;
}

std::unique_ptr<IFormat> MakeNdjsonFormat(const TFormatOptions& options, TDocumentWriter write)
{
    return std::make_unique<TNdjsonFormat>(options, std::move(write));
}

std::unique_ptr<IFormat> MakeCsvFormat(const TFormatOptions& options, TDocumentWriter write)
{
    return std::make_unique<TCsvFormat>(options, std::move(write));
}

std::vector<std::string> FormatNames()
{
    return {"table", "tree", "json", "ndjson", "csv", "html"};
}

std::unique_ptr<IFormat> MakeFormat(const std::string& name, const TFormatOptions& options, TDocumentWriter write)
{
    if (name == "tree") {
        return MakeTreeFormat(options);
    }
    if (name == "json") {
        return MakeJsonFormat(options, std::move(write));
    }
    if (name == "ndjson") {
        return MakeNdjsonFormat(options, std::move(write));
    }
    if (name == "html") {
        return MakeHtmlFormat(options, std::move(write));
    }
    return name == "csv" ? MakeCsvFormat(options, std::move(write)) : MakeTableFormat(options, std::move(write));
}

} // namespace vrxhost
