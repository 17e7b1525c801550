// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/losses/TLossLog.h"
#include "host/cli/losses/TVendorFiles.h"

#include <string>

namespace vrxhost {

// Looks for the libraries that the registrations name, and asks the system's loader about each vendor's library: what
// it needs and where that is, as the agents of the root's server would find it. None of the library's code runs. What
// is missing is entered, the file that names it included.
// Blocks: 10 seconds for each library at most.
void CheckLibraries(const TVendorFiles& files, const std::string& root, TLossLog& losses);

} // namespace vrxhost
