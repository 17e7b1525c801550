// SPDX-License-Identifier: MIT
#pragma once

#include <host/ILogger.h>

#include <functional>
#include <memory>
#include <string>

namespace NKOLVRX20 {

// The host's own logger: time, severity and text of each entry, to a file, to standard error, to both or nowhere.
// At first it writes errors only, to standard error.
// Thread: safe.
class TCoreLogger : public ILogger
{
  public:
    struct TOptions
    {
        std::string fFile;      // gets mode 0600; links are refused; empty for none
        bool fTruncate = false; // replaces the file's content instead of appending
        bool fToStandardError = false;
        EVRXLogSeverity fLeastSevere = kInfo; // less severe entries (higher numbers) are dropped
        // Gets the reason when an entry cannot be written, the first time only. Called by Log.
        std::function<void(const std::string& reason)> fOnFailure = nullptr;
    };

    static TCoreLogger& Instance();

    // Replaces what was configured before.
    // Throws: TVRXException 3 when opening the file for writing fails; the configuration then stays as it was.
    void Configure(const TOptions& options);

    void Log(EVRXLogSeverity severity, const std::string& text) override;

    ~TCoreLogger() override;

  private:
    TCoreLogger();

    struct TSinks;
    std::shared_ptr<TSinks> Current() const;

    std::shared_ptr<TSinks> fSinks; // replaced as a whole, accessed atomically
};

} // namespace NKOLVRX20
