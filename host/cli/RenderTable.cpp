#include "host/cli/model/Document.h"

#include <algorithm>
#include <cstdio>

namespace vrxhost {
namespace {

// A value from a device must not steer the user's terminal.
std::string Printable(const std::string& text)
{
    std::string printable;
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte >= 0x20 && byte != 0x7f) {
            printable += c;
            continue;
        }
        char escape[8];
        std::snprintf(escape, sizeof escape, c == '\n' ? "\\n" : c == '\t' ? "\\t" : "\\x%02x", byte);
        printable += escape;
    }
    return printable;
}

std::string Counted(std::size_t count, const char* noun)
{
    const std::string suffix = count == 1 ? "" : *(noun + std::char_traits<char>::length(noun) - 1) == 's' ? "es" : "s";
    return std::to_string(count) + " " + noun + suffix;
}

std::string Padded(const std::string& text, std::size_t width)
{
    return text + std::string(width > text.size() ? width - text.size() : 0, ' ');
}

void AppendInstance(std::string& out, const TInstanceRecord& instance, std::size_t number, const std::string& indent)
{
    std::size_t width = 0;
    for (const auto& property : instance.fProperties) {
        if (!property.fValue.IsNull()) {
            width = std::max(width, property.fName.size());
        }
    }
    out += indent + "#" + std::to_string(number) + "\n";
    for (const auto& property : instance.fProperties) {
        if (!property.fValue.IsNull()) {
            out += indent + "  " + Padded(property.fName, width) + "  " + Printable(property.fText) + "\n";
        }
    }
}

void AppendInstances(std::string& out, const TClassRecord& each, const std::string& indent)
{
    out += indent + each.fName + ": " + Counted(each.fInstances.size(), "instance") + "\n";
    std::size_t number = 0;
    for (const auto& instance : each.fInstances) {
        AppendInstance(out, instance, ++number, indent + "  ");
    }
}

std::string ParameterList(const TMethodRecord& method)
{
    std::string list;
    for (const auto& parameter : method.fParameters) {
        list += (list.empty() ? "" : ", ") + parameter.fType + " " + parameter.fName;
    }
    return list;
}

void AppendDeclarations(std::string& out, const TClassRecord& each)
{
    out += "  " + each.fName + (each.fSuperClass.empty() ? "" : " : " + each.fSuperClass) + "\n";
    for (const auto& property : each.fProperties) {
        out += "    " + Padded(property.fType, 11) + property.fName + (property.fIsKey ? "  [key]" : "") + "\n";
    }
    for (const auto& method : each.fMethods) {
        out += "    " + Padded(method.fReturnType, 11) + method.fName + "(" + ParameterList(method) + ")\n";
    }
}

void AppendClass(std::string& out, const TClassRecord& each, ECommand command)
{
    if (command == ECommand::kInventory) {
        AppendInstances(out, each, "  ");
    } else if (command == ECommand::kClasses) {
        AppendDeclarations(out, each);
    } else {
        out += "  " + each.fName + "\n";
    }
}

void AppendProvider(std::string& out, const TProviderRecord& provider, ECommand command)
{
    out += "Provider " + (provider.fName.empty() ? "without a name" : Printable(provider.fName)) + " (" +
           Printable(provider.fModule) + "): " + Counted(provider.fClasses.size(), "class") + "\n";
    for (const auto& each : provider.fClasses) {
        AppendClass(out, each, command);
    }
}

} // namespace

std::string RenderTable(const TDocument& document)
{
    std::string out;
    for (const auto& provider : document.fProviders) {
        if (document.fCommand == ECommand::kInstances) {
            for (const auto& each : provider.fClasses) {
                AppendInstances(out, each, "");
            }
        } else {
            AppendProvider(out, provider, document.fCommand);
        }
        if (&provider != &document.fProviders.back()) {
            out += "\n";
        }
    }
    return out;
}

} // namespace vrxhost
