#include "host/cli/TRun.h"

#include "host/cli/ErrorReport.h"
#include "host/cli/TCollector.h"
#include "host/core/TProcessControl.h"

#include <host/TConfig.h>
#include <host/TRootObject.h>

#include <chrono>
#include <fstream>
#include <random>

namespace vrxhost {
namespace {

// Of opening the namespace, when another host took the port; and the longest pause before one, times its number.
constexpr int kAttempts = 3;
constexpr int kLongestPauseMs = 500;

constexpr std::chrono::seconds kGraceOfAttempt{4}; // longer than the pauses of one attempt that is left in order

// Returns: the first malformed line (valid are "key = value", comments and empty lines), else what the reader said.
std::string SettingsError(const std::string& file, const std::string& error)
{
    std::ifstream lines(file);
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        const std::size_t begin = line.find_first_not_of(" \t\r");
        if (begin != std::string::npos && line[begin] != '#' && line.find('=') == std::string::npos) {
            return "line " + std::to_string(number) + " is not \"key = value\"";
        }
    }
    return error;
}

} // namespace

using NKOLVRX20::ILogger;
using NKOLVRX20::TConfig;
using NKOLVRX20::TProcessControl;
using NKOLVRX20::TRootObject;

TRun::TRun(const TOptions& options)
    : fOptions(options), fConsumer(options.fConsumer.empty() ? options.fDefaultConsumer : options.fConsumer),
      fServer(options.fRoot, fConsumer), fLosses(options.fRoot), fStop([this] { Interrupt(); }),
      fReport(options, fStop, fLosses)
{
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
        fReport.Fail(e.what());
    }
    return fReport.Finish();
}

// On the signal thread: waiting programs end and further starts are refused, which leads the plug-in out of its
// attempts; then waiting calls fail. After the loss of its server the plug-in would first try to connect again and
// again, so during an attempt the server is ended only when the way out takes too long.
void TRun::Interrupt()
{
    fLosses.Freeze();
    TProcessControl::Instance().Cancel();
    std::unique_lock<std::mutex> lock(fPhaseMutex);
    fPhaseChanged.wait_for(lock, kGraceOfAttempt, [this] { return fPhase != EPhase::kOpening; });
    const bool isNeeded = fPhase != EPhase::kEnding;
    lock.unlock();
    if (isNeeded) {
        fServer.End();
    }
}

void TRun::Enter(EPhase phase)
{
    const std::lock_guard<std::mutex> lock(fPhaseMutex);
    fPhase = phase;
    fPhaseChanged.notify_all();
}

void TRun::LoadSettings() const
{
    if (!fOptions.fConfigFile.empty()) {
        const std::string error = ErrorOf([&] { TConfig::GetInstance()->Load(fOptions.fConfigFile); });
        if (!error.empty()) {
            throw TPluginError("the settings file " + fOptions.fConfigFile +
                               " could not be read: " + SettingsError(fOptions.fConfigFile, error));
        }
    }
    for (const auto& setting : fOptions.fSettings) {
        TConfig::GetInstance()->setValue(setting.first, setting.second);
    }
}

// A server of some other make may lack the setting; that matters only when a name was asked for.
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
        Enter(EPhase::kOpening);
        const std::string error = ErrorOf([&] { session.Open(); });
        Enter(error.empty() ? EPhase::kOpen : EPhase::kEnding);
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
    TRootObject::SetCoreLogger(&fLosses);
    TSession session(fOptions.fPlugin, fConsumer);
    OpenNamespace(session);
    if (fLosses.HasNoServer()) {
        throw TPluginError("the namespace has no server of its own");
    }
    Show(session.GetNamespace());
    Enter(EPhase::kEnding);
    const std::string problem = session.Close();
    if (!problem.empty()) {
        fLosses.Add(problem);
    }
}

void TRun::Show(NKOLVRX20::ICIMNamespace& ns)
{
    std::vector<TProviderRecord> providers;
    std::string noClass;
    const std::string error = ErrorOf([&] {
        TCollector collector(ns, fLosses, [this] { return fStop.IsStopped(); });
        providers = collector.Collect(fOptions.fCommand, fOptions.fClassName);
        if (fOptions.fCommand == ECommand::kInstances && providers.empty()) {
            noClass =
                "there is no class " + fOptions.fClassName + Suggestion(fOptions.fClassName, collector.GetClassNames());
        }
    });
    if (!error.empty()) {
        fLosses.Add("the inventory is incomplete: " + error);
    }
    if (!noClass.empty()) {
        fReport.Fail(noClass);
    } else {
        fReport.Show(std::move(providers));
    }
}

} // namespace vrxhost
