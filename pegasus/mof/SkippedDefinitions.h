// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Lexer.h"

#include <cstddef>
#include <optional>

namespace Pegasus::mof {

// Returns: how many definitions (classes, instances, qualifier declarations) follow the faulty one, which starts at
//     `faulty`, up to the end of the file; all in the file when `faulty` is empty. The text may have any faults, so the
//     count goes by the keywords with which definitions begin. Included files are left out.
std::size_t countDefinitionsAfter(const SourceText& source, const CompileLimits& limits,
                                  std::optional<std::size_t> faulty);

} // namespace Pegasus::mof
