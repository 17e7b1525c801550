#include "host/cli/TRun.h"

#include "host/cli/Document.h"
#include "host/cli/ErrorReport.h"
#include "host/cli/TCollector.h"
#include "host/core/TProcessControl.h"

#include <host/TConfig.h>
#include <host/TRootObject.h>

#include <cerrno>
#include <cstring>
#include <random>

namespace vrxhost {
namespace {

// Of opening the namespace, when another host took the port; and the longest pause before one, times its number.
constexpr int kAttempts = 3;
constexpr int kLongestPauseMs = 500;

} // namespace

using NKOLVRX20::ILogger;
using NKOLVRX20::TConfig;
using NKOLVRX20::TProcessControl;
using NKOLVRX20::TRootObject;

TRun::TRun(const TOptions& options)
    : fOptions(options), fConsumer(options.fConsumer.empty() ? options.fDefaultConsumer : options.fConsumer),
      fServer(options.fRoot, fConsumer), fStop([this] { Interrupt(); }), fLosses(options.fRoot)
{
    fDocument.fCommand = options.fCommand;
}

TRun::~TRun()
{
    TRootObject::SetCoreLogger(nullptr);
}

EExitStatus TRun::Execute()
{
    try {
        LoadSettings();
        SetConsumer();
        if (!fStop.IsStopped()) {
            UsePlugin();
        }
    } catch (const TPluginError& e) {
        Fail(e.what());
    }
    return GetStatus();
}

// On the signal thread: waiting programs end, waiting calls fail, and the main thread finds its way out.
void TRun::Interrupt()
{
    TProcessControl::Instance().Cancel();
    fServer.End();
}

void TRun::LoadSettings() const
{
    if (!fOptions.fConfigFile.empty()) {
        const std::string error = ErrorOf([&] { TConfig::GetInstance()->Load(fOptions.fConfigFile); });
        if (!error.empty()) {
            throw TPluginError("the settings file " + fOptions.fConfigFile + " could not be read: " + error);
        }
    }
    for (const auto& setting : fOptions.fSettings) {
        TConfig::GetInstance()->setValue(setting.first, setting.second);
    }
}

// A server of some other make need not know the setting; that matters only when a name was asked for.
void TRun::SetConsumer() const
{
    const std::string error = fServer.SetConsumer();
    if (!error.empty() && !fOptions.fConsumer.empty()) {
        throw TPluginError("the consumer " + fOptions.fConsumer + " could not be set, cimconfig: " + error);
    }
}

// The port is chosen before the server binds it, so that another host's server may be the one that answers on it.
void TRun::OpenNamespace(TSession& session)
{
    for (int attempt = 1;; ++attempt) {
        const std::string error = ErrorOf([&] { session.Open(); });
        if (fLosses.HasForeignServer() && attempt < kAttempts && PauseBefore(attempt + 1)) {
            session.Clear();
            fLosses.StartOver();
        } else if (!error.empty()) {
            throw TPluginError(error);
        } else {
            return;
        }
    }
}

// A growing and random time, so that hosts that met once do not meet again.
// Returns: false when interrupted.
bool TRun::PauseBefore(int attempt) const
{
    std::random_device random;
    const int pauseMs = std::uniform_int_distribution<int>(0, attempt * kLongestPauseMs)(random);
    TRootObject::GetCoreLogger()->Log(
        ILogger::kNotice, "vrxhost: another server answered on the chosen port; attempt " + std::to_string(attempt) +
                              " of " + std::to_string(kAttempts) + " begins in " + std::to_string(pauseMs) + " ms");
    return !fStop.AwaitStop(pauseMs);
}

void TRun::UsePlugin()
{
    TRootObject::SetCoreLogger(&fLosses);
    TSession session(fOptions.fPlugin, fConsumer);
    OpenNamespace(session);
    if (fLosses.HasNoServer()) {
        throw TPluginError("the namespace has no server of its own");
    }
    Show(session.GetNamespace());
    const std::string problem = session.Close();
    if (fStop.IsStopped()) {
        return;
    }
    if (!problem.empty()) {
        fLosses.Add(problem);
    }
    ReportLosses(); // of the shutdown
}

void TRun::Show(NKOLVRX20::ICIMNamespace& ns)
{
    const std::string error = ErrorOf([&] {
        TCollector collector(ns, fLosses, [this] { return fStop.IsStopped(); });
        fDocument.fProviders = collector.Collect(fOptions.fCommand, fOptions.fClassName);
    });
    if (!error.empty()) {
        fLosses.Add("the inventory is incomplete: " + error);
    }
    if (fOptions.fCommand == ECommand::kInstances && fDocument.fProviders.empty()) {
        Fail("there is no class " + fOptions.fClassName);
    } else {
        Write();
    }
}

void TRun::Write()
{
    if (fStop.IsStopped()) {
        return;
    }
    ReportLosses();
    fDocument.fLosses = fLosses.GetSentences();
    fDocument.fComplete = fDocument.fLosses.empty();
    const std::string text = fOptions.fFormat == EFormat::kJson ? RenderJson(fDocument) : RenderTable(fDocument);
    fWriteError = fOutput.Write(text, fStop.GetFd());
    // A reader that has seen enough and left is not worth a sentence.
    if (fWriteError != 0 && fWriteError != EPIPE && fWriteError != ECANCELED) {
        ReportError(std::string("the document could not be written: ") + std::strerror(fWriteError));
    }
}

// There is no inventory; a reader of JSON still gets a document.
void TRun::Fail(const std::string& reason)
{
    if (fStop.IsStopped()) {
        return;
    }
    fFailed = true;
    fLosses.AddHeldBack();
    fLosses.Add(reason);
    if (fOptions.fFormat == EFormat::kJson) {
        Write();
    } else {
        ReportLosses();
    }
}

// Those that were not reported yet.
void TRun::ReportLosses()
{
    const auto sentences = fLosses.GetSentences();
    for (; fReportedCount < sentences.size(); ++fReportedCount) {
        ReportError(sentences[fReportedCount]);
    }
}

EExitStatus TRun::GetStatus() const
{
    if (fStop.IsStopped()) {
        ReportError("interrupted");
        return kInterrupted;
    }
    if (fFailed || fWriteError != 0) {
        return kFailed;
    }
    return fReportedCount == 0 ? kComplete : kPartial;
}

} // namespace vrxhost
