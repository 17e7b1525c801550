#pragma once

#include "host/core/TProcessLog.h"

#include <optional>
#include <string>

namespace vrxhost {

// What was lost, as a sentence in three pieces. Losses that differ in the object alone have one cause and share a
// sentence.
struct TLoss
{
    std::string fBegin;
    std::string fObject; // empty when the loss stands alone
    std::string fEnd;
};

// Returns: the loss that a log line of the plug-in reports, whatever its severity; empty for other lines.
std::optional<TLoss> LossOfLine(const std::string& line);

// Returns: true for a line of severity 0 that only repeats what a failed program's sentence says.
bool IsHarmless(const std::string& errorLine);

// Returns: the sentence for a failed program; empty when its failure is harmless.
// root: see TLossLog.
std::optional<std::string> LossOfProgram(const NKOLVRX20::TFailedProgram& program, const std::string& root);

// Returns: true for a start of the server, which the plug-in attempts several times.
bool IsServerStart(const NKOLVRX20::TFailedProgram& program);

} // namespace vrxhost
