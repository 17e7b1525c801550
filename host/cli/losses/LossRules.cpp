// SPDX-License-Identifier: MIT
#include "host/cli/losses/LossRules.h"

#include "host/cli/losses/RegistrationText.h"

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
    ELossKind fKind;
    const char* fBegin;
    const char* fMiddle;
    const char* fSubject;
    const char* fVerb;
    EClass fClass;
    bool fIsConsequence; // of a file that did not compile, possibly
};

using EKind = ELossKind;
constexpr EClass kNone = EClass::kNone;
constexpr EClass kFirst = EClass::kFirstWord;
constexpr EClass kLast = EClass::kLastWord;

constexpr TRule kRules[] = {
    {EKind::kClass, "TPEGASUSNamespace::GetClass from Pegasus for: ", " returned exception: ", "class ",
     " could not be fetched: ", kFirst, true},
    {EKind::kClass, "Catching exeption: AllocateClass  --- ", "\twith reason: ", "class ",
     " could not be built: ", kFirst, true},
    {EKind::kInstancesLate, "Get Instances for: ", " returned ConnectionTimeoutException: ", "instances of ",
     " could not be fetched in time: ", kFirst, false},
    {EKind::kInstances, "DEBUG1:TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ",
     "instances of ", " could not be fetched: ", kFirst, true},
    {EKind::kInstances, "TPEGASUSClass::EnumerateInstances from Pegasus for: ", " returned exception: ",
     "instances of ", " could not be fetched: ", kFirst, false},
    {EKind::kInstances, "TPEGASUSClass:EnumerateInstances. NSP :", "with pegasus exeption: ",
     "instances could not be fetched, ", ": ", kLast, true},
    {EKind::kInstances, "DEBUG3:TPEGASUSClass::EI Error from Pegasus for: ", " returned exception: ",
     "an instance could not be built, ", ": ", kFirst, false},
    {EKind::kInstances, "DEBUG2:TPEGASUSClass::EI VRX Error for: ", "", "an instance could not be built, ", "", kFirst,
     false},
    {EKind::kClass, "TPEGASUSClass::Initialize - Unable to retrieve qualifier: ", "\tdetail: ", "qualifier ",
     " could not be fetched: ", kNone, false},
    {EKind::kClass, "- error when Adding Qualifiers for class: ", "\tdetail: ", "qualifiers of class ",
     " could not be added: ", kFirst, false},
    {EKind::kClass, " - error when Adding Qualifiers for property: ", "\tdetail: ", "qualifiers of property ",
     " could not be added: ", kNone, false},
    {EKind::kClass, " - error when Adding Qualifiers for method: ", "\tdetail: ", "qualifiers of method ",
     " could not be added: ", kNone, false},
    {EKind::kClass, "TPEGASUSProvider::EnumerateClassesProvided catch exection : ", "",
     "a class could not be listed: ", "", kNone, false},
};

// Lines of every healthy start: the class list's reader knows neither its root element nor the closing tags, and the
// adapter tool exists on machines with the adapter alone.
const char* const kHealthyMessages[] = {":Unrecognized identifier:vrx", ":Unrecognized identifier"};

// What the server's log and the MOF compiler say of a text or a call that another server refuses.
constexpr char kTrap[] = "works here, fails on OpenPegasus 2.14: ";

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
    TLoss loss = LossOf(rule.fKind, rule.fSubject);
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
std::string VendorOfFile(const std::filesystem::path& file)
{
    const bool isOfVendor = file.parent_path().parent_path().filename() == "provider";
    return isOfVendor ? file.parent_path().filename().string() : "";
}

TLoss LossOfCompilation(const NKOLVRX20::TFailedProgram& program)
{
    const std::filesystem::path file = program.fArguments.empty() ? "" : program.fArguments.back();
    const std::string vendor = VendorOfFile(file);
    const std::string cause = Cause(program);
    const bool isUnknown = cause.find("needs to be registered before register") != std::string::npos;
    const std::string names = isUnknown ? DescribeUnknownNames(file) : "";
    TLoss loss = LossOf(names.empty() ? EKind::kSchema : EKind::kProviderName,
                        "MOF file " + file.string() + (vendor.empty() ? "" : " of vendor " + vendor) +
                            " did not compile, cimmof: " + cause + names);
    loss.fVendor = vendor;
    loss.fFile = file;
    loss.fIsCause = !vendor.empty();
    return loss;
}

