#include "host/cli/TLossLog.h"

#include "host/cli/LossRules.h"
#include "host/core/TCoreLogger.h"
#include "host/core/TProcessLog.h"

namespace vrxhost {
namespace {

constexpr char kRestart[] = " try to restart cimserver ";
constexpr char kConnected[] = "TPEGASUSNamespace::connect succeeded";
constexpr char kLoading[] = "Loading... ";
// Every message about a provider description begins thus; those on names unknown to the description's reader
// are routine, the root element's own name among them.
constexpr char kDescription[] = "Performance Data RDD Parser line ";
constexpr char kRoutine[] = ":Unrecognized ";

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
    NKOLVRX20::TCoreLogger::Instance().Log(severity, text);
    const std::lock_guard<std::mutex> lock(fMutex);
    if (!fFrozen) {
        LearnFromPrograms();
        Learn(severity, text);
    }
}

void TLossLog::Learn(EVRXLogSeverity severity, const std::string& text)
{
    if (LearnFromAttempt(text)) {
        return;
    }
    if (BeginsWith(text, kLoading)) {
        fLoadedFile = text.substr(sizeof kLoading - 1);
    } else if (const auto loss = LossOfLine(text)) {
        Enter(*loss);
    } else if (severity != kError || IsHarmless(text)) {
        return;
    } else if (!BeginsWith(text, kDescription)) {
        Enter(WithoutLineFeed(text));
    } else if (text.find(kRoutine) == std::string::npos) {
        Enter("provider description " + fLoadedFile + ", line " + text.substr(sizeof kDescription - 1));
    }
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
        fHeldBack.clear();
    }
    return true;
}

void TLossLog::Add(const std::string& sentence)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    Enter(sentence);
}

// The line of a failed program comes right after the program was kept, so the sentences stay in order.
void TLossLog::LearnFromPrograms()
{
    for (const auto& program : NKOLVRX20::TProcessLog::Instance().Take()) {
        const auto sentence = LossOfProgram(program, fRoot);
        if (!sentence) {
            continue;
        }
        if (IsServerStart(program)) {
            fHeldBack = *sentence;
            fStartFailed = true;
            continue;
        }
        Release(); // a cause goes before its consequences
        Enter(*sentence);
    }
}

void TLossLog::StartOver()
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fHeldBack.clear();
    fStartFailed = fNoServer = fForeignServer = false;
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
    if (!fHeldBack.empty()) {
        Enter(fHeldBack);
    }
    fHeldBack.clear();
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

std::vector<std::string> TLossLog::GetSentences() const
{
    const std::lock_guard<std::mutex> lock(fMutex);
    std::vector<std::string> sentences;
    for (const TLoss& loss : fLosses) {
        sentences.push_back(loss.fBegin + loss.fObject + loss.fEnd);
    }
    return sentences;
}

void TLossLog::Enter(const std::string& sentence)
{
    Enter(TLoss{sentence, "", ""});
}

void TLossLog::Enter(const TLoss& loss)
{
    if (!fKnown.insert(loss.fBegin + loss.fObject + loss.fEnd).second) {
        return;
    }
    for (TLoss& earlier : fLosses) {
        if (!loss.fObject.empty() && earlier.fBegin == loss.fBegin && earlier.fEnd == loss.fEnd) {
            earlier.fObject += ", " + loss.fObject;
            return;
        }
    }
    fLosses.push_back(loss);
}

} // namespace vrxhost
