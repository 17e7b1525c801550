// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/losses/TServerLog.h"
#include "host/cli/losses/TVendorFiles.h"
#include "host/cli/model/Loss.h"

#include <host/ILogger.h>

#include <map>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace vrxhost {

// The host's core logger while vrxhost runs: passes every line on to the host's own logger, and learns from the
// plug-in's lines what was lost. Error lines of every healthy start are passed on as notices with the mark "[normal]".
// Each cause becomes one entry. Thread: safe.
class TLossLog : public NKOLVRX20::ILogger
{
  public:
    // root: the directory below which the server's programs and providers lie.
    explicit TLossLog(const std::string& root);

    // The vendors to whom losses are ascribed.
    void SetVendors(const TVendorFiles& vendors);

    void Log(EVRXLogSeverity severity, const std::string& text) override;

    // Enters what the host itself found out.
    void Add(const std::string& sentence);
    void Add(const TLoss& loss);

    // Enters what the server's log says: refused values are losses; other lines go to the losses of their vendor.
    // vendors: the vendor of a module.
    void AddServerLog(const std::vector<TServerLogLine>& lines, const std::map<std::string, std::string>& vendors);

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

    // Returns: the losses and notes so far, one a cause, in the order in which things were lost.
    std::vector<TLoss> GetLosses() const;

  private:
    void Pass(EVRXLogSeverity severity, const std::string& text) const;
    void Enter(const std::string& sentence);
    void Enter(const TLoss& loss);
    void Learn(EVRXLogSeverity severity, const std::string& text);
    void LearnFromRule(const TLoss& loss);
    void LearnFromPrograms();
    bool LearnFromAttempt(const std::string& text);
    void LearnFromDescription(const std::string& text);
    bool LearnFromProperty(const std::string& text);
    void Release();

    const std::string fRoot;
    mutable std::mutex fMutex;
    TVendorFiles fVendors;
    std::map<std::string, std::vector<std::string>> fServerLines; // by vendor
    std::string fLoadedFile;                                      // the class list being read
    std::string fEnumeratedClass;
    std::optional<TLoss> fHeldBack; // why the server did not start, when it last failed to
    bool fStartFailed = false;      // in this attempt
    bool fNoServer = false;
    bool fForeignServer = false;
    bool fFrozen = false;
    bool fHasInvalidName = false; // of a class list, which ends the start
    std::vector<TLoss> fLosses;   // as they came
    std::set<std::string> fKnown;
};

// Returns: the losses with one entry for each cause: consequences of a file that did not compile are listed with it,
// and losses that differ in their objects alone share a sentence. Each names the vendor and the file that asks for its
// class, when a vendor does.
std::vector<TLoss> FoldLosses(const std::vector<TLoss>& losses, const TVendorFiles& vendors);

} // namespace vrxhost
