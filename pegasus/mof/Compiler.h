#pragma once

#include "pegasus/mof/DefinitionHandler.h"
#include "pegasus/mof/MofError.h"

#include <string>
#include <vector>

namespace Pegasus::mof {

// Bounds on what a file may demand; each violation is an error at its place that names the limit.
struct CompileLimits
{
    std::size_t fileBytes = 64u << 20;     // one source file
    std::size_t includeDepth = 32;         // files within files
    std::size_t includeCount = 20000;      // files read by one compilation
    std::size_t tokenBytes = 4096;         // one name or number
    std::size_t stringBytes = 1u << 20;    // one string value, its adjacent literals joined
    std::size_t arrayElementCount = 65536; // one array initialiser
    std::size_t memberCount = 16384;       // qualifiers, properties, methods or parameters of one owner
};

struct CompileOptions
{
    CIMNamespaceName nameSpace;                  // target until a `#pragma namespace` names another
    std::vector<std::string> includeDirectories; // searched last, in this order
    bool allowExperimental = false;              // otherwise a class with a true Experimental is skipped with a warning
    CompileLimits limits = {};
};

// Compiles one MOF file (DSP0004 v2) and what it includes, definition by definition, into a handler.
//
// An include is looked for in the including file's directory, the current directory and the include directories.
// Throws MofError at the first error; what came before it has been delivered, nothing of the failed definition has.
void compileFile(const std::string& path, const CompileOptions& options, DefinitionHandler& handler);

// As compileFile, for text in memory; name stands for the file in messages and its directory for includes.
void compileText(const std::string& text, const std::string& name, const CompileOptions& options,
                 DefinitionHandler& handler);

} // namespace Pegasus::mof
