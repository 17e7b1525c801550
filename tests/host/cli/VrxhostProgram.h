// SPDX-License-Identifier: MIT
// vrxhost as a program, run in a small deployed tree of each test's own.
#pragma once

#include "host/core/TChildProcess.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include <unistd.h>

namespace vrxhost {

namespace fs = std::filesystem;
using NKOLVRX20::TProcessOutcome;

inline std::string ReadFile(const fs::path& path)
{
    std::stringstream text;
    text << std::ifstream(path).rdbuf();
    return text.str();
}

inline testing::AssertionResult HasStatus(const TProcessOutcome& outcome, int status)
{
    if (outcome.fEnd == TProcessOutcome::kExited && outcome.fStatus == status) {
        return testing::AssertionSuccess();
    }
    return testing::AssertionFailure() << "end " << outcome.fEnd << ", status " << outcome.fStatus << ", not " << status
                                       << "\nout: " << outcome.fOutput << "\nerr: " << outcome.fErrorOutput;
}

// Every path below a folder with its content.
inline std::map<std::string, std::string> Snapshot(const fs::path& folder)
{
    std::map<std::string, std::string> found;
    for (const auto& entry : fs::recursive_directory_iterator(folder)) {
        found[entry.path()] = entry.is_regular_file() ? ReadFile(entry.path()) : "";
    }
    return found;
}

class VrxhostProgram : public testing::Test
{
  protected:
    VrxhostProgram() { LayTree(); }
    ~VrxhostProgram() override { fs::remove_all(fFolder); }

    // What makes a folder a deployed tree; the fake plug-in needs no server.
    void LayTree() const
    {
        fs::remove_all(fFolder);
        fs::create_directories(fRoot / "pegasus/pegSchema");
        std::ofstream(fRoot / "pegasus/tree.conf") << "# a mark\nformat = 1\nserver = embedded\n";
        Install("cimserver", "");
        for (const char* folder : {"", "pegasus", "pegasus/bin", "pegasus/pegSchema"}) {
            SetMode(folder, 0755);
        }
        fs::permissions(fFolder, fs::perms(0755));
    }

    void SetMode(const fs::path& path, unsigned int mode) const { fs::permissions(fRoot / path, fs::perms(mode)); }

    // A program of the tree, as a shell script.
    void Install(const std::string& name, const std::string& script) const
    {
        fs::create_directories(fRoot / "pegasus/bin");
        std::ofstream(fRoot / "pegasus/bin" / name) << "#!/bin/sh\n" << script;
        SetMode("pegasus/bin/" + name, 0755);
    }

    TProcessOutcome Start(const std::vector<std::string>& command) const
    {
        NKOLVRX20::TProcessRequest request;
        request.fProgram = command.front();
        request.fArguments = command;
        request.fInheritEnvironment = true;
        return NKOLVRX20::TChildProcess(request).Run(std::chrono::seconds(60));
    }

    std::vector<std::string> Command(const std::vector<std::string>& arguments, const std::string& fault = "") const
    {
        std::vector<std::string> command = {
            VRXHOST, "--root", fRoot, "--plugin", FAKE_PLUGIN, "--set", "fake.fault=" + fault};
        command.insert(command.end(), arguments.begin(), arguments.end());
        return command;
    }

    TProcessOutcome Run(const std::vector<std::string>& arguments, const std::string& fault = "") const
    {
        return Start(Command(arguments, fault));
    }

    bool IsCleared() const { return fs::exists(fRoot / "cleared"); }

    const fs::path fFolder = fs::path(testing::TempDir()) / ("vrxhost-" + std::to_string(::getpid()));
    const fs::path fRoot = fFolder / "tree";
};

} // namespace vrxhost
