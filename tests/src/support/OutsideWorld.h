// SPDX-License-Identifier: MIT
#pragma once

#include <functional>
#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace NKOLVRX20 {

// A program that the plug-in asks the host to run.
struct TSpawnCall
{
    std::string fName; // or the command line
    std::vector<std::string> fArguments;
    std::string fProgramPath; // empty for the forms that search PATH
    std::vector<std::string> fEnvironment;
    int fTimeoutSeconds = 0;
};

// Stands, while it lives, between the plug-in and what it does to the machine: sleep, system, kill, bind, socket,
// dladdr, new threads, some files, and the host's process service. Every sleep, removal, kill and run is only
// traced, in order, as "sleep 3", "system rm ...", "kill 12 9", "run cimserver -s".
// The test program defines those functions itself; without an object of this class they forward to the real ones.
// Thread: safe.
class TOutsideWorld
{
  public:
    TOutsideWorld();
    ~TOutsideWorld();

    TOutsideWorld(const TOutsideWorld&) = delete;
    TOutsideWorld& operator=(const TOutsideWorld&) = delete;

    std::vector<std::string> Trace() const;
    // Returns: the entries of one kind ("system"), the kind cut off.
    std::vector<std::string> Traced(const std::string& kind) const;
    // Returns: the trace so far, which is then forgotten.
    std::vector<std::string> Take();
    std::vector<TSpawnCall> Runs() const;

    // Forgets the trace and the runs.
    void Forget();

    // --- the script: set before the plug-in runs ---

    // Called at every pause, before it "ends".
    std::function<void(unsigned int seconds)> fOnSleep;
    // Gives a program's output, and may throw as the process service would; the default output is empty.
    std::function<void(const TSpawnCall&, std::string& output)> fRun;
    // Called with every shell command in place of the shell.
    std::function<void(const std::string& command)> fOnSystem;
    // Decides about a port; by default every bind is real. Asked only for ports other than 0.
    std::function<bool(unsigned short port)> fIsPortFree;
    bool fBindForReal = true; // false: a free port is only said to be bound
    bool fSocketFails = false;
    bool fDladdrFails = false;
    std::optional<const char*> fDladdrFile; // absent: the real one
    int fThreadsUntilFailure = -1;          // -1: none fails
    std::string fUnreadableDirectory;
    // The file that is opened in place of the named one; an empty name makes the opening fail.
    std::map<std::string, std::string> fFiles;

    // --- what was seen ---

    std::string fProbe; // the address of the latest bind, and "close-on-exec" where the socket is

    // --- for the interposed functions ---

    static TOutsideWorld* Current();
    void Record(const std::string& entry);
    void Run(const TSpawnCall& call, std::string& output);
    bool TakeThread();

  private:
    mutable std::mutex fMutex;
    std::vector<std::string> fTrace;
    std::vector<TSpawnCall> fRuns;
};

} // namespace NKOLVRX20
