// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/Delivery.h"
#include "pegasus/mof/Includes.h"
#include "pegasus/mof/InstanceQueue.h"
#include "pegasus/mof/Portability.h"
#include "pegasus/mof/SkippedDefinitions.h"

namespace Pegasus::mof {

// What the files of one compilation share: the target, the aliases and the waiting instances. An included file is
// compiled in the middle of the including one and may use and define aliases of it.
struct Compilation
{
    Compilation(const CompileOptions& given, const std::string& firstFile, DefinitionHandler& target)
        : options(given), delivery(target, given.limits), instances(delivery, aliases),
          includes(firstFile, given.includeDirectories), portability(given.isStrict)
    {
    }

    const CompileOptions& options;
    Delivery delivery;
    AliasTable aliases;
    InstanceQueue instances;
    Includes includes;
    Portability portability;
    OpenFiles files;
    std::size_t includeCount = 0;
};

} // namespace Pegasus::mof
