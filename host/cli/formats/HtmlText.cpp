// SPDX-License-Identifier: MIT
#include "host/cli/formats/HtmlText.h"

#include "host/cli/model/Printable.h"

namespace vrxhost {
namespace {

std::string Escaped(char c)
{
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return "&quot;";
    case '\'':
        return "&#39;";
    default:
        return std::string(1, c);
    }
}

} // namespace

std::string HtmlText(const std::string& text)
{
    std::string html;
    for (const char c : Printable(text)) {
        html += Escaped(c);
    }
    return html;
}

std::string HtmlElement(const std::string& tag, const std::string& text)
{
    return "<" + tag + ">" + HtmlText(text) + "</" + tag.substr(0, tag.find(' ')) + ">";
}

std::string HtmlAttribute(const std::string& name, const std::string& value)
{
    return " " + name + "=\"" + HtmlText(value) + "\"";
}

} // namespace vrxhost
