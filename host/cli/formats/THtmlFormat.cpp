// SPDX-License-Identifier: MIT
// One page that needs nothing else: tables of instances, written while these arrive, then what is known at the end.
#include "host/cli/formats/Differences.h"
#include "host/cli/formats/HtmlParts.h"
#include "host/cli/formats/HtmlText.h"
#include "host/cli/formats/IFormat.h"
#include "host/cli/formats/ValueText.h"

#include <algorithm>
#include <set>
#include <utility>

namespace vrxhost {
namespace {

constexpr std::size_t kColumnRows = 1000; // decide on the columns of a class; held back until then

class THtmlFormat : public IFormat, public IInstanceSink
{
  public:
    THtmlFormat(const TFormatOptions& options, TDocumentWriter write) : fOptions(options), fWrite(std::move(write)) {}

    IInstanceSink* BeginStream(const TDocumentHead& head) override
    {
        fIsStreaming = true;
        fWrite(Beginning(head));
        return this;
    }

    void BeginClass(const std::string& provider, const TClassRecord& each) override
    {
        fProvider = provider;
        fClass = each;
        fCount = 0;
    }

    void Add(const TClassRecord&, const TInstanceRecord& instance) override
    {
        if (fClass.fInstances.size() == kColumnRows) {
            fWrite(Rows(false));
        }
        fClass.fInstances.push_back(instance);
    }

    void EndClass(const TClassRecord&) override
    {
        if (fCount > 0 || !fClass.fInstances.empty()) {
            fWrite(Rows(true));
        }
        fContents.push_back({fProvider, fClass.fName, fCount});
    }

    std::string Finish(const TDocument& document) override
    {
        std::string page = fIsStreaming ? "" : Beginning(document.fHead);
        if (!fIsStreaming) {
            fWrite = [&page](const std::string& text) { page += text; };
            AddInstances(document);
        }
        if (document.fDetail == EDetail::kDeclarations) {
            for (const TProviderRecord& provider : document.fProviders) {
                for (const TClassRecord& each : provider.fClasses) {
                    page += HtmlDeclaration(each);
                }
            }
        }
        return page + "</main>\n" + Result(document) + HtmlPageEnd();
    }

  private:
    std::string Beginning(const TDocumentHead& head) const
    {
        const THostFacts& host = head.fHost;
        return HtmlPageBegin(head) + "<header>\n" + HtmlElement("h1", host.fName) + "\n" +
               HtmlFacts({{"Product", host.fProduct},
                          {"Serial number", host.fSerial},
                          {"Machine id", host.fMachineId},
                          {"Time", fOptions.fStable ? "" : head.fStarted},
                          {"Made by", "vrxhost " VRX_VERSION " " + head.fCommand}}) +
               "<p><a href=\"#result\">Result, what is missing, classes and devices</a></p>\n"
               "<p class=\"search\" hidden><label>Search <input type=\"search\"></label> "
               "<output aria-live=\"polite\"></output></p>\n</header>\n<main>\n";
    }

    void AddInstances(const TDocument& document)
    {
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                if (document.fDetail == EDetail::kInstances) {
                    BeginClass(provider.fName, each);
                    EndClass(each);
                }
            }
        }
    }

    std::string Id() const { return "c" + std::to_string(fContents.size() + 1); }

    // The table's rows that were held back; its beginning before the first, its end after the last.
    std::string Rows(bool isLast)
    {
        std::string text;
        if (fCount == 0) {
            fColumns = ShownColumns(fClass, fOptions);
            fHasRest = !isLast;
            text = TableHead();
        }
        for (const TInstanceRecord& instance : fClass.fInstances) {
            text += Row(instance);
            if (fClass.fIsAssociation) {
                fLinks.Add(fClass, instance);
            }
        }
        fCount += fClass.fInstances.size();
        fClass.fInstances.clear();
        return text + (isLast ? "</tbody>\n</table></div>\n</section>\n" : "");
    }

    std::string TableHead() const
    {
        std::string heads;
        for (const std::string& column : fColumns) {
            heads += HtmlElement("th scope=\"col\"", column);
        }
        heads += fHasRest ? "<th scope=\"col\">Other properties</th>" : "";
        return "<section" + HtmlAttribute("id", Id()) + ">\n" +
               HtmlElement("h2" + HtmlAttribute("id", Id() + "-name"), fClass.fName) +
               "\n<div class=\"scroll\" role=\"region\" tabindex=\"0\"" +
               HtmlAttribute("aria-labelledby", Id() + "-name") + "><table class=\"instances\">\n" +
               HtmlElement("caption",
                           "Instances of " + fClass.fName + (fProvider.empty() ? "" : ", provider " + fProvider)) +
               "\n<thead><tr>" + heads + "</tr></thead>\n<tbody>\n";
    }

