// SPDX-License-Identifier: MIT
// Text for people.
#include "host/cli/formats/AssociationTree.h"
#include "host/cli/formats/Differences.h"
#include "host/cli/formats/TextLayout.h"
#include "host/cli/formats/ValueText.h"
#include "host/cli/model/Printable.h"

#include <algorithm>

namespace vrxhost {
namespace {

constexpr std::size_t kInstancesOfATable = 5; // fewer are shown one below the other
constexpr std::size_t kTypeWidth = 11;
const std::string kDetailIndent(6, ' '); // of what a declaration says about a property
// Held back until their class ends, so that its heading counts them and a tree holds them all. The rows of a class with
// more go out in tables of so many.
constexpr std::size_t kHeldInstances = 1000;

class TTableFormat : public IFormat, public IInstanceSink
{
  public:
    TTableFormat(const TFormatOptions& options, TDocumentWriter write) : fOptions(options), fWrite(std::move(write)) {}

    IInstanceSink* BeginStream(const TDocumentHead& head) override;
    void BeginProvider(const TProviderRecord& provider, std::size_t classCount) override;
    void BeginClass(const std::string& provider, const TClassRecord& each) override;
    void Add(const TClassRecord& each, const TInstanceRecord& instance) override;
    void EndClass(const TClassRecord& each) override;
    std::string Finish(const TDocument& document) override;

  private:
    std::string Heading(const std::string& text) const;
    std::string Providers(const TDocument& document) const;
    std::string Provider(const TProviderRecord& provider, EDetail detail) const;
    std::string ProviderHeading(const TProviderRecord& provider, std::size_t classCount) const;
    std::string Class(const TClassRecord& each, EDetail detail, const std::string& indent) const;
    std::string Instances(const TClassRecord& each, const std::string& indent) const;
    std::string InstanceLines(const TClassRecord& each, const TInstanceRecord& instance,
                              const std::string& indent) const;
    std::string InstanceTable(const TClassRecord& each, const std::string& indent) const;
    std::string Declaration(const TClassRecord& each) const;
    std::string Invocation(const TInvocation& invocation) const;

