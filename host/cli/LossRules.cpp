#include "host/cli/LossRules.h"

#include <host/TVRXStatusCode.h>

#include <filesystem>
#include <sstream>
#include <vector>

namespace vrxhost {
namespace {

// A line of the plug-in: fBegin, an object, fMiddle, a cause. The sentence is fSubject, the object, fVerb, the cause.
struct TRule
{
    const char* fBegin;
    const char* fMiddle;
    const char* fSubject;
    const char* fVerb;
};

constexpr TRule kRules[] = {
    {"TPEGASUSNamespace::GetClass from Pegasus for: ", " returned exception: ", "class ", " could not be fetched: "},
    {"Catching exeption: AllocateClass  --- ", "\twith reason: ", "class ", " could not be built: "},
    {"Get Instances for: ", " returned ConnectionTimeoutException: ", "instances of ",
     " could not be fetched in time: "},
    {"DEBUG1:TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ", "instances of ",
     " could not be fetched: "},
    {"TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ", "instances of ",
     " could not be fetched: "},
    {"TPEGASUSClass:EnumerateInstances. NSP :", "with pegasus exeption: ", "instances could not be fetched, ", ": "},
    {"DEBUG3:TPEGASUSClass::EI Error from Pegasus for: ", " returned exception: ", "an instance could not be built, ",
     ": "},
    {"DEBUG2:TPEGASUSClass::EI VRX Error for: ", "", "an instance could not be built, ", ""},
    {"4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: ", "", "property ",
     " could not be converted and is missing from its instance"},
    {"TPEGASUSClass::Initialize - Unable to retrieve qualifier: ", "\tdetail: ", "qualifier ",
     " could not be fetched: "},
    {"- error when Adding Qualifiers for class: ", "\tdetail: ", "qualifiers of class ", " could not be added: "},
    {" - error when Adding Qualifiers for property: ", "\tdetail: ", "qualifiers of property ",
     " could not be added: "},
    {" - error when Adding Qualifiers for method: ", "\tdetail: ", "qualifiers of method ", " could not be added: "},
    {"TPEGASUSProvider::EnumerateClassesProvided catch exection : ", "", "a class could not be listed: ", ""},
};

bool BeginsWith(const std::string& text, const std::string& begin)
{
    return text.compare(0, begin.size(), begin) == 0;
}

std::string Trimmed(const std::string& text)
{
    const std::size_t begin = text.find_first_not_of(" \t\r\n");
    return begin == std::string::npos ? "" : text.substr(begin, text.find_last_not_of(" \t\r\n") - begin + 1);
}

// Programs write several lines; a compiler's quotation of a source line, with a caret below, is left out.
std::string OneLine(const std::string& text)
{
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        line = Trimmed(line);
        if (line == "^" && !lines.empty()) {
            lines.pop_back();
        } else if (!line.empty()) {
            lines.push_back(line);
        }
    }
    std::string joined;
    for (const std::string& line : lines) {
        joined += (joined.empty() ? "" : " ") + line;
    }
    return joined;
}

std::optional<TLoss> Apply(const TRule& rule, const std::string& line)
{
    if (!BeginsWith(line, rule.fBegin)) {
        return std::nullopt;
    }
    const std::string middle = rule.fMiddle;
    const std::size_t object = std::char_traits<char>::length(rule.fBegin);
    const std::size_t split = middle.empty() ? line.size() : line.find(middle, object);
    if (split == std::string::npos) {
        return std::nullopt;
    }
    const std::string cause = split < line.size() ? line.substr(split + middle.size()) : "";
    return TLoss{rule.fSubject, OneLine(line.substr(object, split - object)), rule.fVerb + OneLine(cause)};
}

std::string Cause(const NKOLVRX20::TFailedProgram& program)
{
    const std::string& text = program.fErrorOutput.empty() ? program.fOutput : program.fErrorOutput;
    return program.GetReason() + (text.empty() ? "" : ": " + OneLine(text));
}

// ".../provider/linux/x.properties.mof" belongs to the provider "linux".
std::string LossOfCompilation(const NKOLVRX20::TFailedProgram& program)
{
    const std::filesystem::path file = program.fArguments.empty() ? "" : program.fArguments.back();
    const std::string folder = file.parent_path().parent_path().filename();
    const std::string owner = folder == "provider" ? " of provider " + file.parent_path().filename().string() : "";
    return "MOF file " + file.string() + owner + " did not compile, cimmof: " + Cause(program);
}

} // namespace

std::optional<TLoss> LossOfLine(const std::string& line)
{
    for (const TRule& rule : kRules) {
        if (auto loss = Apply(rule, line)) {
            return loss;
        }
    }
    return std::nullopt;
}

bool IsHarmless(const std::string& errorLine)
{
    // A program that could not be run has a sentence of its own, with the cause.
    const std::string failed =
        NKOLVRX20::TVRXStatusCode(NKOLVRX20::TVRXStatusCode::kProcessFailed).TranslateStatusCode();
    return errorLine.size() >= failed.size() &&
           errorLine.compare(errorLine.size() - failed.size(), failed.size(), failed) == 0;
}

bool IsServerStart(const NKOLVRX20::TFailedProgram& program)
{
    return program.fName == "cimserver" && (program.fArguments.empty() || program.fArguments.front() != "-s");
}

std::optional<std::string> LossOfProgram(const NKOLVRX20::TFailedProgram& program, const std::string& root)
{
    if (program.fName == "cimmof") {
        return LossOfCompilation(program);
    }
    if (IsServerStart(program)) {
        return "the server did not start, cimserver: " + Cause(program);
    }
    if (program.fName == "cimserver") // a server that does not run cannot be stopped
    {
        return std::nullopt;
    }
    // Looks for a leftover server; its failure means the same as an empty result.
    if (program.fName == "ps") {
        return std::nullopt;
    }
    // An adapter tool that only machines with the adapter have.
    if (program.fName == "bcu") {
        return std::filesystem::exists(root + "/pegasus/provider/brocade")
                   ? std::optional("provider brocade is disabled, bcu: " + Cause(program))
                   : std::nullopt;
    }
    std::string command = program.fName;
    for (const std::string& argument : program.fArguments) {
        command += " " + argument;
    }
    return command + " failed: " + Cause(program);
}

} // namespace vrxhost
