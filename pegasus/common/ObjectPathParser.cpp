// SPDX-License-Identifier: MIT
#include "pegasus/common/ObjectPathParser.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"

#include <Pegasus/Common/CIMName.h>

#include <algorithm>
#include <charconv>

#include <arpa/inet.h>

namespace Pegasus::path {
namespace {

using Reason = std::string;

// References in references: each level doubles the backslashes, so real paths stay far below.
constexpr unsigned kMaxNesting = 16;

bool isAllDigits(std::string_view text)
{
    return !text.empty() && std::all_of(text.begin(), text.end(), base::isAsciiDigit);
}

bool isPort(std::string_view text)
{
    unsigned port = 0;
    const auto result = std::from_chars(text.data(), text.data() + text.size(), port);
    return isAllDigits(text) && result.ec == std::errc() && port <= 65535;
}

bool isAddress(int family, std::string_view text)
{
    unsigned char address[sizeof(in6_addr)];
    return ::inet_pton(family, std::string(text).c_str(), address) == 1;
}

bool isLabel(std::string_view label)
{
    const auto isLabelChar = [](char c) { return base::isAsciiAlnum(c) || c == '-' || c == '_'; };
    return !label.empty() && (base::isAsciiAlnum(label.front()) || label.front() == '_') &&
           std::all_of(label.begin(), label.end(), isLabelChar);
}

bool isDottedName(std::string_view text)
{
    std::string_view label;
    for (bool more = true; more;) {
        const std::size_t dot = text.find('.');
        more = dot != std::string_view::npos;
        label = text.substr(0, dot);
        if (!isLabel(label)) {
            return false;
        }
        text.remove_prefix(more ? dot + 1 : text.size());
    }
    // A name whose last label is a number would be taken for an address.
    return !isAllDigits(label);
}

// Reads the parts of a path from left to right; fText is what is left.
class PathParser
{
  public:
    PathParser(std::string_view text, Parts& parts, unsigned nesting) : fText(text), fParts(parts), fNesting(nesting) {}

    Reason run();

  private:
    Reason readHost();
    Reason readNamespace();
    Reason readClass();
    Reason readKeys();
    Reason readKey();
    Reason readQuoted(std::string& value);
    Reason readPlain(Key& key);
    bool isPathWithKeys(const std::string& value) const;

    std::string_view fText;
    Parts& fParts;
    unsigned fNesting;
};

Reason PathParser::run()
{
    Reason reason = readHost();
    if (reason.empty()) {
        reason = readNamespace();
    }
    if (reason.empty()) {
        reason = readClass();
    }
    if (reason.empty()) {
        reason = readKeys();
    }
    return reason;
}

Reason PathParser::readHost()
{
    if (fText.substr(0, 2) != "//") {
        return Reason();
    }
    const std::size_t slash = fText.find('/', 2);
    if (slash == std::string_view::npos) {
        return "missing slash after hostname";
    }
    const std::string_view host = fText.substr(2, slash - 2);
    if (!isHost(host)) {
        return "invalid hostname";
    }
    fParts.host = host;
    fText.remove_prefix(slash + 1);
    return Reason();
}

// The namespace ends at a colon before the first key.
Reason PathParser::readNamespace()
{
    const std::size_t colon = fText.find(':');
    if (colon == std::string_view::npos || colon > fText.find('.')) {
        return fParts.host.empty() ? Reason() : "host specified, missing namespace";
    }
    const std::string nameSpace(fText.substr(0, colon));
    if (!CIMNamespaceName::legal(base::fromUtf8(nameSpace))) {
        return "invalid namespace name";
    }
    fParts.nameSpace = nameSpace;
    fText.remove_prefix(colon + 1);
    return Reason();
}

Reason PathParser::readClass()
{
    const std::size_t dot = fText.find('.');
    const std::string className(fText.substr(0, dot));
    if (!CIMName::legal(base::fromUtf8(className))) {
        return "class name " + className + " not a legal CIM name";
    }
    fParts.className = className;
    fText.remove_prefix(dot == std::string_view::npos ? fText.size() : dot + 1);
    return Reason();
}

Reason PathParser::readKeys()
{
    while (!fText.empty()) {
        Reason reason = readKey();
        if (reason.empty() && !fText.empty() && fText.front() != ',') {
            reason = "next key-value pair has to start with comma";
        }
        if (!reason.empty()) {
            return "invalid key-value pair, " + reason;
        }
        fText.remove_prefix(std::min<std::size_t>(1, fText.size()));
    }
    return Reason();
}

Reason PathParser::readKey()
{
    const std::size_t equals = fText.find('=');
    if (equals == std::string_view::npos) {
        return "missing equal sign";
    }
    Key key;
    key.name = fText.substr(0, equals);
    if (!CIMName::legal(base::fromUtf8(key.name))) {
        return "invalid key name:" + key.name;
    }
    fText.remove_prefix(equals + 1);
    Reason reason;
    if (!fText.empty() && fText.front() == '"') {
        reason = readQuoted(key.value);
        key.kind = reason.empty() && isPathWithKeys(key.value) ? KeyKind::kReference : KeyKind::kString;
    } else {
        reason = readPlain(key);
    }
    fParts.keys.push_back(std::move(key));
    return reason;
}

Reason PathParser::readQuoted(std::string& value)
{
    std::size_t at = 1;
    for (; at < fText.size() && fText[at] != '"'; ++at) {
        if (fText[at] == '\\') {
            ++at;
            if (at == fText.size() || (fText[at] != '"' && fText[at] != '\\')) {
                return "malformed value";
            }
        }
        value.push_back(fText[at]);
    }
    if (at == fText.size()) {
        return "malformed value";
    }
    fText.remove_prefix(at + 1);
    return Reason();
}

Reason PathParser::readPlain(Key& key)
{
    key.value = fText.substr(0, fText.find(','));
    fText.remove_prefix(key.value.size());
    const String value = base::fromUtf8(key.value);
    for (const char* word : {"TRUE", "FALSE"}) {
        if (String::equalNoCase(value, word)) {
            key.value = word;
            key.kind = KeyKind::kBoolean;
            return Reason();
        }
    }
    key.kind = KeyKind::kNumeric;
    if (!key.value.empty() && key.value.front() == '-') {
        return base::parseSigned(key.value) ? Reason() : "invalid negative number value " + key.value;
    }
    return base::parseUnsigned(key.value) ? Reason() : "invalid number value " + key.value;
}

bool PathParser::isPathWithKeys(const std::string& value) const
{
    if (fNesting == kMaxNesting || value.find('=') == std::string::npos) {
        return false;
    }
    Parts parts;
    return PathParser(value, parts, fNesting + 1).run().empty() && !parts.keys.empty();
}

} // namespace

bool isHost(std::string_view text)
{
    if (!text.empty() && text.front() == '[') {
        const std::size_t close = text.find(']');
        if (close == std::string_view::npos || !isAddress(AF_INET6, text.substr(1, close - 1))) {
            return false;
        }
        const std::string_view rest = text.substr(close + 1);
        return rest.empty() || (rest.front() == ':' && isPort(rest.substr(1)));
    }
    const std::size_t colon = text.find(':');
    if (colon != std::string_view::npos && !isPort(text.substr(colon + 1))) {
        return false;
    }
    const std::string_view host = text.substr(0, colon);
    return isAddress(AF_INET, host) || isDottedName(host);
}

std::string parse(std::string_view text, Parts& parts)
{
    return PathParser(text, parts, 0).run();
}

} // namespace Pegasus::path
