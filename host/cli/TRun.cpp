// SPDX-License-Identifier: MIT
#include "host/cli/TRun.h"

#include "host/cli/collect/TCollector.h"
#include "host/cli/losses/LibraryCheck.h"
#include "host/cli/model/ErrorReport.h"
#include "host/core/TProcessControl.h"

#include <host/TRootObject.h>

#include <chrono>
#include <csignal>
#include <iostream>
#include <optional>
#include <random>

namespace vrxhost {
namespace {

// Of opening the namespace, when another host took the port; and the longest pause before one, times its number.
constexpr int kAttempts = 3;
constexpr int kLongestPauseMs = 500;

// How long an interrupted attempt may take to end in order, and how often its pauses are cut.
constexpr std::chrono::seconds kGraceOfAttempt{2};
constexpr std::chrono::milliseconds kCutInterval{50};
constexpr int kCutSignal = SIGUSR1;

void IgnoreCut(int) {}

// A pause of the plug-in is a sleep(), which ends early on the thread that handles a signal. Calls that wait for a
// descriptor start again.
void MakePausesCuttable()
{
    struct sigaction action = {};
    action.sa_handler = IgnoreCut;
    action.sa_flags = SA_RESTART;
    ::sigaction(kCutSignal, &action, nullptr);
}

} // namespace

using NKOLVRX20::ILogger;
using NKOLVRX20::TProcessControl;
using NKOLVRX20::TRootObject;

TRun::TRun(const TOptions& options)
    : fOptions(options), fConsumer(options.fTreeConsumer), fServer(options.fRoot, fConsumer), fServerLog(options.fRoot),
      fVendors(ProviderDirectory(options.fPlugin)), fThread(::pthread_self()), fLosses(options.fRoot),
      fLine(!options.fQuiet && !options.fVerbose), fStepLog(fLine, fLosses),
      fStop(fLine.GetErasure(), [this] { Interrupt(); }),
      fWatch(fLine, fVendors, options.fDeadlineSeconds, [this](const std::string& name) { GiveUp(name); }),
      fReport(options, fStop, fLosses, fLine)
{
    RouteReports([this](const std::string& line) {
        const TStatusLine::TGap gap(fLine);
        std::cerr << line << std::flush;
    });
    TProcessControl::Instance().SetObserver([this](const std::vector<std::string>& arguments, int timeoutSeconds) {
        fLine.Show(StepOfProgram(arguments, timeoutSeconds));
    });
    fLosses.SetVendors(fVendors);
    MakePausesCuttable();
}

TRun::~TRun()
{
    TRootObject::SetCoreLogger(nullptr);
    TProcessControl::Instance().SetObserver(nullptr);
    RouteReports(nullptr);
}

EExitStatus TRun::Execute()
{
    try {
        SetConsumer();
        if (!fStop.IsStopped()) {
            UsePlugin();
        }
    } catch (const TPluginError& e) {
        fReport.Fail(e);
    }
    return fReport.Finish();
}

// On the signal thread: waiting programs end and further starts are refused, which leads the plug-in out of its
// attempts; then waiting calls fail. After the loss of its server the plug-in would first try to connect again, so
// during an attempt the server is ended only when the way out takes too long.
void TRun::Interrupt()
{
    fLine.Show({"stopping"});
    fLosses.Freeze();
    TProcessControl::Instance().Cancel();
    HurryAttempt();
    std::unique_lock<std::mutex> lock(fPhaseMutex);
    const bool isNeeded = fPhase != EPhase::kEnding;
    lock.unlock();
    if (isNeeded) {
        fServer.End();
        HurryAttempt();
    }
}

// The pauses between the tries of a start are the plug-in's; each is cut until the attempt is over. The pause of the
// shutdown is left as it is: it is the server's grace period.
void TRun::HurryAttempt()
{
    const auto deadline = std::chrono::steady_clock::now() + kGraceOfAttempt;
    std::unique_lock<std::mutex> lock(fPhaseMutex);
    while (fPhase == EPhase::kOpening && std::chrono::steady_clock::now() < deadline) {
        ::pthread_kill(fThread, kCutSignal);
        fPhaseChanged.wait_for(lock, kCutInterval);
    }
}

void TRun::Enter(EPhase phase)
{
    const std::lock_guard<std::mutex> lock(fPhaseMutex);
    fPhase = phase;
    fPhaseChanged.notify_all();
}

// A server of some other make may lack the setting; that matters only when a name was asked for.
void TRun::SetConsumer() const
{
    if (!fOptions.fPlansConsumer) {
        return;
    }
    const std::string error = fServer.SetConsumer();
    if (!error.empty() && !fOptions.fConsumer.empty()) {
        throw TPluginError(ELossKind::kServerProgram,
                           "the consumer " + fOptions.fConsumer + " could not be set, cimconfig: " + error);
    }
}

// The port is chosen before the server binds it, so that another host's server may be the one that answers on it.
void TRun::OpenNamespace(TSession& session)
{
    for (int attempt = 1;; ++attempt) {
        Enter(EPhase::kOpening);
        std::optional<TPluginError> failure;
        try {
            session.Open();
        } catch (const TPluginError& e) {
            failure = e;
        }
        Enter(failure ? EPhase::kEnding : EPhase::kOpen);
        if (fLosses.HasForeignServer() && attempt < kAttempts && PauseBefore(attempt + 1)) {
            session.Clear();
            fLosses.StartOver();
        } else if (failure) {
            throw TPluginError(*failure);
        } else {
            return;
        }
    }
}

// A growing and random time, so that hosts that collided once choose different moments.
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
    TRootObject::SetCoreLogger(&fStepLog);
    if (fOptions.fCommand->LooksAtTree()) {
        CheckLibraries(fVendors, fOptions.fRoot, fLosses);
    }
    TSession session(fOptions.fPlugin, fConsumer);
    OpenNamespace(session);
    if (fLosses.HasNoServer()) {
        throw TPluginError(ELossKind::kServer, "the namespace has no server of its own");
    }
    Show(session.GetNamespace());
    Enter(EPhase::kEnding);
    const std::string problem = session.Close();
    if (!problem.empty()) {
        fLosses.Add(LossOf(ELossKind::kPlugin, problem));
    }
}

