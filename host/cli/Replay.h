// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/Options.h"

namespace vrxhost {

// Runs the command on a record in place of a plug-in's namespace. Nothing else of the machine is looked at: no root, no
// plug-in, no server. The losses are the record's, and so is the exit status.
// Throws: std::runtime_error, a sentence, when the record is refused.
EExitStatus Replay(const TOptions& options);

} // namespace vrxhost
