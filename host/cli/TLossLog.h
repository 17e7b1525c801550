#pragma once

#include "host/cli/LossRules.h"

#include <host/ILogger.h>

#include <mutex>
#include <set>
#include <string>
#include <vector>

namespace vrxhost {

// The host's core logger while vrxhost runs: passes every line on to the host's own logger, and learns from the
// plug-in's lines what was lost. Each cause becomes one sentence, reported once. Thread: safe.
class TLossLog : public NKOLVRX20::ILogger
{
  public:
    // root: the directory below which the server's programs and providers lie.
    explicit TLossLog(const std::string& root);

    void Log(EVRXLogSeverity severity, const std::string& text) override;

    // Enters what the host itself found out.
    void Add(const std::string& sentence);

    // Forgets everything: the namespace is about to be opened once more.
    void StartOver();

    // From now on lines are only passed on: what an interruption breaks is excluded from the losses.
    void Freeze();

    // Enters what was held back in case that another attempt would succeed.
    void AddHeldBack();

    // Returns: true when the latest attempt to start the server and to connect to it failed; also when only the start
    // did, because it is somebody else's server then that answers on the port.
    bool HasNoServer() const;

    // Returns: true when the latest attempt connected although the server had failed to start: another one answered.
    bool HasForeignServer() const;

    // Returns: the sentences so far, in the order in which things were lost.
    std::vector<std::string> GetSentences() const;

  private:
    void Enter(const std::string& sentence);
    void Enter(const TLoss& loss);
    void Learn(EVRXLogSeverity severity, const std::string& text);
    void LearnFromPrograms();
    bool LearnFromAttempt(const std::string& text);
    void Release();

    const std::string fRoot;
    mutable std::mutex fMutex;
    std::string fLoadedFile;   // the provider description being read
    std::string fHeldBack;     // why the server did not start, when it last failed to
    bool fStartFailed = false; // in this attempt
    bool fNoServer = false;
    bool fForeignServer = false;
    bool fFrozen = false;
    std::vector<TLoss> fLosses; // an object is a list of names
    std::set<std::string> fKnown;
};

} // namespace vrxhost
