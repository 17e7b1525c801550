// SPDX-License-Identifier: MIT
#include "host/cli/losses/TLossLog.h"

#include "host/cli/losses/LossRules.h"
#include "host/core/TCoreLogger.h"
#include "host/core/TProcessLog.h"

#include <algorithm>

namespace vrxhost {
namespace {

constexpr char kRestart[] = " try to restart cimserver ";
constexpr char kConnected[] = "TPEGASUSNamespace::connect succeeded";
constexpr char kLoading[] = "Loading... ";
constexpr char kEnumerating[] = "TPEGASUSClass::EnumerateInstances ";
constexpr char kLostProperty[] = "4TPEGASUSClass::EnumerateInstances - Unable to retrieve property: ";
// Every message about a class list begins thus.
constexpr char kInvalidName[] = "PEGASUS: CIM name '";
constexpr char kUnknownName[] = ":Unrecognized ";
constexpr std::size_t kMaxServerLines = 3; // the last ones, of each loss

bool BeginsWith(const std::string& text, const char* begin)
{
    return text.rfind(begin, 0) == 0;
}

std::string WithoutLineFeed(const std::string& text)
{
    const std::size_t end = text.find_last_not_of('\n');
    return text.substr(0, end == std::string::npos ? 0 : end + 1);
}

} // namespace

TLossLog::TLossLog(const std::string& root) : fRoot(root) {}

void TLossLog::Log(EVRXLogSeverity severity, const std::string& text)
{
    Pass(severity, text);
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fFrozen) {
        LearnFromPrograms();
        Learn(severity, text);
    }
}

void TLossLog::Pass(EVRXLogSeverity severity, const std::string& text) const
{
    NKOLVRX20::TCoreLogger& log = NKOLVRX20::TCoreLogger::Instance();
    if (severity == kError && IsHarmless(text)) {
        log.Log(kNotice, text + " [normal]");
    } else {
        log.Log(severity, text);
    }
}

void TLossLog::SetVendors(const TVendorFiles& vendors)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fVendors = vendors;
}

void TLossLog::Learn(EVRXLogSeverity severity, const std::string& text)
{
    // First, as a line that only announces a request may begin like the one about its failure.
    if (const auto loss = LossOfLine(text)) {
        LearnFromRule(*loss);
        return;
    }
    if (LearnFromAttempt(text) || LearnFromProperty(text)) {
        return;
    }
    for (const TLoss& note : NotesOfCompiler(text)) {
        Enter(note);
    }
    if (BeginsWith(text, kLoading)) {
        fLoadedFile = text.substr(sizeof kLoading - 1);
    } else if (BeginsWith(text, kInvalidName) && fHasInvalidName) {
        return; // the line of the class list has said so
    } else if (severity != kError || IsHarmless(text)) {
        return;
    } else if (!BeginsWith(text, kClassListLine)) {
        Enter(WithoutLineFeed(text));
    } else {
        LearnFromDescription(text);
    }
}

// A superclass's embedded objects are the vendor's as soon as a class of a list has them.
void TLossLog::LearnFromRule(const TLoss& loss)
{
    if (loss.fKind == ELossKind::kEmbeddedObject && !fVendors.FindClass(loss.fClasses.front())) {
        return;
    }
    fHasInvalidName |= loss.fKind == ELossKind::kClassName;
    Enter(loss);
}

// Names that the class list's reader does not know may be for readers of a later version.
void TLossLog::LearnFromDescription(const std::string& text)
{
    TLoss loss =
        LossOf(ELossKind::kClassList, "class list " + fLoadedFile + ", line " + text.substr(sizeof kClassListLine - 1));
    loss.fIsNote = text.find(kUnknownName) != std::string::npos;
    Enter(loss);
}

