#pragma once

#include "host/cli/Document.h"
#include "host/cli/Options.h"
#include "host/cli/TDocumentOutput.h"
#include "host/cli/TLossLog.h"
#include "host/cli/TPrivateServer.h"
#include "host/cli/TSession.h"
#include "host/cli/TStopSignals.h"

#include <host/ICIMNamespace.h>

#include <cstddef>
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
    void Interrupt();
    void LoadSettings() const;
    void SetConsumer() const;
    void UsePlugin();
    void OpenNamespace(TSession& session);
    bool PauseBefore(int attempt) const;
    void Show(NKOLVRX20::ICIMNamespace& ns);
    void Write();
    void Fail(const std::string& reason);
    void ReportLosses();
    EExitStatus GetStatus() const;

    const TOptions& fOptions;
    const std::string fConsumer;
    const TPrivateServer fServer;
    TStopSignals fStop; // before every other thread
    TDocumentOutput fOutput;
    TLossLog fLosses;
    TDocument fDocument;
    bool fFailed = false;
    std::size_t fReportedCount = 0; // of the losses
    int fWriteError = 0;
};

} // namespace vrxhost
