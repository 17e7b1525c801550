// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/DefinitionHandler.h"
#include "pegasus/mof/MofError.h"

#include <string>
#include <vector>

namespace Pegasus::mof {

// Bounds on what a file may demand. Exceeding one is an error at its place; the message names the limit.
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
    CIMNamespaceName nameSpace;
    std::vector<std::string> includeDirectories; // searched last, in this order
    bool includesAny = false;                    // also files outside the first file's folder and these directories
    bool allowExperimental = false;              // otherwise a class with a true Experimental is skipped with a warning
    bool isStrict = false;                       // what OpenPegasus 2.14 refuses is an error; otherwise a warning
    CompileLimits limits = {};
};

// Compiles one MOF file (DSP0004 v2) and what it includes, definition by definition, into a handler.
//
// It is one pass. A qualifier takes its type from its declaration and an instance's value from its class, both as the
// handler knows them at that moment, so both must come first in the text. Only aliases may be used before their
// definition: such instances wait. While the handler creates a class, a few classes after it are parsed (Delivery);
// what is delivered and reported, and in which order, is the same as if each definition were delivered before the next
// is read.
//
// An include is looked for in the including file's directory, the current directory and the include directories. A file
// outside the first file's directory and the include directories is refused.
//
// Throws: MofError at the first error; definitions before it have been delivered, the failed one is dropped. FileError
//     when reading `path` fails. Pegasus::Exception of the handler's useNamespace().
// Blocks: as long as the handler, and for reading files.
void compileFile(const std::string& path, const CompileOptions& options, DefinitionHandler& handler);

// As compileFile, for text in memory. `name` stands for the file in messages; its directory is searched for includes.
void compileText(const std::string& text, const std::string& name, const CompileOptions& options,
                 DefinitionHandler& handler);

} // namespace Pegasus::mof
