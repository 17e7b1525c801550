// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/TDeployedTree.h"
#include "host/cli/commands/ICommand.h"
#include "host/cli/formats/IFormat.h"

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace vrxhost {

// What is wrong with the command line, as a sentence.
class TUsageError : public TFailure
{
  public:
    using TFailure::TFailure;
};

// What vrxhost ends with; docs and tests name these.
enum EExitStatus : int
{
    kComplete = 0,
    kFailed = 1, // there is no inventory
    kUsage = 2,
    kPartial = 3,   // something was lost and is named on standard error
    kDifferent = 4, // what diff compares is not the same
    kInterrupted = 130
};

struct TOptions
{
    std::shared_ptr<const ICommand> fCommand;
    std::string fCommandName; // as far as it is known when the command line is wrong
    std::string fFormat = "table";
    TFormatOptions fFormatOptions;
    std::string fRoot;  // the directory in which everything runs
    std::string fState; // the user's choice of a private root; empty for none
    std::string fPlugin;
    std::string fConsumer;      // empty: fTreeConsumer
    std::string fTreeConsumer;  // for which the tree's server runs
    bool fPlansConsumer = true; // the server has to know it
    std::string fConfigFile;    // empty: none
    std::string fLogFile;
    std::string fReplay; // the record in place of the machine; empty for none
    std::vector<std::pair<std::string, std::string>> fSettings;
    bool fVerbose = false;
    bool fQuiet = false;      // without the status line
    int fDeadlineSeconds = 0; // of each provider; 0 for none
};

constexpr char kPluginFile[] = "libpegasus.nsp.so";
constexpr char kConfigFile[] = "vrx.conf";
constexpr char kLogFile[] = "vrxhost.log";

// Reads the command line; paths come out absolute. Help and the version go to standard output. The format is filled in
// first, also when reading the rest fails. Returns: false when help or the version was all that was wanted. Throws:
// TUsageError, std::filesystem::filesystem_error.
bool ParseOptions(int argc, const char* const* argv, TOptions& options);

// Reads the command line as it stands (CommandLine.cpp): paths are as they were written, and what is not given keeps
// its value. Returns: as ParseOptions. Throws: TUsageError.
bool ReadCommandLine(int argc, const char* const* argv, TOptions& options);

// Makes a tree the root: the default place of the plug-in, the settings file and the log, and what decides on the
// consumer. Throws: TTreeError when the tree's server does not run for the wanted consumer.
void SetRoot(const TDeployedTree& tree, TOptions& options);

} // namespace vrxhost
