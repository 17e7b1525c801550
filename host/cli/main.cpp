// vrxhost: a command-line host for a namespace-provider plug-in.
#include <cerrno>
#include <csignal>
#include <cstring>
#include <iostream>
#include <system_error>

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

#include <core/TCoreLogger.h>
#include <core/TProcessControl.h>
#include <core/UniqueFd.h>
#include <host/TConfig.h>
#include <host/TRootObject.h>
#include <host/TVRXException.h>

#include "Collector.h"
#include "DocumentOutput.h"
#include "Guard.h"
#include "LossLog.h"
#include "Options.h"
#include "PrivateServer.h"
#include "Render.h"
#include "Session.h"
#include "StopSignals.h"

namespace vrxhost {
namespace {

using NKOLVRX20::ILogger;
using NKOLVRX20::TConfig;
using NKOLVRX20::TCoreLogger;
using NKOLVRX20::TProcessControl;
using NKOLVRX20::TRootObject;

void Say(const std::string& sentence)
{
    std::cerr << "vrxhost: " << sentence << std::endl;
}

void OpenLog(const TOptions& options)
{
    TCoreLogger::TOptions log;
    log.fToStandardError = options.fVerbose;
    log.fLeastSevere = ILogger::kDebug;
    log.fFile = options.fLogFile;
    log.fTruncate = true;
    try {
        TCoreLogger::Instance().Configure(log);
    } catch (const NKOLVRX20::TVRXException&) {
        Say("the log file " + options.fLogFile + " could not be opened; going on without");
        log.fFile.clear();
        TCoreLogger::Instance().Configure(log);
    }
}

void LoadSettings(const TOptions& options)
{
    if (!options.fConfigFile.empty()) {
        const std::string error = Guarded([&] { TConfig::GetInstance()->Load(options.fConfigFile); });
        if (!error.empty())
            throw TPluginError("the settings file " + options.fConfigFile + " could not be read: " + error);
    }
    for (const auto& setting : options.fSettings)
        TConfig::GetInstance()->setValue(setting.first, setting.second);
}

// A server of some other make need not know the setting; that matters only when a name was asked for.
void SetConsumer(const PrivateServer& server, const std::string& askedFor)
{
    const std::string error = server.SetConsumer();
    if (!error.empty() && !askedFor.empty())
        throw TPluginError("the consumer " + askedFor + " could not be set, cimconfig: " + error);
}

// One run of the program after the command line: everything between the signals' set-up and the exit status.
class Run
{
  public:
    explicit Run(const TOptions& options)
        : fOptions(options), fConsumer(options.fConsumer.empty() ? kDefaultConsumer : options.fConsumer),
          fServer(options.fRoot, fConsumer), fStop([this] { Interrupt(); }), fLosses(options.fRoot)
    {
        TRootObject::SetCoreLogger(&fLosses);
        fDocument.fCommand = options.fCommand;
    }

    ~Run() { TRootObject::SetCoreLogger(nullptr); }

    EExitStatus Execute()
    {
        try {
            LoadSettings(fOptions);
            SetConsumer(fServer, fOptions.fConsumer);
            if (!fStop.IsStopped())
                UsePlugin();
        } catch (const TPluginError& e) {
            Fail(e.what());
        }
        return GetStatus();
    }

  private:
    // On the signal thread: waiting programs end, waiting calls fail, and the main thread finds its way out.
    void Interrupt()
    {
        TProcessControl::Instance().Cancel();
        fServer.End();
    }

    void UsePlugin()
    {
        Session session(fOptions.fPlugin, fConsumer);
        Show(session.GetNamespace());
        const std::string problem = session.Close();
        if (fStop.IsStopped())
            return;
        if (!problem.empty())
            fLosses.Add(problem);
        TellLosses(); // of the shutdown
    }

