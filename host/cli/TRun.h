// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/Options.h"
#include "host/cli/Steps.h"
#include "host/cli/TPrivateServer.h"
#include "host/cli/TProviderWatch.h"
#include "host/cli/TReport.h"
#include "host/cli/TSession.h"
#include "host/cli/TStopSignals.h"
#include "host/cli/losses/TLossLog.h"
#include "host/cli/losses/TRegistrationCheck.h"
#include "host/cli/losses/TServerLog.h"
#include "host/cli/losses/TVendorFiles.h"

#include <host/ICIMNamespace.h>

#include <condition_variable>
#include <map>
#include <mutex>
#include <set>
#include <string>

#include <pthread.h>

namespace vrxhost {

// One run of the program after the command line: everything between the signals' set-up and the exit status.
// Thread: made before any other thread of the process, used by the one that made it.
class TRun
{
  public:
    // The options outlive the object.
    explicit TRun(const TOptions& options);
    ~TRun();

    EExitStatus Execute();

  private:
    // Where a run stands, for the signal thread: what helps to end it depends on that.
    enum class EPhase
    {
        kBefore,  // no server yet
        kOpening, // the plug-in starts and stops servers by its own plan
        kOpen,    // the server answers calls
        kEnding   // the plug-in stops the server itself
    };

    void Interrupt();
    void HurryAttempt();
    void Enter(EPhase phase);
    void SetConsumer() const;
    void UsePlugin();
    void OpenNamespace(TSession& session);
    bool PauseBefore(int attempt) const;
    void Show(NKOLVRX20::ICIMNamespace& ns);
    void FindSilentLosses(TRegistrationCheck& check, const TDocument& document);
    void LearnModules(const TRegistrationCheck& check);
    void GiveUp(const std::string& className) const;

    const TOptions& fOptions;
    const std::string fConsumer;
    const TPrivateServer fServer;
    const TServerLog fServerLog;
    const TVendorFiles fVendors;
    const pthread_t fThread; // the one that calls the plug-in
    TLossLog fLosses;
    std::map<std::string, std::set<std::string>> fModules; // of each vendor; complete before the first deadline
    TStatusLine fLine;
    TStepLog fStepLog;
    std::mutex fPhaseMutex;
    std::condition_variable fPhaseChanged;
    EPhase fPhase = EPhase::kBefore;
    TStopSignals fStop; // after what its thread uses
    TProviderWatch fWatch;
    TReport fReport;
};

} // namespace vrxhost