    std::string Row(const TInstanceRecord& instance) const
    {
        std::string cells;
        for (const std::string& column : fColumns) {
            const TPropertyRecord* const property = instance.Find(column);
            const bool isShown = property && IsShown(fClass, *property, fOptions);
            cells += isShown ? Cell(*property, cells.empty()) : HtmlElement(CellTag(cells.empty()), "");
        }
        std::vector<std::string> rest;
        for (const TPropertyRecord& property : instance.fProperties) {
            if (fHasRest && IsShown(fClass, property, fOptions) &&
                std::find(fColumns.begin(), fColumns.end(), property.fName) == fColumns.end())
            {
                rest.push_back(property.fName + ": " + ValueText(property, fClass.Find(property.fName), fOptions));
            }
        }
        return "<tr>" + cells + (fHasRest ? HtmlElement("td", JoinNames(rest)) : "") + "</tr>\n";
    }

    std::string Cell(const TPropertyRecord& property, bool isFirst) const
    {
        const TPropertyDeclRecord* const declaration = fClass.Find(property.fName);
        const std::string number = ShownNumber(property, declaration);
        return HtmlElement(CellTag(isFirst) + (number.empty() ? "" : HtmlAttribute("data-number", number)),
                           ValueText(property, declaration, fOptions));
    }

    // The first column tells the instances apart.
    static std::string CellTag(bool isFirst) { return isFirst ? "th scope=\"row\"" : "td"; }

    // Known at the end; the style sheet puts it first.
    std::string Result(const TDocument& document) const
    {
        std::string text = "<section id=\"result\">\n";
        text += document.fComplete ? "<p class=\"complete\">Complete: nothing is missing.</p>\n"
                                   : "<p class=\"partial\">Partial: something is missing.</p>\n";
        THtmlFacts facts;
        for (const TFact& fact : document.fFacts) {
            facts.emplace_back(fact.fLabel.c_str(), fact.fText);
        }
        for (const TInvocation& invocation : document.fInvocations) {
            facts.emplace_back("Method", invocation.fMethod);
            facts.emplace_back("Returned", ResultText(invocation.fReturned));
            for (const TPropertyRecord& output : invocation.fOutputs) {
                facts.emplace_back(output.fName.c_str(), ResultText(output));
            }
        }
        for (const TCheck& check : document.fChecks) {
            facts.emplace_back(check.fSubject, CheckText(check, fOptions));
            facts.emplace_back("To do", check.fAdvice);
        }
        text += facts.empty() ? "" : HtmlFacts(facts);
        text += document.fComparison ? HtmlElement("pre", DifferenceLines(*document.fComparison, fOptions)) + "\n" : "";
        text += HtmlLosses(document.fLosses) + Contents(document);
        return text + HtmlDevices(fLinks.GetObjects()) + "</section>\n";
    }

    static std::string ResultText(const TPropertyRecord& value)
    {
        return value.fValue.IsNull() ? "null" : value.fText.empty() ? value.fValue.ToString(10) : value.fText;
    }

    // What there is, with the way to it; for a command that shows names alone, the names.
    std::string Contents(const TDocument& document) const
    {
        std::string rows;
        std::size_t number = 0;
        std::set<std::pair<std::string, std::string>> partial;
        for (const TProviderRecord& provider : document.fProviders) {
            for (const TClassRecord& each : provider.fClasses) {
                if (each.fIsPartial) {
                    partial.emplace(provider.fName, each.fName);
                }
            }
        }
        for (const auto& [provider, name, count] : fContents) {
            const std::string id = "c" + std::to_string(++number);
            const std::string link =
                count == 0 ? HtmlText(name) : HtmlElement("a" + HtmlAttribute("href", "#" + id), name);
            rows += "<tr><th scope=\"row\">" + link + "</th>" + HtmlElement("td", provider) +
                    HtmlElement(
                        "td", (document.fDetail == EDetail::kInstances ? std::to_string(count) : "") +
                                  (partial.count({provider, name}) > 0 ? ", partial: the provider was given up" : "")) +
                    "</tr>\n";
        }
        if (document.fDetail == EDetail::kNames) {
            for (const TProviderRecord& provider : document.fProviders) {
                for (const TClassRecord& each : provider.fClasses) {
                    rows += "<tr>" + HtmlElement("th scope=\"row\"", each.fName) + HtmlElement("td", provider.fName) +
                            "<td></td></tr>\n";
                }
            }
        }
        return rows.empty()
                   ? ""
                   : "<h2>Classes</h2>\n<table id=\"classes\">\n<thead><tr><th scope=\"col\">Class</th>"
                     "<th scope=\"col\">Provider</th><th scope=\"col\">Instances</th></tr></thead>\n<tbody>\n" +
                         rows + "</tbody>\n</table>\n";
    }

    struct TEntry
    {
        std::string fProvider;
        std::string fClass;
        std::size_t fCount;
    };

    const TFormatOptions fOptions;
    TDocumentWriter fWrite;
    bool fIsStreaming = false;
    std::string fProvider;
    TClassRecord fClass;    // with the rows that are held back
    std::size_t fCount = 0; // rows that were written
    std::vector<std::string> fColumns;
    bool fHasRest = false; // a last column for what the first rows lacked
    std::vector<TEntry> fContents;
    TLinks fLinks;
};

} // namespace

std::unique_ptr<IFormat> MakeHtmlFormat(const TFormatOptions& options, TDocumentWriter write)
{
    return std::make_unique<THtmlFormat>(options, std::move(write));
}

} // namespace vrxhost
