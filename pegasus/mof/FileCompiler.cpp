#include "pegasus/mof/FileCompiler.h"

#include "pegasus/base/Text.h"
#include "pegasus/mof/ClassParser.h"
#include "pegasus/mof/InstanceParser.h"
#include "pegasus/mof/SkippedDefinitions.h"
#include "pegasus/mof/ValueBuilder.h"

#include <Pegasus/Common/Exception.h>

#include <optional>

namespace Pegasus::mof {

namespace {

template <typename T> bool qualifierValue(const CIMConstClass& owner, const char* name, T& value)
{
    const Uint32 index = owner.findQualifier(CIMName(name));
    if (index == PEG_NOT_FOUND) {
        return false;
    }
    const CIMValue held = owner.getQualifier(index).getValue();
    if (held.isNull() || !held.typeCompatible(CIMValue(value))) {
        return false;
    }
    held.get(value);
    return true;
}

// Returns: true for m.n.u, all digits (DSP0004, Version). Some files of the DMTF leave out the last parts.
bool isVersion(const std::string& text)
{
    int dotCount = 0;
    for (std::size_t at = 0;; ++dotCount) {
        const std::size_t end = std::min(text.find('.', at), text.size());
        if (end == at || text.find_first_not_of("0123456789", at) < end) {
            return false;
        }
        if (end == text.size()) {
            return dotCount <= 2;
        }
        at = end + 1;
    }
}

} // namespace

FileCompiler::FileCompiler(const SourceText& source, Compilation& compilation)
    : fSource(source), fCompilation(compilation),
      fCursor(source, compilation.options.limits, [&compilation](const SourcePlace& place, const std::string& text) {
          compilation.handler.warn(place.text(), text);
      })
{
}

void FileCompiler::run()
{
    std::optional<std::size_t> current; // where the definition starts that is being compiled
    try {
        while (fCursor.current().kind != TokenKind::kEnd) {
            current = fSubject = fCursor.current().offset;
            compileDefinition();
        }
    } catch (MofError& error) {
        error.addSkipped(countDefinitionsAfter(fSource, fCursor.limits(), current));
        throw;
    }
}

// An exception of the handler becomes an error at the definition's subject.
void FileCompiler::compileDefinition()
{
    try {
        definition();
    } catch (const Exception& error) {
        fCursor.failAt(fSubject, base::utf8(error.getMessage()));
    }
}

void FileCompiler::definition()
{
    if (fCursor.current().kind == TokenKind::kPragma) {
        obeyPragma();
        return;
    }
    const Qualifiers qualifiers = QualifierParser(fCursor, fCompilation).parseList();
    if (fCursor.skipWord("class")) {
        defineClass(qualifiers);
    } else if (fCursor.skipWord("instance")) {
        defineInstance();
    } else if (fCursor.skipWord("qualifier")) {
        defineQualifier(qualifiers);
    } else {
        fCursor.failExpected("a class, an instance, a qualifier declaration or a pragma");
    }
}

void FileCompiler::defineClass(const Qualifiers& qualifiers)
{
    fSubject = fCursor.current().offset;
    const ParsedClass parsed = ClassParser(fCursor, fCompilation).parse(qualifiers);
    const CIMName name = parsed.itsClass.getClassName();
    if (isWelcome(parsed.itsClass) && !fCompilation.handler.createClass(parsed.itsClass)) {
        warn("Class " + base::utf8(name.getString()) + " already exists in the repository");
    }
    if (!parsed.alias.empty() &&
        !fCompilation.aliases.define(parsed.alias, CIMObjectPath(String(), CIMNamespaceName(), name)))
    {
        fCursor.failAt(fSubject, "alias $" + parsed.alias + " is already defined");
    }
}

// Leaves out classes with a true Experimental or a malformed Version, with a warning, as OpenPegasus's compiler does.
bool FileCompiler::isWelcome(const CIMClass& newClass)
{
    const std::string start =
        "Class " + base::utf8(newClass.getClassName().getString()) + " was not added or updated: ";
    Boolean isExperimental = false;
    if (!fCompilation.options.allowExperimental && qualifierValue(newClass, "Experimental", isExperimental) &&
        isExperimental)
    {
        warn(start + "Experimental update not allowed (set appropriate compiler option)");
        return false;
    }
    String version;
    if (qualifierValue(newClass, "Version", version) && !isVersion(base::utf8(version))) {
        warn(start + "Invalid version format in mof class or repository class (valid format is m.n.u)");
        return false;
    }
    return true;
}

void FileCompiler::defineInstance()
{
    fCompilation.instances.submit(InstanceParser(fCursor, fCompilation).parse());
}

void FileCompiler::defineQualifier(const Qualifiers& qualifiers)
{
    if (!qualifiers.empty()) {
        fCursor.failAt(fSubject, "a qualifier declaration cannot have qualifiers");
    }
    fSubject = fCursor.current().offset;
    fCompilation.handler.declareQualifier(QualifierParser(fCursor, fCompilation).parseDeclaration());
}

void FileCompiler::obeyPragma()
{
    fCursor.take();
    const Token name = fCursor.expect(TokenKind::kIdentifier, "a pragma name");
    fCursor.expectPunctuation('(');
    const Token parameter = fCursor.expect(TokenKind::kString, "a string");
    fSubject = parameter.offset;
    fCursor.expectPunctuation(')');
    if (name.isWord("include")) {
        include(parameter.text);
    } else if (name.isWord("namespace")) {
        changeNamespace(parameter.text);
    } else if (!name.isWord("locale") && !name.isWord("instancelocale")) {
        warn("Pragma \"" + name.text + "\" not implemented by the compiler. Ignored");
    }
}

// A missing file is a warning, as with OpenPegasus's compiler. One that exists and is unreadable is an error: its
// definitions are meant to be there.
void FileCompiler::include(const std::string& name)
{
    const CompileLimits& limits = fCompilation.options.limits;
    if (fCompilation.includeDepth == limits.includeDepth) {
        fCursor.failAt(fSubject, "include is nested deeper than the limit includeDepth (" +
                                     std::to_string(limits.includeDepth) + ")");
    }
    if (++fCompilation.includeCount > limits.includeCount) {
        fCursor.failAt(fSubject,
                       "more includes than the limit includeCount (" + std::to_string(limits.includeCount) + ")");
    }
    const std::string path = findInclude(name, fSource.directory(), fCompilation.options.includeDirectories);
    if (path.empty()) {
        warn("Could not open include file " + name);
        return;
    }
    try {
        const SourceText source = SourceText::read(path, limits.fileBytes);
        ++fCompilation.includeDepth;
        FileCompiler(source, fCompilation).run();
        --fCompilation.includeDepth;
    } catch (const FileError& error) {
        fCursor.failAt(fSubject, error.what());
    }
}

void FileCompiler::changeNamespace(const std::string& name)
{
    if (!CIMNamespaceName::legal(cimString(fCursor, name, fSubject))) {
        warn("Pragma \"namespace\": " + name + " is not a namespace name. Ignored");
        return;
    }
    fCompilation.nameSpace = CIMNamespaceName(name.c_str());
    fCompilation.handler.useNamespace(fCompilation.nameSpace);
}

void FileCompiler::warn(const std::string& text)
{
    fCursor.warn(fSubject, text);
}

} // namespace Pegasus::mof
