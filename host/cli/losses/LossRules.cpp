// SPDX-License-Identifier: MIT
#include "host/cli/losses/LossRules.h"

#include <host/TVRXStatusCode.h>

#include <algorithm>
#include <filesystem>
#include <regex>
#include <sstream>
#include <vector>

namespace vrxhost {
namespace {

// Where an object names a class.
enum class EClass
{
    kNone,
    kFirstWord,
    kLastWord
};

// A line of the plug-in: fBegin, an object, fMiddle, a cause. The sentence is fSubject, the object, fVerb, the cause.
struct TRule
{
    const char* fBegin;
    const char* fMiddle;
    const char* fSubject;
    const char* fVerb;
    EClass fClass;
    bool fIsConsequence; // of a file that did not compile, possibly
};

constexpr EClass kNone = EClass::kNone;
constexpr EClass kFirst = EClass::kFirstWord;
constexpr EClass kLast = EClass::kLastWord;

constexpr TRule kRules[] = {
    {"TPEGASUSNamespace::GetClass from Pegasus for: ", " returned exception: ", "class ",
     " could not be fetched: ", kFirst, true},
    {"Catching exeption: AllocateClass  --- ", "\twith reason: ", "class ", " could not be built: ", kFirst, true},
    {"Get Instances for: ", " returned ConnectionTimeoutException: ", "instances of ",
     " could not be fetched in time: ", kFirst, false},
    {"DEBUG1:TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ", "instances of ",
     " could not be fetched: ", kFirst, true},
    {"TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ", "instances of ",
     " could not be fetched: ", kFirst, false},
    {"TPEGASUSClass:EnumerateInstances. NSP :", "with pegasus exeption: ", "instances could not be fetched, ", ": ",
     kLast, true},
    {"DEBUG3:TPEGASUSClass::EI Error from Pegasus for: ", " returned exception: ", "an instance could not be built, ",
     ": ", kFirst, false},
    {"DEBUG2:TPEGASUSClass::EI VRX Error for: ", "", "an instance could not be built, ", "", kFirst, false},
    {"TPEGASUSClass::Initialize - Unable to retrieve qualifier: ", "\tdetail: ", "qualifier ",
     " could not be fetched: ", kNone, false},
    {"- error when Adding Qualifiers for class: ", "\tdetail: ", "qualifiers of class ",
     " could not be added: ", kFirst, false},
    {" - error when Adding Qualifiers for property: ", "\tdetail: ", "qualifiers of property ",
     " could not be added: ", kNone, false},
    {" - error when Adding Qualifiers for method: ", "\tdetail: ", "qualifiers of method ",
     " could not be added: ", kNone, false},
    {"TPEGASUSProvider::EnumerateClassesProvided catch exection : ", "", "a class could not be listed: ", "", kNone,
     false},
};

// Lines of every healthy start: the class list's reader knows neither its root element nor the closing tags, and the
// adapter tool exists on machines with the adapter alone.
constexpr char kDescription[] = "Performance Data RDD Parser line ";
const char* const kHealthyMessages[] = {":Unrecognized identifier:vrx", ":Unrecognized identifier"};

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

bool EndsWith(const std::string& text, const std::string& end)
{
    return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

std::string ClassIn(const std::string& object, EClass where)
{
    if (where == EClass::kNone) {
        return "";
    }
    constexpr char kEndOfName[] = " ,";
    return where == EClass::kFirstWord ? object.substr(0, object.find_first_of(kEndOfName))
                                       : object.substr(object.find_last_of(kEndOfName) + 1);
}

// A cause that ends with the object's name would differ for every object.
std::string WithoutName(const std::string& cause, const std::string& name)
{
    const std::string quoted = ": \"" + name + "\"";
    return !name.empty() && EndsWith(cause, quoted) ? cause.substr(0, cause.size() - quoted.size()) : cause;
}

std::optional<TLoss> Apply(const TRule& rule, const std::string& line)
{
    if (!BeginsWith(line, rule.fBegin)) {
        return std::nullopt;
    }
    const std::string middle = rule.fMiddle;
    const std::size_t begin = std::char_traits<char>::length(rule.fBegin);
    const std::size_t split = middle.empty() ? line.size() : line.find(middle, begin);
    if (split == std::string::npos) {
        return std::nullopt;
    }
    const std::string object = OneLine(line.substr(begin, split - begin));
    const std::string className = ClassIn(object, rule.fClass);
    const std::string cause = split < line.size() ? OneLine(line.substr(split + middle.size())) : "";
    TLoss loss;
    loss.fBegin = rule.fSubject;
    loss.fObjects = {object};
    loss.fEnd = rule.fVerb + WithoutName(cause, className);
    if (!className.empty()) {
        loss.fClasses = {className};
    }
    loss.fIsConsequence = rule.fIsConsequence;
    return loss;
}

std::string Cause(const NKOLVRX20::TFailedProgram& program)
{
    const std::string& text = program.fErrorOutput.empty() ? program.fOutput : program.fErrorOutput;
    return program.GetReason() + (text.empty() ? "" : ": " + OneLine(text));
}

// ".../provider/linux/x.properties.mof" belongs to the vendor "linux".
TLoss LossOfCompilation(const NKOLVRX20::TFailedProgram& program)
{
    const std::filesystem::path file = program.fArguments.empty() ? "" : program.fArguments.back();
    const std::string folder = file.parent_path().parent_path().filename();
    const std::string vendor = folder == "provider" ? file.parent_path().filename().string() : "";
    TLoss loss = LossOf("MOF file " + file.string() + (vendor.empty() ? "" : " of vendor " + vendor) +
                        " did not compile, cimmof: " + Cause(program));
    loss.fVendor = vendor;
    loss.fFile = file;
    loss.fIsCause = !vendor.empty();
    return loss;
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
    using NKOLVRX20::TVRXStatusCode;
    if (EndsWith(errorLine, TVRXStatusCode(TVRXStatusCode::kProcessFailed).TranslateStatusCode())) {
        return true;
    }
    return BeginsWith(errorLine, kDescription) &&
           std::any_of(std::begin(kHealthyMessages), std::end(kHealthyMessages),
                       [&errorLine](const char* message) { return EndsWith(errorLine, message); });
}

std::optional<TLoss> NoteOfServerLine(const TServerLogLine& line)
{
    static const std::string kTrap = "works here, fails on OpenPegasus 2.14: ";
    const std::size_t begin = line.fText.find(kTrap);
    if (begin == std::string::npos) {
        return std::nullopt;
    }
    TLoss note = LossOf("provider module " + line.fModule +
                        " does what fails on OpenPegasus 2.14: " + line.fText.substr(begin + kTrap.size()));
    note.fIsNote = true;
    return note;
}

std::optional<TLoss> LossOfServerLine(const TServerLogLine& line)
{
    static const std::regex kRefused("setProperty: (?:class (\\S+) has no property (\\S+)"
                                     "|property (\\S+) of (\\S+) has another type.*)");
    std::smatch found;
    if (!std::regex_search(line.fText, found, kRefused)) {
        return std::nullopt;
    }
    const bool isUnknown = found[1].matched;
    TLoss loss;
    loss.fClasses = {isUnknown ? found[1] : found[4]};
    loss.fProperty = isUnknown ? found[2] : found[3];
    loss.fBegin = "property " + loss.fProperty + " of class " + loss.fClasses.front();
    loss.fEnd = std::string(isUnknown ? " is not declared" : " is declared with another type") +
                ", so that the value which provider module " + line.fModule + " sets is lost";
    return loss;
}

bool IsServerStart(const NKOLVRX20::TFailedProgram& program)
{
    return program.fName == "cimserver" && (program.fArguments.empty() || program.fArguments.front() != "-s");
}

std::optional<TLoss> LossOfProgram(const NKOLVRX20::TFailedProgram& program, const std::string& root)
{
    if (program.fName == "cimmof") {
        return LossOfCompilation(program);
    }
    if (IsServerStart(program)) {
        return LossOf("the server did not start, cimserver: " + Cause(program));
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
                   ? std::optional(LossOf("provider brocade is disabled, bcu: " + Cause(program)))
                   : std::nullopt;
    }
    std::string command = program.fName;
    for (const std::string& argument : program.fArguments) {
        command += " " + argument;
    }
    return LossOf(command + " failed: " + Cause(program));
}

} // namespace vrxhost
