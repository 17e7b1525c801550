#pragma once

#include <host/ILogger.h>

#include <memory>
#include <string>

namespace NKOLVRX20 {

// The host's own logger: time, severity and text of each entry, to a file, to standard error, to both or nowhere.
// At first it writes errors to standard error and nothing else.
// Thread: safe.
class TCoreLogger : public ILogger
{
  public:
    struct TOptions
    {
        std::string fFile;      // empty for none; has mode 0600, and links are not followed
        bool fTruncate = false; // what the file holds already is dropped rather than appended to
        bool fToStandardError = false;
        EVRXLogSeverity fLeastSevere = kInfo; // entries beyond this severity are dropped
    };

    static TCoreLogger& Instance();

    // Replaces what was configured before.
    // Throws: TVRXException 3 when the file cannot be opened for writing; the configuration is then unchanged.
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
