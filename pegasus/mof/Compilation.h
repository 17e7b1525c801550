// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/Includes.h"
#include "pegasus/mof/InstanceQueue.h"
#include "pegasus/mof/Portability.h"
#include "pegasus/mof/ShownText.h"

namespace Pegasus::mof {

// What the files of one compilation share: the target, the aliases and the waiting instances. An included file is
// compiled in the middle of the including one and may use and define aliases of it.
struct Compilation
{
    Compilation(const CompileOptions& given, const std::string& firstFile, DefinitionHandler& target)
        : options(given), handler(target), instances(target, aliases), includes(firstFile, given.includeDirectories),
          portability(given.isStrict)
    {
    }

    void warn(const SourcePlace& place, const std::string& text) const { handler.warn(place.text(), shownText(text)); }

    const CompileOptions& options;
    DefinitionHandler& handler;
    AliasTable aliases;
    InstanceQueue instances;
    Includes includes;
    Portability portability;
    std::size_t includeDepth = 0;
    std::size_t includeCount = 0;
};

} // namespace Pegasus::mof