// What the plug-in finds in class lists and in the classes that they name.
std::optional<TLoss> LossOfListedClass(const std::string& line)
{
    static const std::regex kName("TPEGASUSNamespace::CollectClass failed: the class name \"(.*)\" in (.*) is invalid");
    static const std::regex kTimeout(
        "TPEGASUSNamespace::CollectClass: the timeout of class (.*) in (.*) is not a number "
        "of seconds up to ([0-9]+): \"(.*)\" becomes ([0-9]+ ms)");
    static const std::regex kEmbedded("Not supported type of property (\\S+) in class (\\S+): [0-9]+, default to "
                                      "string\\.");
    std::smatch found;
    TLoss loss;
    if (line.size() > kMaxMatchedBytes) {
        return std::nullopt;
    }
    if (std::regex_match(line, found, kName)) {
        loss = LossOf(EKind::kClassName, "the class name \"" + found[1].str() + "\" is invalid");
        loss.fFile = found[2];
        loss.fVendor = VendorOfFile(loss.fFile);
        loss.fClasses = {found[1]};
    } else if (std::regex_match(line, found, kTimeout)) {
        loss = LossOf(EKind::kTimeout, "the timeout of class " + found[1].str() + " is \"" + found[4].str() +
                                           "\", which is not a number of seconds up to " + found[3].str() +
                                           ", and becomes " + found[5].str());
        loss.fFile = found[2];
        loss.fVendor = VendorOfFile(loss.fFile);
        loss.fClasses = {found[1]};
        loss.fIsNote = true;
    } else if (std::regex_match(line, found, kEmbedded)) {
        loss = LossOf(EKind::kEmbeddedObject, "an embedded object is shown as text: ");
        loss.fObjects = {found[2].str() + "." + found[1].str()};
        loss.fClasses = {found[2]};
        loss.fIsNote = true;
    } else {
        return std::nullopt;
    }
    return loss;
}

} // namespace

std::optional<TLoss> LossOfLine(const std::string& line)
{
    if (auto loss = LossOfListedClass(line)) {
        return loss;
    }
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
    return BeginsWith(errorLine, kClassListLine) &&
           std::any_of(std::begin(kHealthyMessages), std::end(kHealthyMessages),
                       [&errorLine](const char* message) { return EndsWith(errorLine, message); });
}

std::vector<TLoss> NotesOfCompiler(const std::string& text)
{
    static const std::regex kWarning("(?:.*: )?(/[^:]*):([0-9]+):([0-9]+): warning: " + std::string(kTrap) + "(.*)");
    std::vector<TLoss> notes;
    std::istringstream lines(text.find(kTrap) == std::string::npos ? "" : text);
    for (std::string line; std::getline(lines, line);) {
        std::smatch found;
        if (line.size() <= kMaxMatchedBytes && std::regex_match(line, found, kWarning)) {
            TLoss note = LossOf(EKind::kMofPortability, "line " + found[2].str() + ", column " + found[3].str() +
                                                            ": fails on OpenPegasus 2.14: " + found[4].str());
            note.fFile = found[1];
            note.fVendor = VendorOfFile(note.fFile);
            note.fIsNote = true;
            notes.push_back(std::move(note));
        }
    }
    return notes;
}

std::optional<TLoss> NoteOfServerLine(const TServerLogLine& line)
{
    static const std::regex kKey("addKey: (\\S+) is not a key of class (\\S+)");
    std::smatch found;
    if (line.fText.size() <= kMaxMatchedBytes && std::regex_search(line.fText, found, kKey)) {
        TLoss key =
            LossOf(EKind::kUndeclaredKey, "provider module " + line.fModule + " uses " + found[1].str() +
                                              " as a key of class " + found[2].str() + ", which declares it as none");
        key.fIsNote = true;
        return key;
    }
    const std::size_t begin = line.fText.find(kTrap);
    if (begin == std::string::npos) {
        return std::nullopt;
    }
    TLoss note = LossOf(EKind::kProviderPortability,
                        "provider module " + line.fModule +
                            " does what fails on OpenPegasus 2.14: " + line.fText.substr(begin + sizeof kTrap - 1));
    note.fIsNote = true;
    return note;
}

std::optional<TLoss> LossOfServerLine(const TServerLogLine& line)
{
    static const std::regex kRefused("(?:setProperty|addKey): (?:class (\\S+) has no property (\\S+)"
                                     "|(?:property|key) (\\S+) of (\\S+) has another type.*)");
    std::smatch found;
    if (line.fText.size() > kMaxMatchedBytes || !std::regex_search(line.fText, found, kRefused)) {
        return std::nullopt;
    }
    const bool isUnknown = found[1].matched;
    TLoss loss;
    loss.fKind = isUnknown ? EKind::kUndeclaredProperty : EKind::kPropertyType;
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
        return LossOf(EKind::kServer, "the server did not start, cimserver: " + Cause(program));
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
                   ? std::optional(
                         LossOf(EKind::kServerProgram, "provider brocade is disabled, bcu: " + Cause(program)))
                   : std::nullopt;
    }
    std::string command = program.fName;
    for (const std::string& argument : program.fArguments) {
        command += " " + argument;
    }
    return LossOf(EKind::kServerProgram, command + " failed: " + Cause(program));
}

} // namespace vrxhost