    const TFormatOptions fOptions;
    const TDocumentWriter fWrite;
    bool fIsStreaming = false;
    std::string fIndent;      // of a streamed class: below its provider
    TClassRecord fClass;      // with the instances that are held back
    bool fHasWritten = false; // some of its instances
};

std::string ParameterList(const TMethodRecord& method)
{
    std::string list;
    for (const auto& parameter : method.fParameters) {
        const char* const direction = !parameter.fIsOut ? "" : parameter.fIsIn ? "in out " : "out ";
        list += (list.empty() ? "" : ", ") + std::string(direction) + parameter.fType + " " + parameter.fName;
    }
    return list;
}

std::string PartialText(const TClassRecord& each)
{
    return each.fIsPartial ? ", partial: the provider was given up" : "";
}

std::string ClassLine(const TClassRecord& each)
{
    return each.fName + (each.fAncestors.empty() ? "" : " : " + each.fAncestors.front());
}

std::string DeclarationLines(const TClassRecord& each)
{
    std::string out = "  " + ClassLine(each) + "\n";
    for (const auto& property : each.fProperties) {
        out += "    " + Padded(property.fType, kTypeWidth) + property.fName + (property.fIsKey ? "  [key]" : "") + "\n";
    }
    for (const auto& method : each.fMethods) {
        out += "    " + Padded(method.fReturnType, kTypeWidth) + method.fName + "(" + ParameterList(method) + ")\n";
    }
    return out;
}

// Classes below their superclasses, each name once.
std::string ClassTree(const std::vector<TProviderRecord>& providers)
{
    std::vector<std::vector<std::string>> lines; // from the top of the hierarchy down
    for (const TProviderRecord& provider : providers) {
        for (const TClassRecord& each : provider.fClasses) {
            std::vector<std::string> names(each.fAncestors.rbegin(), each.fAncestors.rend());
            names.push_back(each.fName);
            lines.push_back(std::move(names));
        }
    }
    std::sort(lines.begin(), lines.end());
    std::string text;
    std::vector<std::string> above;
    for (const auto& names : lines) {
        const auto common = std::mismatch(names.begin(), names.end(), above.begin(), above.end()).first;
        for (auto name = common; name != names.end(); ++name) {
            text += std::string(2 * static_cast<std::size_t>(name - names.begin()), ' ') + *name + "\n";
        }
        above = names;
    }
    return text;
}

// A line for each part that is well; of the others what is wrong, what to do and what the server's log says.
std::string CheckLines(const std::vector<TCheck>& checks, const TFormatOptions& options)
{
    std::vector<TLabelled> rows;
    for (const TCheck& check : checks) {
        rows.push_back({check.fSubject, Printable(CheckText(check, options))});
        if (!check.fAdvice.empty()) {
            rows.push_back({"  to do", Printable(check.fAdvice)});
        }
        for (const std::string& line : check.fLog) {
            rows.push_back({"  server log", Printable(line)});
        }
    }
    return LabelledLines(rows, "", options.fWidth);
}

// Only where the document is about instances; the others are short.
IInstanceSink* TTableFormat::BeginStream(const TDocumentHead& head)
{
    fIsStreaming = head.fCommand == "inventory" || head.fCommand == "instances";
    return fIsStreaming ? this : nullptr;
}

void TTableFormat::BeginProvider(const TProviderRecord& provider, std::size_t classCount)
{
    fWrite((fIndent.empty() ? "" : "\n") + ProviderHeading(provider, classCount));
    fIndent = "  ";
}

void TTableFormat::BeginClass(const std::string&, const TClassRecord& each)
{
    fClass = each;
    fHasWritten = false;
}

void TTableFormat::Add(const TClassRecord&, const TInstanceRecord& instance)
{
    if (fClass.fInstances.size() == kHeldInstances) {
        fWrite((fHasWritten
                    ? "\n"
                    : fIndent + Heading(fClass.fName) + ": more than " + Counted(kHeldInstances, "instance") + "\n") +
               InstanceTable(fClass, fIndent + "  "));
        fClass.fInstances.clear();
        fHasWritten = true;
    }
    fClass.fInstances.push_back(instance);
}

void TTableFormat::EndClass(const TClassRecord& each)
{
    fClass.fIsPartial = each.fIsPartial;
    if (!fHasWritten) {
        fWrite(Instances(fClass, fIndent));
        return;
    }
    fWrite("\n" + InstanceTable(fClass, fIndent + "  ") + fIndent + Heading(fClass.fName) + ": " +
           Counted(each.fInstanceCount, "instance") + " in all" + PartialText(each) + "\n");
}

std::string TTableFormat::Finish(const TDocument& document)
{
    if (fIsStreaming) {
        return "";
    }
    if (!document.fChecks.empty()) {
        return CheckLines(document.fChecks, fOptions);
    }
    if (document.fComparison) {
        return DifferenceLines(*document.fComparison, fOptions);
    }
    if (!document.fFacts.empty()) {
        std::vector<TLabelled> rows;
        for (const TFact& fact : document.fFacts) {
            rows.push_back({fact.fLabel, Printable(fact.fText)});
        }
        return LabelledLines(rows, "", fOptions.fWidth);
    }
    if (!document.fInvocations.empty()) {
        return Invocation(document.fInvocations.front());
    }
    return document.fIsTree ? ClassTree(document.fProviders) : Providers(document);
}

std::string TTableFormat::Heading(const std::string& text) const
{
    return fOptions.fColor ? "\x1b[1m" + text + "\x1b[0m" : text;
}

std::string TTableFormat::Providers(const TDocument& document) const
{
    std::string out;
    for (const auto& provider : document.fProviders) {
        out += out.empty() ? "" : "\n";
        if (!document.fIsOneClass) {
            out += Provider(provider, document.fDetail);
        } else if (!provider.fClasses.empty()) {
            const TClassRecord& each = provider.fClasses.front();
            out += document.fDetail == EDetail::kInstances ? Instances(each, "") : Declaration(each);
        }
    }
    return out;
}

std::string TTableFormat::Provider(const TProviderRecord& provider, EDetail detail) const
{
    std::string out = ProviderHeading(provider, provider.fClasses.size());
    for (const auto& each : provider.fClasses) {
        out += Class(each, detail, "  ");
    }
    return out;
}

std::string TTableFormat::ProviderHeading(const TProviderRecord& provider, std::size_t classCount) const
{
    return Heading("Provider " + (provider.fName.empty() ? "without a name" : Printable(provider.fName))) + " (" +
           Printable(provider.fModule) + "): " + Counted(classCount, "class") + "\n";
}

std::string TTableFormat::Class(const TClassRecord& each, EDetail detail, const std::string& indent) const
{
    switch (detail) {
    case EDetail::kInstances:
        return Instances(each, indent);
    case EDetail::kDeclarations:
        return DeclarationLines(each);
    default:
        return indent + each.fName + "\n";
    }
}

std::string TTableFormat::Instances(const TClassRecord& each, const std::string& indent) const
{
    std::string out =
        indent + Heading(each.fName) + ": " + Counted(each.fInstances.size(), "instance") + PartialText(each) + "\n";
    if (each.fIsAssociation && !fOptions.fRaw) {
        TLinks links;
        bool areLinks = true;
        for (const TInstanceRecord& instance : each.fInstances) {
            areLinks &= links.Add(each, instance);
        }
        if (areLinks) {
            return out + AssociationTree(links.GetObjects(), indent + "  ");
        }
    }
    if (each.fInstances.size() >= kInstancesOfATable) {
        return out + InstanceTable(each, indent + "  ");
    }
    std::size_t number = 0;
    for (const auto& instance : each.fInstances) {
        out += indent + "  #" + std::to_string(++number) + "\n" + InstanceLines(each, instance, indent + "    ");
    }
    return out;
}

std::string TTableFormat::InstanceLines(const TClassRecord& each, const TInstanceRecord& instance,
                                        const std::string& indent) const
{
    std::vector<TLabelled> rows;
    for (const auto& property : instance.fProperties) {
        if (IsShown(each, property, fOptions)) {
            rows.push_back({property.fName, ValueText(property, each.Find(property.fName), fOptions)});
        }
    }
    return LabelledLines(rows, indent, fOptions.fWidth);
}

std::string TTableFormat::InstanceTable(const TClassRecord& each, const std::string& indent) const
{
    const std::vector<std::string> headings = ShownColumns(each, fOptions);
    std::vector<std::vector<std::string>> rows;
    for (const auto& instance : each.fInstances) {
        std::vector<std::string> row;
        for (const std::string& name : headings) {
            const TPropertyRecord* const property = instance.Find(name);
            row.push_back(property ? ValueText(*property, each.Find(name), fOptions) : "");
        }
        rows.push_back(std::move(row));
    }
    return TableBlocks(headings, rows, indent, fOptions.fWidth);
}

std::string TTableFormat::Declaration(const TClassRecord& each) const
{
    std::vector<TLabelled> qualifiers;
    for (const TQualifierRecord& qualifier : each.fQualifiers) {
        qualifiers.push_back({"[" + qualifier.fName + "]", Printable(qualifier.fText)});
    }
    std::string out = Heading(ClassLine(each)) + "\n" + LabelledLines(qualifiers, "  ", fOptions.fWidth);
    for (const TPropertyDeclRecord& property : each.fProperties) {
        out += "\n  " + std::string(property.fIsKey ? "[key] " : "") + property.fType + " " + property.fName + "\n";
        for (const std::string& line : Folded(Printable(property.fDescription),
                                              fOptions.fWidth - std::min(fOptions.fWidth / 2, kDetailIndent.size())))
        {
            out += line.empty() ? "" : kDetailIndent + line + "\n";
        }
        std::vector<TLabelled> rows = {{"unit", property.fUnits.empty() ? property.fPUnit : property.fUnits},
                                       {"values", Printable(ValueList(property))},
                                       {"counter", property.fIsCounter ? "yes" : ""}};
        rows.erase(std::remove_if(rows.begin(), rows.end(), [](const TLabelled& row) { return row.fText.empty(); }),
                   rows.end());
        out += LabelledLines(rows, kDetailIndent, fOptions.fWidth);
    }
    for (const TMethodRecord& method : each.fMethods) {
        out += "\n  " + method.fReturnType + " " + method.fName + "(" + ParameterList(method) + ")\n";
    }
    return out;
}

std::string TTableFormat::Invocation(const TInvocation& invocation) const
{
    std::vector<TPropertyRecord> values = {invocation.fReturned};
    values.insert(values.end(), invocation.fOutputs.begin(), invocation.fOutputs.end());
    std::vector<TLabelled> rows;
    for (const TPropertyRecord& value : values) {
        const std::string plain = value.fValue.IsNull() ? "null" : value.fValue.ToString(10);
        const bool hasText = !value.fText.empty() && value.fText != plain && !value.fValue.IsArray();
        rows.push_back({value.fName, Printable(hasText               ? plain + " (" + value.fText + ")"
                                               : value.fText.empty() ? plain
                                                                     : value.fText)});
    }
    return LabelledLines(rows, "", fOptions.fWidth);
}

} // namespace

std::unique_ptr<IFormat> MakeTableFormat(const TFormatOptions& options, TDocumentWriter write)
{
    return std::make_unique<TTableFormat>(options, std::move(write));
}

} // namespace vrxhost
