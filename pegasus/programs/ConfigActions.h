#pragma once

#include "pegasus/programs/ConfigCommand.h"

namespace Pegasus::programs {

// Carries a command out, on the running server for current values and on the planned file for planned ones. Prints the
// outcome.
// Returns: the exit status.
int setProperty(const ConfigCommand& command, const std::string& home);
int getProperty(const ConfigCommand& command, const std::string& home);
int listProperties(const ConfigCommand& command, const std::string& home);

} // namespace Pegasus::programs
