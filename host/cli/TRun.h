#pragma once

#include "host/cli/Options.h"
#include "host/cli/TLossLog.h"
#include "host/cli/TPrivateServer.h"
#include "host/cli/TReport.h"
#include "host/cli/TSession.h"
#include "host/cli/TStopSignals.h"

#include <host/ICIMNamespace.h>

#include <condition_variable>
#include <mutex>
#include <string>

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
    void Enter(EPhase phase);
    void LoadSettings() const;
    void SetConsumer() const;
    void UsePlugin();
    void OpenNamespace(TSession& session);
    bool PauseBefore(int attempt) const;
    void Show(NKOLVRX20::ICIMNamespace& ns);

    const TOptions& fOptions;
    const std::string fConsumer;
    const TPrivateServer fServer;
    TLossLog fLosses;
    std::mutex fPhaseMutex;
    std::condition_variable fPhaseChanged;
    EPhase fPhase = EPhase::kBefore;
    TStopSignals fStop; // after what its thread uses
    TReport fReport;
};

} // namespace vrxhost
