// SPDX-License-Identifier: MIT
#include "src/namespace/ResidualServer.h"

#include "src/common/CoreLog.h"
#include "src/common/Files.h"
#include "src/namespace/Removal.h"
#include "src/namespace/ServerTree.h"

#include <host/TOSSpecific.h>
#include <host/TVRXException.h>

#include <sstream>

namespace NKOLVRX20 {

namespace {

constexpr int kListingTimeoutSeconds = 360;
constexpr std::size_t kStartFileBytes = 256; // more than blanks and a process id take

} // namespace

TStartFile::TStartFile(const std::string& consumer) : fPath("/var/tmp/cimserverkol_tc_" + consumer + "_start.conf") {}

std::optional<int> TStartFile::ReadProcessId() const
{
    std::string reason;
    const TFile file = OpenOwnFile(fPath, reason);
    if (!file) {
        LogProgress("Error opening ", fPath);
        if (!reason.empty()) {
            LogProgress("TPEGASUSNamespace::killResidualCimserver does not read ", fPath, ": ", reason);
        }
        return std::nullopt;
    }
    char bytes[kStartFileBytes];
    std::istringstream text(std::string(bytes, std::fread(bytes, 1, sizeof bytes, file.get())));
    text.imbue(std::locale::classic());
    int pid = 0;
    text >> pid;
    return pid;
}

void TStartFile::Remove() const
{
    RemovePath(fPath, kRemoveFile);
}

TProcessListing::TProcessListing()
{
    try {
        TOSSpecific::SpawnProcess("ps", {"-e"}, fText, kListingTimeoutSeconds);
    } catch (const TVRXException&) { // what was captured has to do
    }
    LogProgress(fText);
}

bool TProcessListing::HasServer(int pid) const
{
    const std::string wanted = std::to_string(pid);
    std::istringstream lines(fText);
    for (std::string line; std::getline(lines, line);) {
        std::string firstToken;
        if (line.find(kServerName) != std::string::npos && std::istringstream(line) >> firstToken &&
            firstToken == wanted)
        {
            return true;
        }
    }
    return false;
}

} // namespace NKOLVRX20