    void Show(NKOLVRX20::ICIMNamespace& ns)
    {
        const std::string error = Guarded([&] {
            Collector collector(ns, fLosses, [this] { return fStop.IsStopped(); });
            fDocument.fProviders = collector.Collect(fOptions.fCommand, fOptions.fClassName);
        });
        if (!error.empty())
            fLosses.Add("the inventory is incomplete: " + error);
        if (fOptions.fCommand == ECommand::kInstances && fDocument.fProviders.empty())
            Fail("there is no class " + fOptions.fClassName);
        else
            Write();
    }

    void Write()
    {
        if (fStop.IsStopped())
            return;
        TellLosses();
        fDocument.fLosses = fLosses.GetSentences();
        fDocument.fComplete = fDocument.fLosses.empty();
        const std::string text = fOptions.fFormat == EFormat::kJson ? RenderJson(fDocument) : RenderTable(fDocument);
        fWriteError = fOutput.Write(text, fStop.GetFd());
        // A reader that has seen enough is no failure worth a word.
        if (fWriteError != 0 && fWriteError != EPIPE && fWriteError != ECANCELED)
            Say(std::string("the document could not be written: ") + std::strerror(fWriteError));
    }

    // There is no inventory; a reader of JSON still gets a document.
    void Fail(const std::string& reason)
    {
        if (fStop.IsStopped())
            return;
        fFailed = true;
        fLosses.Add(reason);
        if (fOptions.fFormat == EFormat::kJson)
            Write();
        else
            TellLosses();
    }

    // Says those that were not said yet.
    void TellLosses()
    {
        fLosses.AddFailedPrograms(!fFailed);
        const auto sentences = fLosses.GetSentences();
        for (; fToldCount < sentences.size(); ++fToldCount)
            Say(sentences[fToldCount]);
    }

    EExitStatus GetStatus() const
    {
        if (fStop.IsStopped()) {
            Say("interrupted");
            return kInterrupted;
        }
        if (fFailed || fWriteError != 0)
            return kFailed;
        return fToldCount == 0 ? kComplete : kPartial;
    }

    const TOptions& fOptions;
    const std::string fConsumer;
    const PrivateServer fServer;
    StopSignals fStop; // before every other thread
    DocumentOutput fOutput;
    LossLog fLosses;
    TDocument fDocument;
    bool fFailed = false;
    std::size_t fToldCount = 0;
    int fWriteError = 0;
};

// Enters the root and keeps every other vrxhost out of it: two hosts would stop each other's server.
// Returns: the lock, none when it failed and was told.
NKOLVRX20::UniqueFd EnterRoot(const std::string& root)
{
    NKOLVRX20::UniqueFd directory(::open(root.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
    if (!directory || ::fchdir(directory.Get()) != 0)
        Say("the root directory " + root + " could not be entered: " + std::strerror(errno));
    else if (::flock(directory.Get(), LOCK_EX | LOCK_NB) != 0)
        Say(errno == EWOULDBLOCK ? "another vrxhost is at work in " + root
                                 : "the root directory " + root + " could not be locked: " + std::strerror(errno));
    else
        return directory;
    return NKOLVRX20::UniqueFd();
}

int Main(int argc, const char* const* argv)
{
    TOptions options;
    const int status = ParseOptions(argc, argv, options);
    if (status >= 0)
        return status;
    const NKOLVRX20::UniqueFd rootLock = EnterRoot(options.fRoot);
    if (!rootLock)
        return kFailed;
    std::signal(SIGPIPE, SIG_IGN); // a reader that has gone is a write error here
    OpenLog(options);
    Run run(options);
    const EExitStatus result = run.Execute();
    if (PluginLibrary::HasLeftThreads())
        ::_exit(result);
    return result;
}

} // namespace
} // namespace vrxhost

int main(int argc, char** argv)
{
    try {
        return vrxhost::Main(argc, argv);
    } catch (const std::exception& e) {
        std::cerr << "vrxhost: " << e.what() << std::endl;
        return vrxhost::kFailed;
    }
}
