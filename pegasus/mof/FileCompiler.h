// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Compilation.h"
#include "pegasus/mof/TokenCursor.h"

#include <Pegasus/Common/CIMQualifier.h>

#include <memory>
#include <vector>

namespace Pegasus::mof {

// Compiles the definitions of one file in order. An include is compiled by a further FileCompiler of the same
// compilation.
// Requires: what the constructor takes outlives the compiler.
class FileCompiler
{
  public:
    FileCompiler(const std::shared_ptr<const SourceText>& source, Compilation& compilation);

    // Throws: MofError at the first error. Compilation::files then says where each open file stands.
    void run();

  private:
    void compileDefinition();
    void definition();
    void defineClass(const std::vector<CIMQualifier>& qualifiers);
    void defineInstance();
    void defineQualifier(const std::vector<CIMQualifier>& qualifiers);
    void obeyPragma();
    void include(const std::string& name);
    void compileIncluded(const std::string& path);
    bool isWelcome(const CIMClass& newClass);
    void warn(const std::string& text);

    const SourceText& fSource;
    Compilation& fCompilation;
    TokenCursor fCursor;
    std::size_t fSubject = 0; // where an error is reported that has no place of its own, such as the handler's
};

} // namespace Pegasus::mof
