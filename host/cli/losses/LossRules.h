// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/losses/TServerLog.h"
#include "host/cli/model/Loss.h"
#include "host/core/TProcessLog.h"

#include <optional>
#include <string>
#include <vector>

namespace vrxhost {

// How a line about a fault in a class list begins.
inline constexpr char kClassListLine[] = "Performance Data RDD Parser line ";

// Returns: the loss that a log line of the plug-in reports, whatever its severity; empty for other lines.
std::optional<TLoss> LossOfLine(const std::string& line);

// Returns: true for a line of severity 0 that every healthy start has, or that only repeats what a failed program's
// sentence says.
bool IsHarmless(const std::string& errorLine);

// Returns: the loss that the server's log reports: a value that a provider set and the class refused.
std::optional<TLoss> LossOfServerLine(const TServerLogLine& line);

// Returns: a note for each warning of the MOF compiler about a text that another server refuses.
// text: a line of the plug-in's log, which holds what the compiler printed, line feeds included.
std::vector<TLoss> NotesOfCompiler(const std::string& text);

// Returns: the note for a provider that would fail on another server, whose vendor is the caller's to fill in.
std::optional<TLoss> NoteOfServerLine(const TServerLogLine& line);

// Returns: the loss that a failed program means; empty when its failure is harmless.
// root: see TLossLog.
std::optional<TLoss> LossOfProgram(const NKOLVRX20::TFailedProgram& program, const std::string& root);

// Returns: true for a start of the server, which the plug-in attempts several times.
bool IsServerStart(const NKOLVRX20::TFailedProgram& program);

} // namespace vrxhost
