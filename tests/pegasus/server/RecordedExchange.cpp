// SPDX-License-Identifier: MIT
#include "tests/pegasus/server/RecordedExchange.h"

#include "pegasus/base/PercentCoding.h"
#include "pegasus/wire/XmlDocument.h"
#include "tests/support/VectorsFolder.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <regex>
#include <sstream>
#include <stdexcept>

namespace servertest {

using Pegasus::wire::XmlDocument;
using Pegasus::wire::XmlElement;

namespace {

std::string contentOf(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        throw std::runtime_error("no recording " + path);
    }
    return {std::istreambuf_iterator<char>(file), {}};
}

// A recorded answer, in the form that a live one has.
HttpAnswer parseAnswer(const std::string& bytes)
{
    HttpAnswer answer;
    const std::size_t head = bytes.find("\r\n\r\n");
    std::istringstream lines(bytes.substr(0, head));
    std::getline(lines, answer.statusLine);
    answer.statusLine = answer.statusLine.substr(0, answer.statusLine.find('\r'));
    answer.status = answer.statusLine.size() > 9 ? std::atoi(answer.statusLine.c_str() + 9) : 0;
    const auto readFields = [](std::istream& from, std::map<std::string, std::string>& to) {
        for (std::string line; std::getline(from, line);) {
            const std::size_t colon = line.find(": ");
            if (colon == std::string::npos) {
                continue;
            }
            std::string name = line.substr(0, colon);
            std::transform(name.begin(), name.end(), name.begin(), [](unsigned char c) { return std::tolower(c); });
            to[name] = line.substr(colon + 2, line.find('\r') - colon - 2);
        }
    };
    readFields(lines, answer.headers);
    std::size_t at = head == std::string::npos ? bytes.size() : head + 4;
    if (answer.headers.count("transfer-encoding") == 0) {
        answer.body = bytes.substr(at);
        return answer;
    }
    for (std::size_t size; (size = std::strtoul(bytes.c_str() + at, nullptr, 16)) != 0;) {
        at = bytes.find("\r\n", at) + 2;
        answer.body += bytes.substr(at, size);
        at += size + 2;
    }
    std::istringstream trailers(bytes.substr(at));
    readFields(trailers, answer.trailers);
    return answer;
}

void appendCanonical(std::string& out, const XmlElement& element, int depth, Order order);

// The text of a VALUE; an embedded instance is taken apart where order is
// ignored, since that holds inside it too.
std::string canonicalText(std::string text, int depth, Order order)
{
    if (order == Order::kSorted) {
        text.erase(text.find_last_not_of(' ') + 1);
        text.erase(0, text.find_first_not_of(' '));
    }
    if (order == Order::kAsSent || text.rfind("<INSTANCE ", 0) != 0) {
        return ": " + text;
    }
    XmlDocument document;
    std::string out = "\n";
    appendCanonical(out, document.parseFragment(text), depth + 1, order);
    return out;
}

// What a CMPI instance has from its class, and the instance of a provider in C++ lacks.
bool isOfClassOnly(std::string_view attribute)
{
    return attribute == "PROPAGATED" || attribute == "ARRAYSIZE";
}

void appendCanonical(std::string& out, const XmlElement& element, int depth, Order order)
{
    static constexpr std::string_view kNames[] = {"ARRAYSIZE",   "ASSOCIATION",     "CIMVERSION",     "CLASS",
                                                  "CLASSNAME",   "CLASSORIGIN",     "CODE",           "DESCRIPTION",
                                                  "DTDVERSION",  "EmbeddedObject",  "EMBEDDEDOBJECT", "ID",
                                                  "INDICATION",  "ISARRAY",         "METHOD",         "NAME",
                                                  "OVERRIDABLE", "PARAMETER",       "PARAMTYPE",      "PROPAGATED",
                                                  "PROPERTY",    "PROTOCOLVERSION", "REFERENCE",      "REFERENCECLASS",
                                                  "SUPERCLASS",  "TOINSTANCE",      "TOSUBCLASS",     "TRANSLATABLE",
                                                  "TYPE",        "VALUETYPE",       "VERSION"};
    Pegasus::wire::XmlAttribute values[std::size(kNames)];
    std::string scratch;
    element.attributes(kNames, values);
    out += std::string(static_cast<std::size_t>(depth), ' ') + std::string(element.name());
    for (std::size_t i = 0; i < std::size(kNames); ++i) {
        if (values[i] && !(order == Order::kSorted && isOfClassOnly(kNames[i]))) {
            out += " " + std::string(kNames[i]) + "=" + std::string(element.resolved(*values[i], scratch));
        }
    }
    if (element.is("VALUE") || element.is("KEYVALUE") || element.is("HOST")) {
        out += canonicalText(std::string(element.text(scratch)), depth, order);
    }
    out += "\n";
    if (element.is("VALUE") || element.is("KEYVALUE") || element.is("HOST")) {
        return;
    }
    std::vector<std::string> children;
    for (XmlElement child = element.firstChild(); child; child = child.nextSibling()) {
        if (order == Order::kAsSent || child.name().substr(0, 8) != "PROPERTY" || child.firstChild()) {
            appendCanonical(children.emplace_back(), child, depth + 1, order);
        }
    }
    if (order == Order::kSorted && (element.is("IRETURNVALUE") || element.is("INSTANCE"))) {
        std::sort(children.begin(), children.end());
    }
    for (const std::string& child : children) {
        out += child;
    }
}

} // namespace

