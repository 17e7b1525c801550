// SPDX-License-Identifier: MIT
#include "host/cli/losses/LossRules.h"

#include "host/cli/losses/LinePattern.h"
#include "host/cli/losses/RegistrationText.h"

#include <host/TVRXStatusCode.h>

#include <algorithm>
#include <filesystem>
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
    constexpr char kName[] = "TPEGASUSNamespace::CollectClass failed: the class name \"<text>\" in <text> is invalid";
    constexpr char kTimeout[] = "TPEGASUSNamespace::CollectClass: the timeout of class <text> in <text> is not a "
                                "number of seconds up to <number>: \"<text>\" becomes <text>";
    constexpr char kEmbedded[] = "Not supported type of property <word> in class <word>: <number>, default to string.";
    TLoss loss;
    if (const auto name = MatchLine(kName, line)) {
        loss = LossOf(EKind::kClassName, "the class name \"" + name->at(0) + "\" is invalid");
        loss.fFile = name->at(1);
        loss.fVendor = VendorOfFile(loss.fFile);
        loss.fClasses = {name->at(0)};
    } else if (const auto timeout = MatchLine(kTimeout, line)) {
        loss = LossOf(EKind::kTimeout, "the timeout of class " + timeout->at(0) + " is \"" + timeout->at(3) +
                                           "\", which is not a number of seconds up to " + timeout->at(2) +
                                           ", and becomes " + timeout->at(4));
        loss.fFile = timeout->at(1);
        loss.fVendor = VendorOfFile(loss.fFile);
        loss.fClasses = {timeout->at(0)};
        loss.fIsNote = true;
    } else if (const auto embedded = MatchLine(kEmbedded, line)) {
        loss = LossOf(EKind::kEmbeddedObject, "an embedded object is shown as text: ");
        loss.fObjects = {embedded->at(1) + "." + embedded->at(0)};
        loss.fClasses = {embedded->at(1)};
        loss.fIsNote = true;
    } else {
        return std::nullopt;
    }
    return loss;
}

// "FILE:LINE:COLUMN", at the end of what the compiler's warning begins with; the plug-in's log may write before it.
std::optional<std::vector<std::string>> PlaceIn(const std::string& text)
{
    const std::size_t before = text.rfind(": ");
    return MatchLine("/<text>:<number>:<number>", before == std::string::npos ? text : text.substr(before + 2));
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
    static const std::string kWarning = "<text>: warning: " + std::string(kTrap) + "<text>";
    std::vector<TLoss> notes;
    std::istringstream lines(text.find(kTrap) == std::string::npos ? "" : text);
    for (std::string line; std::getline(lines, line);) {
        const auto warning = MatchLine(kWarning, line);
        const auto place = warning ? PlaceIn(warning->front()) : std::nullopt;
        if (place) {
            TLoss note = LossOf(EKind::kMofPortability, "line " + place->at(1) + ", column " + place->at(2) +
                                                            ": fails on OpenPegasus 2.14: " + warning->back());
            note.fFile = "/" + place->front();
            note.fVendor = VendorOfFile(note.fFile);
            note.fIsNote = true;
            notes.push_back(std::move(note));
        }
    }
    return notes;
}

std::optional<TLoss> NoteOfServerLine(const TServerLogLine& line)
{
    if (const auto found = MatchLine("<text>addKey: <word> is not a key of class <word><text>", line.fText)) {
        TLoss key =
            LossOf(EKind::kUndeclaredKey, "provider module " + line.fModule + " uses " + found->at(1) +
                                              " as a key of class " + found->at(2) + ", which declares it as none");
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
    const auto unknown = MatchLine("<text>setProperty: class <word> has no property <word><text>", line.fText);
    auto other = MatchLine("<text>setProperty: property <word> of <word> has another type<text>", line.fText);
    if (!other) {
        other = MatchLine("<text>addKey: key <word> of <word> has another type<text>", line.fText);
    }
    if (!unknown && !other) {
        return std::nullopt;
    }
    TLoss loss;
    loss.fKind = unknown ? EKind::kUndeclaredProperty : EKind::kPropertyType;
    loss.fClasses = {unknown ? unknown->at(1) : other->at(2)};
    loss.fProperty = unknown ? unknown->at(2) : other->at(1);
    loss.fBegin = "property " + loss.fProperty + " of class " + loss.fClasses.front();
    loss.fEnd = std::string(unknown ? " is not declared" : " is declared with another type") +
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
    // The plug-in's list of the vendors' folders, which the server refuses when it is empty.
    if (program.fName == "cimconfig" && program.fArguments == std::vector<std::string>{"-s", "providerDir="}) {
        TLoss none = LossOf(EKind::kNoVendor, "there is nothing to show: pegasus/provider has no vendor's folder");
        none.fIsNote = true;
        return none;
    }
    std::string command = program.fName;
    for (const std::string& argument : program.fArguments) {
        command += " " + argument;
    }
    return LossOf(EKind::kServerProgram, command + " failed: " + Cause(program));
}

} // namespace vrxhost