void TRun::Show(NKOLVRX20::ICIMNamespace& ns)
{
    TDocument document;
    document.fHead = fReport.GetHead();
    std::optional<TRequestError> refused;
    TRegistrationCheck check(ns, fVendors, fLosses);
    if (fOptions.fDeadlineSeconds > 0) {
        check.ReadModules();
        LearnModules(check);
    }
    const std::string error = ErrorOf([&] {
        TCollector collector(ns, fLosses, [this] { return fStop.IsStopped() || fReport.HasBrokenOff(); });
        collector.SetSink(fOptions.fCommand->IsStreamed() ? fReport.BeginStream() : nullptr,
                          fOptions.fCommand->NeedsInstances());
        collector.SetWatch(&fWatch);
        try {
            fOptions.fCommand->Fill(collector, document);
        } catch (const TRequestError& e) {
            refused = e;
        }
    });
    if (!error.empty()) {
        fLosses.Add("the inventory is incomplete: " + error);
    }
    if (!fStop.IsStopped() && !fReport.HasBrokenOff()) {
        FindSilentLosses(check, document);
    }
    if (refused) {
        fReport.Fail(*refused);
    } else {
        fReport.Show(std::move(document));
    }
}

// For the thread that gives providers up, which must leave the namespace alone.
void TRun::LearnModules(const TRegistrationCheck& check)
{
    for (const auto& [module, vendor] : check.GetModuleVendors()) {
        fModules[vendor].insert(module);
    }
}

// On the watch's thread, while the other one waits for the answer: the end of the agent ends the wait.
void TRun::GiveUp(const std::string& className) const
{
    const TClassList* const list = fVendors.FindClass(className);
    const auto modules = list ? fModules.find(list->fVendor) : fModules.end();
    if (modules != fModules.end()) {
        fServer.EndAgents(modules->second);
    }
}

void TRun::FindSilentLosses(TRegistrationCheck& check, const TDocument& document)
{
    fLine.Show({"looking for what is missing"});
    if (document.fDetail == EDetail::kInstances) {
        check.Run(document.fProviders);
    }
    fLosses.AddServerLog(fServerLog.Read(), check.GetModuleVendors());
}

} // namespace vrxhost