std::string canonicalBody(std::string body, Order order)
{
    if (body.find("<?xml") != 0) {
        return body;
    }
    XmlDocument document;
    std::string out;
    appendCanonical(out, document.parseMessage(body), 0, order);
    return out;
}

std::string firstMatch(const std::string& text, const std::string& pattern)
{
    std::smatch match;
    return std::regex_search(text, match, std::regex(pattern)) ? match[1].str() : std::string();
}

RecordedExchange::RecordedExchange(const std::string& folder)
    : name(std::filesystem::path(folder).filename()), request(contentOf(folder + "/request.http")),
      answer(parseAnswer(contentOf(folder + "/response.http"))), note(contentOf(folder + "/note.md"))
{
    isRaw = note.find("(no client)") != std::string::npos;
    const std::string head = request.substr(0, request.find("\r\n\r\n"));
    method = firstMatch(head, "CIMMethod: *([^\r]*)");
    nameSpace = Pegasus::base::percentDecoded(firstMatch(head, "CIMObject: *([^\r]*)"));
    nameSpace.erase(std::min(nameSpace.find(':'), nameSpace.size()));
    className = firstMatch(request.substr(head.size()), "(?:<INSTANCENAME CLASSNAME|<CLASSNAME NAME)=\"(\\w+)\"");
    const std::size_t middle = note.find("; message ");
    if (middle != std::string::npos) {
        session = note.substr(0, middle);
        message = std::atoi(note.c_str() + middle + std::strlen("; message "));
    }
}

bool RecordedExchange::hasParameter(const std::string& parameter) const
{
    return request.find("<IPARAMVALUE NAME=\"" + parameter + "\"") != std::string::npos;
}

bool RecordedExchange::flag(const std::string& parameter, bool ifMissing) const
{
    const std::size_t at = request.find("<IPARAMVALUE NAME=\"" + parameter + "\">");
    return at == std::string::npos ? ifMissing : request.compare(request.find("<VALUE>", at), 11, "<VALUE>TRUE") == 0;
}

int RecordedExchange::status() const
{
    const auto code = answer.trailers.find("cimstatuscode");
    return code == answer.trailers.end() ? 0 : std::atoi(code->second.c_str());
}

const std::vector<RecordedExchange>& recordings()
{
    static const std::vector<RecordedExchange> kAll = [] {
        std::vector<RecordedExchange> all;
        const std::string folder = test::vectorsFolder(VECTORS_DIRECTORY);
        if (folder.empty()) {
            return all;
        }
        for (const auto& entry : std::filesystem::directory_iterator(folder + "/wire")) {
            if (entry.is_directory() && contentOf(entry.path() / "note.md").rfind("FABRICATED", 0) != 0) {
                all.emplace_back(entry.path());
            }
        }
        std::sort(all.begin(), all.end(), [](const auto& x, const auto& y) { return x.name < y.name; });
        return all;
    }();
    return kAll;
}

std::vector<std::string> elementsOf(const std::string& body, const std::string& element)
{
    std::vector<std::string> found;
    const std::string close = "</" + element + ">\n";
    for (std::size_t at = 0; (at = body.find("<" + element, at)) != std::string::npos;) {
        const char next = body[at + element.size() + 1];
        if (next != ' ' && next != '>') {
            ++at;
            continue;
        }
        const std::size_t end = body.find(close, at) + close.size();
        found.push_back(body.substr(at, end - at));
        at = end;
    }
    return found;
}

std::string canonical(const HttpAnswer& answer, Order order)
{
    std::string text = answer.statusLine + "\n";
    for (const char* name : {"cimoperation", "cimerror", "pgerrordetail"}) {
        if (answer.headers.count(name) != 0) {
            text += std::string(name) + ": " + header(answer, name) + "\n";
        }
    }
    for (const auto& [name, value] : answer.trailers) {
        text += name + ": " + Pegasus::base::percentDecoded(value) + "\n";
    }
    return text + canonicalBody(answer.body, order);
}

std::string firstDifference(const std::string& ours, const std::string& recorded)
{
    constexpr int kLines = 6;
    std::istringstream left(ours);
    std::istringstream right(recorded);
    std::string a;
    std::string b;
    int number = 1;
    do {
        a = b = "(end)";
        std::getline(left, a);
        std::getline(right, b);
        if (!left && !right) {
            return "";
        }
        ++number;
    } while (a == b);
    std::string text = "line " + std::to_string(number - 1);
    std::string more = "\nours:     " + a;
    for (int i = 0; i < kLines && std::getline(left, a); ++i) {
        more += "\n          " + a;
    }
    more += "\nrecorded: " + b;
    for (int i = 0; i < kLines && std::getline(right, b); ++i) {
        more += "\n          " + b;
    }
    return text + more;
}

} // namespace servertest
