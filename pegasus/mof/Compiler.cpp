// SPDX-License-Identifier: MIT
#include "pegasus/mof/Compiler.h"

#include "pegasus/mof/FileCompiler.h"

namespace Pegasus::mof {

namespace {

void compile(const SourceText& source, const CompileOptions& options, DefinitionHandler& handler)
{
    Compilation compilation(options, source.name(), handler);
    handler.useNamespace(options.nameSpace);
    FileCompiler(source, compilation).run();
    compilation.instances.finish();
}

} // namespace

void compileFile(const std::string& path, const CompileOptions& options, DefinitionHandler& handler)
{
    compile(SourceText::read(path, options.limits.fileBytes), options, handler);
}

void compileText(const std::string& text, const std::string& name, const CompileOptions& options,
                 DefinitionHandler& handler)
{
    compile(SourceText(name, text), options, handler);
}

} // namespace Pegasus::mof
