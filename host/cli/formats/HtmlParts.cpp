// SPDX-License-Identifier: MIT
#include "host/cli/formats/HtmlParts.h"

#include "host/cli/formats/HtmlPage.h"
#include "host/cli/formats/HtmlText.h"
#include "host/cli/formats/ValueText.h"

namespace vrxhost {
namespace {

std::string TreeItems(const std::vector<TLinkedObject>& objects)
{
    std::string items;
    for (const TLinkedObject& object : objects) {
        items += "<li>" + HtmlText(PathLabel(object.fPath)) +
                 (object.fParts.empty() ? "" : "\n<ul>\n" + TreeItems(object.fParts) + "</ul>\n") + "</li>\n";
    }
    return items;
}

std::string LossItem(const TLoss& loss)
{
    std::string item = HtmlText(loss.GetText());
    std::string about;
    for (const auto& [label, text] : THtmlFacts{{"vendor", loss.fVendor},
                                                {"file", loss.fFile},
                                                {"property", loss.fProperty},
                                                {"classes", JoinNames(loss.fClasses)}})
    {
        if (!text.empty()) {
            about += std::string(about.empty() ? "" : ", ") + label + " " + HtmlText(text);
        }
    }
    item += about.empty() ? "" : "<br><small>" + about + "</small>";
    for (const std::string& line : loss.fLog) {
        item += "<br>" + HtmlElement("code", line);
    }
    return "<li>" + item + "</li>\n";
}

std::string LossList(const std::vector<TLoss>& losses, bool areNotes)
{
    std::string items;
    for (const TLoss& loss : losses) {
        items += loss.fIsNote == areNotes ? LossItem(loss) : "";
    }
    const std::string heading = areNotes ? "Notes" : "Missing";
    return items.empty() ? "" : HtmlElement("h2", heading) + "\n<ul>\n" + items + "</ul>\n";
}

std::string ParameterTexts(const TMethodRecord& method)
{
    std::vector<std::string> parameters;
    for (const TParameterRecord& parameter : method.fParameters) {
        parameters.push_back(std::string(!parameter.fIsOut ? ""
                                         : parameter.fIsIn ? "in out "
                                                           : "out ") +
                             parameter.fType + " " + parameter.fName);
    }
    return JoinNames(parameters);
}

} // namespace

std::string HtmlPageBegin(const TDocumentHead& head)
{
    const std::string policy = std::string("default-src 'none'; base-uri 'none'; form-action 'none'; style-src "
                                           "'sha256-") +
                               kPageStyleHash + "'; script-src 'sha256-" + kPageScriptHash + "'";
    return "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
           "<meta http-equiv=\"Content-Security-Policy\" content=\"" +
           policy +
           "\">\n<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
           "<meta name=\"color-scheme\" content=\"light dark\">\n" +
           HtmlElement("title", head.fHost.fName + ": vrxhost " + head.fCommand) + "\n<style>" + kPageStyle +
           "</style>\n</head>\n<body>\n";
}

std::string HtmlFacts(const THtmlFacts& facts)
{
    std::string rows;
    for (const auto& [label, text] : facts) {
        if (!text.empty()) {
            rows += "<tr>" + HtmlElement("th scope=\"row\"", label) + HtmlElement("td", text) + "</tr>\n";
        }
    }
    return "<table class=\"facts\">\n" + rows + "</table>\n";
}

std::string HtmlDeclaration(const TClassRecord& each)
{
    std::string rows;
    for (const TPropertyDeclRecord& property : each.fProperties) {
        rows += "<tr>" + HtmlElement("th scope=\"row\"", property.fName) + HtmlElement("td", property.fType) +
                HtmlElement("td", property.fIsKey ? "key" : "") +
                HtmlElement("td", property.fUnits.empty() ? property.fPUnit : property.fUnits) +
                HtmlElement("td", ValueList(property)) + HtmlElement("td", property.fDescription) + "</tr>\n";
    }
    std::string methods;
    for (const TMethodRecord& method : each.fMethods) {
        methods +=
            HtmlElement("li", method.fReturnType + " " + method.fName + "(" + ParameterTexts(method) + ")") + "\n";
    }
    return "<section>\n" +
           HtmlElement("h2", each.fName + (each.fAncestors.empty() ? "" : " : " + each.fAncestors.front())) +
           "\n<div class=\"scroll\"><table>\n<thead><tr><th scope=\"col\">Property</th><th scope=\"col\">Type</th>"
           "<th scope=\"col\">Key</th><th scope=\"col\">Unit</th><th scope=\"col\">Values</th>"
           "<th scope=\"col\">Description</th></tr></thead>\n<tbody>\n" +
           rows + "</tbody>\n</table></div>\n" + (methods.empty() ? "" : "<ul>\n" + methods + "</ul>\n") +
           "</section>\n";
}

std::string HtmlPageEnd()
{
    return std::string("<script>") + kPageScript + "</script>\n</body>\n</html>\n";
}

std::string HtmlLosses(const std::vector<TLoss>& losses)
{
    return LossList(losses, false) + LossList(losses, true);
}

std::string HtmlDevices(const std::vector<TLinkedObject>& objects)
{
    const std::string items = TreeItems(objects);
    return items.empty() ? "" : "<h2>Devices</h2>\n<ul id=\"devices\">\n" + items + "</ul>\n";
}

} // namespace vrxhost
