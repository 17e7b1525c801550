// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Lexer.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <vector>

namespace Pegasus::mof {

// Returns: how many definitions (classes, instances, qualifier declarations) follow the faulty one, which starts at
//     `faulty`, up to the end of the file; all in the file when `faulty` is empty. The text may have any faults, so the
//     count goes by the keywords with which definitions begin. Included files are left out.
std::size_t countDefinitionsAfter(const SourceText& source, const CompileLimits& limits,
                                  std::optional<std::size_t> faulty);

// A file that is being compiled, and where the definition starts that is being compiled in it.
struct OpenFile
{
    std::shared_ptr<const SourceText> source;
    std::optional<std::size_t> definition; // empty before the first one
};

// From the first file to the innermost included one.
using OpenFiles = std::vector<OpenFile>;

// Returns: how many definitions follow in all these files.
std::size_t countDefinitionsAfter(const OpenFiles& files, const CompileLimits& limits);

} // namespace Pegasus::mof
