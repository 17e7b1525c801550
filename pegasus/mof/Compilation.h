#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/InstanceQueue.h"

namespace Pegasus::mof {

// What the files of one compilation share: the target, the aliases and the waiting instances. An included file is
// compiled in the middle of the including one and may use and define aliases of it.
struct Compilation
{
    Compilation(const CompileOptions& given, DefinitionHandler& target)
        : options(given), handler(target), nameSpace(given.nameSpace), instances(target, aliases)
    {
    }

    const CompileOptions& options;
    DefinitionHandler& handler;
    CIMNamespaceName nameSpace; // the current target
    AliasTable aliases;
    InstanceQueue instances;
    std::size_t includeDepth = 0;
    std::size_t includeCount = 0;
};

} // namespace Pegasus::mof
