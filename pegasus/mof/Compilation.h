#pragma once

#include "pegasus/mof/AliasTable.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/InstanceQueue.h"

namespace Pegasus::mof {

// What the files of one compilation share.
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
