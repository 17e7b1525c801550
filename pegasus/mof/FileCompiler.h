#pragma once

#include "pegasus/mof/Compilation.h"
#include "pegasus/mof/TokenCursor.h"

#include <Pegasus/Common/CIMQualifier.h>

#include <vector>

namespace Pegasus::mof {

// Compiles the definitions of one file in order; an include is a further FileCompiler of the same compilation.
class FileCompiler
{
  public:
    FileCompiler(const SourceText& source, Compilation& compilation);

    // Throws MofError.
    void run();

  private:
    void definition();
    void defineClass(const std::vector<CIMQualifier>& qualifiers);
    void defineInstance();
    void defineQualifier(const std::vector<CIMQualifier>& qualifiers);
    void obeyPragma();
    void include(const std::string& name);
    void changeNamespace(const std::string& name);
    bool isWelcome(const CIMClass& newClass);
    void warn(const std::string& text);

    const SourceText& fSource;
    Compilation& fCompilation;
    TokenCursor fCursor;
    std::size_t fSubject = 0; // offset of what an error of the current definition is about, unless it knows better
};

} // namespace Pegasus::mof
