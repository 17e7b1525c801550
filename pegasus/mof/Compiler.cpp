// SPDX-License-Identifier: MIT
#include "pegasus/mof/Compiler.h"

#include "pegasus/mof/FileCompiler.h"

#include <memory>

namespace Pegasus::mof {

namespace {

void compile(SourceText text, const CompileOptions& options, DefinitionHandler& handler)
{
    const auto source = std::make_shared<const SourceText>(std::move(text));
    Compilation compilation(options, source->name(), handler);
    handler.useNamespace(options.nameSpace);
    try {
        FileCompiler(source, compilation).run();
        compilation.instances.finish();
        compilation.delivery.finish();
    } catch (MofError& error) {
        compilation.delivery.finish(); // a class before this error may fail; its error is the first one then
        error.addSkipped(countDefinitionsAfter(compilation.files, options.limits));
        throw;
    }
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
