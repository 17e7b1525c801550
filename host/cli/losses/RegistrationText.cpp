// SPDX-License-Identifier: MIT
#include "host/cli/losses/RegistrationText.h"

#include "host/cli/losses/TVendorFiles.h"
#include "host/cli/model/Loss.h"
#include "host/cli/model/Names.h"

#include <algorithm>
#include <cctype>
#include <cstddef>
#include <map>
#include <set>
#include <vector>

namespace vrxhost {
namespace {

using TTokens = std::vector<std::string>; // words, texts with their first quotation mark, and single characters

bool IsWordPart(char c)
{
    return c == '_' || std::isalnum(static_cast<unsigned char>(c)) != 0;
}

std::size_t EndOfToken(const std::string& text, std::size_t begin)
{
    if (text[begin] == '"') {
        return text.find('"', begin + 1);
    }
    std::size_t end = begin + 1;
    while (IsWordPart(text[begin]) && end < text.size() && IsWordPart(text[end])) {
        ++end;
    }
    return end;
}

// Returns: the first character after a comment that begins here; the place itself when none does.
std::size_t AfterComment(const std::string& text, std::size_t at)
{
    const bool isLine = text.compare(at, 2, "//") == 0;
    if (!isLine && text.compare(at, 2, "/*") != 0) {
        return at;
    }
    const std::size_t end = isLine ? text.find('\n', at) : text.find("*/", at + 2);
    return end == std::string::npos ? text.size() : end + (isLine ? 1 : 2);
}

TTokens TokensOf(const std::string& text)
{
    TTokens tokens;
    for (std::size_t at = 0; at < text.size();) {
        const std::size_t after = AfterComment(text, at);
        if (after != at || std::isspace(static_cast<unsigned char>(text[at])) != 0) {
            at = std::max(after, at + 1);
            continue;
        }
        const std::size_t end = std::min(EndOfToken(text, at), text.size());
        tokens.push_back(text.substr(at, end - at));
        at = end + (tokens.back().front() == '"' ? 1 : 0);
    }
    return tokens;
}

// The string properties of one instance, by name in small letters.
using TTexts = std::map<std::string, std::string>;

// Each "NAME = "TEXT"" from "instance of CLASS" to the next instance.
std::vector<TTexts> InstancesOf(const std::string& className, const TTokens& tokens)
{
    std::vector<TTexts> instances;
    bool isInside = false;
    for (std::size_t i = 0; i + 2 < tokens.size(); ++i) {
        if (SmallLetters(tokens[i]) == "instance" && SmallLetters(tokens[i + 1]) == "of") {
            isInside = SmallLetters(tokens[i + 2]) == SmallLetters(className);
            instances.resize(instances.size() + (isInside ? 1 : 0));
        } else if (isInside && tokens[i + 1] == "=" && tokens[i + 2].front() == '"') {
            instances.back()[SmallLetters(tokens[i])] = tokens[i + 2].substr(1);
        }
    }
    return instances;
}

std::string ProviderText(const std::string& provider, const std::string& module)
{
    return "provider \"" + provider + "\" of module \"" + module + "\"";
}

std::string ModuleText(const std::string& module)
{
    return "module \"" + module + "\"";
}

std::string Listed(const std::set<std::string>& names)
{
    return names.empty() ? "none" : JoinNames({names.begin(), names.end()});
}

} // namespace

std::vector<std::string> LocationsOf(const std::string& registrationFile)
{
    std::vector<std::string> locations;
    for (TTexts module : InstancesOf("PG_ProviderModule", TokensOf(ReadBeginning(registrationFile)))) {
        if (!module["location"].empty()) {
            locations.push_back(module["location"]);
        }
    }
    return locations;
}

std::string DescribeUnknownNames(const std::string& registrationFile)
{
    const TTokens tokens = TokensOf(ReadBeginning(registrationFile));
    std::set<std::string> modules;
    std::set<std::string> providers;
    for (TTexts module : InstancesOf("PG_ProviderModule", tokens)) {
        modules.insert(ModuleText(module["name"]));
    }
    for (TTexts provider : InstancesOf("PG_Provider", tokens)) {
        providers.insert(ProviderText(provider["name"], provider["providermodulename"]));
        const std::string named = ModuleText(provider["providermodulename"]);
        if (modules.count(named) == 0) {
            return "; PG_Provider names " + named + ", and the file registers " + Listed(modules);
        }
    }
    for (TTexts capabilities : InstancesOf("PG_ProviderCapabilities", tokens)) {
        const std::string named = ProviderText(capabilities["providername"], capabilities["providermodulename"]);
        if (providers.count(named) == 0) {
            return "; PG_ProviderCapabilities names " + named + ", and the file registers " + Listed(providers);
        }
    }
    return "";
}

} // namespace vrxhost