// The line about a property leaves its class out: it is the one whose enumeration was announced last.
// Returns: whether the line is of either kind.
bool TLossLog::LearnFromProperty(const std::string& text)
{
    if (BeginsWith(text, kEnumerating)) {
        fEnumeratedClass = text.substr(sizeof kEnumerating - 1);
        return true;
    }
    if (!BeginsWith(text, kLostProperty)) {
        return false;
    }
    TLoss loss;
    loss.fKind = ELossKind::kInstances;
    loss.fProperty = text.substr(sizeof kLostProperty - 1);
    loss.fBegin = "property " + loss.fProperty;
    if (!fEnumeratedClass.empty()) {
        loss.fBegin += " of class " + fEnumeratedClass;
        loss.fClasses = {fEnumeratedClass};
    }
    loss.fEnd = " could not be converted and is missing from its instance";
    Enter(loss);
    return true;
}

// Returns: whether the line ends an attempt to start the server and to connect to it.
bool TLossLog::LearnFromAttempt(const std::string& text)
{
    const bool connected = BeginsWith(text, kConnected);
    if (!connected && text.find(kRestart) == std::string::npos) // the client's own tries are parts of an attempt
    {
        return false;
    }
    fForeignServer = connected && fStartFailed;
    fNoServer = !connected || fStartFailed;
    fStartFailed = false;
    if (!fNoServer) {
        fHeldBack.reset();
    }
    return true;
}

void TLossLog::Add(const std::string& sentence)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Enter(sentence);
}

void TLossLog::Add(const TLoss& loss)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Enter(loss);
}

void TLossLog::AddServerLog(const std::vector<TServerLogLine>& lines, const std::map<std::string, std::string>& vendors)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    for (const TServerLogLine& line : lines) {
        const auto vendor = vendors.find(line.fModule);
        if (auto loss = line.fIsOutput ? std::nullopt : LossOfServerLine(line)) {
            Enter(*loss);
        } else if (auto note = line.fIsOutput ? std::nullopt : NoteOfServerLine(line)) {
            note->fVendor = vendor == vendors.end() ? "" : vendor->second;
            Enter(*note);
        } else if (vendor != vendors.end()) {
            fServerLines[vendor->second].push_back(line.fText);
        }
    }
}

// The line of a failed program comes right after the program was kept, so the sentences stay in order.
void TLossLog::LearnFromPrograms()
{
    for (const auto& program : NKOLVRX20::TProcessLog::Instance().Take()) {
        const auto loss = LossOfProgram(program, fRoot);
        if (!loss) {
            continue;
        }
        if (IsServerStart(program)) {
            fHeldBack = loss;
            fStartFailed = true;
            continue;
        }
        Release(); // a cause goes before its consequences
        Enter(*loss);
    }
}

void TLossLog::StartOver()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fHeldBack.reset();
    fStartFailed = fNoServer = fForeignServer = fHasInvalidName = false;
    fLosses.clear();
    fKnown.clear();
}

void TLossLog::Freeze()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fFrozen = true;
}

void TLossLog::AddHeldBack()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Release();
}

void TLossLog::Release()
{
    if (fHeldBack) {
        Enter(*fHeldBack);
    }
    fHeldBack.reset();
}

bool TLossLog::HasNoServer() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fNoServer;
}

bool TLossLog::HasForeignServer() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    return fForeignServer;
}

std::vector<TLoss> TLossLog::GetLosses() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<TLoss> losses = FoldLosses(fLosses, fVendors);
    for (TLoss& loss : losses) {
        const auto lines = fServerLines.find(loss.fVendor);
        if (lines != fServerLines.end()) {
            const std::size_t count = std::min(lines->second.size(), kMaxServerLines);
            loss.fLog.assign(lines->second.end() - static_cast<std::ptrdiff_t>(count), lines->second.end());
        }
    }
    return losses;
}

void TLossLog::Enter(const std::string& sentence)
{
    Enter(LossOf(sentence));
}

void TLossLog::Enter(const TLoss& loss)
{
    if (fKnown.insert(loss.GetText()).second) {
        fLosses.push_back(loss);
    }
}

} // namespace vrxhost
