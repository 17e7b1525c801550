#pragma once

#include "host/core/TProcessLog.h"

#include <optional>
#include <string>

namespace vrxhost {

// Returns: the sentence for a log line by which the plug-in reports a loss, whatever its severity; nothing for others.
std::optional<std::string> LossOfLine(const std::string& line);

// Returns: true for a line of severity 0 that is no loss of its own: a failed program's sentence tells it.
bool IsHarmless(const std::string& errorLine);

// Returns: the sentence for a failed program; nothing when nothing was lost by it.
// root: see TLossLog.
std::optional<std::string> LossOfProgram(const NKOLVRX20::TFailedProgram& program, const std::string& root);

// Returns: true for a start of the server, which the plug-in attempts several times.
bool IsServerStart(const NKOLVRX20::TFailedProgram& program);

} // namespace vrxhost
