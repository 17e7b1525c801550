// SPDX-License-Identifier: MIT
#pragma once

#include "tests/support/ScriptedPeer.h"

#include <string>
#include <vector>

namespace test {

// One recorded exchange of the real library, and what its client printed.
struct WireCase
{
    std::string name;
    PeerRequest request;
    std::string response; // as sent
    std::string note;     // what the recording says about the case
    std::string printed;  // the result or "EXC class ..."; cut off at some length; empty when nothing was noted
};

// The cases in the folder that were recorded from a client call. Empty when the folder is left unconfigured.
std::vector<WireCase> loadWireCases();
// The folder given to CMake; empty by default.
std::string vectorsFolder();

// Makes the recorded call with a client that is connected to `port` and prints the result as the recording did.
// Returns: "unsupported" for an operation that this library lacks.
std::string replayCall(const WireCase& wireCase, std::uint16_t port, unsigned timeoutMs);

// Returns: the XML with its attributes in order and the blanks between elements removed, for comparison.
std::string canonicalXml(const std::string& xml);

} // namespace test
