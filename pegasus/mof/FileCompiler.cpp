// SPDX-License-Identifier: MIT
#include "pegasus/mof/FileCompiler.h"

#include "pegasus/base/Text.h"
#include "pegasus/mof/ClassParser.h"
#include "pegasus/mof/InstanceParser.h"
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

// Returns: true for m.n.u, all digits (DSP0004, Version). As with OpenPegasus's compiler the last parts may be left
// out, a V may stand before them, and the text may be empty.
bool isVersion(const std::string& text)
{
    const std::size_t start = text.empty() || (text[0] != 'v' && text[0] != 'V') ? 0 : 1;
    int dotCount = 0;
    for (std::size_t at = start; !text.empty(); ++dotCount) {
        const std::size_t end = std::min(text.find('.', at), text.size());
        if (end == at || text.find_first_not_of("0123456789", at) < end) {
            return false;
        }
        if (end == text.size()) {
            return dotCount <= 2;
        }
        at = end + 1;
    }
    return true;
}

} // namespace

FileCompiler::FileCompiler(const std::shared_ptr<const SourceText>& source, Compilation& compilation)
    : fSource(*source), fCompilation(compilation),
      fCursor(fSource, compilation.options.limits, [&compilation](const SourcePlace& place, const std::string& text) {
          compilation.delivery.warn(place, text);
      })
{
    compilation.files.push_back({source, std::nullopt});
}

void FileCompiler::run()
{
    if (fSource.hasByteOrderMark()) {
        fCompilation.portability.report(fCursor, 0, "a byte-order mark");
    }
    while (fCursor.current().kind != TokenKind::kEnd) {
        fCompilation.files.back().definition = fSubject = fCursor.current().offset;
        compileDefinition();
    }
    fCompilation.files.pop_back();
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
    if (fCursor.atWord("class")) {
        const Token word = fCursor.take();
        if (word.text != "class") {
            fCompilation.portability.report(fCursor, word.offset,
                                            "the word \"class\" in other letters than small ones");
        }
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
    const SourcePlace place = fCursor.place(fSubject);
    const ParsedClass parsed = ClassParser(fCursor, fCompilation).parse(qualifiers);
    const CIMName name = parsed.itsClass.getClassName();
    if (isWelcome(parsed.itsClass)) {
        fCompilation.delivery.createClass(parsed.itsClass, place, fCompilation.files);
    }
    if (!parsed.alias.empty() &&
        !fCompilation.aliases.define(parsed.alias, CIMObjectPath(String(), CIMNamespaceName(), name)))
    {
        fCursor.failAt(fSubject, "alias $" + parsed.alias + " is already defined");
    }
}

// Leaves out classes with a true Experimental, with a warning, as OpenPegasus's compiler does.
bool FileCompiler::isWelcome(const CIMClass& newClass)
{
    String version;
    if (qualifierValue(newClass, "Version", version) && !isVersion(base::utf8(version))) {
        warn("Version \"" + base::utf8(version) + "\" is not of the form m.n.u");
    }
    Boolean isExperimental = false;
    if (fCompilation.options.allowExperimental || !qualifierValue(newClass, "Experimental", isExperimental) ||
        !isExperimental)
    {
        return true;
    }
    warn("Class " + base::utf8(newClass.getClassName().getString()) +
         " was not added or updated: Experimental update not allowed (set appropriate compiler option)");
    return false;
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
    fCompilation.delivery.declareQualifier(QualifierParser(fCursor, fCompilation).parseDeclaration());
}

// OpenPegasus's compiler ignores `#pragma namespace` too: everything goes to the namespace of the command line.
void FileCompiler::obeyPragma()
{
    fCursor.take();
    const Token name = fCursor.expect(TokenKind::kIdentifier, "a pragma name");
    fCursor.expectPunctuation('(');
    const Token parameter =
        name.isWord("include") ? fCursor.takePath() : fCursor.expect(TokenKind::kString, "a string");
    fSubject = parameter.offset;
    fCursor.expectPunctuation(')');
    if (name.isWord("include")) {
        include(parameter.text);
    } else if (!name.isWord("locale") && !name.isWord("instancelocale")) {
        warn("Pragma \"" + name.text + "\" not implemented by the compiler. Ignored");
    }
}

// A missing file is a warning, as with OpenPegasus's compiler. One that exists and is refused or unreadable is an
// error: its definitions are meant to be there.
void FileCompiler::include(const std::string& name)
{
    const CompileLimits& limits = fCompilation.options.limits;
    if (fCompilation.files.size() > limits.includeDepth) {
        fCursor.failAt(fSubject, "include is nested deeper than the limit includeDepth (" +
                                     std::to_string(limits.includeDepth) + ")");
    }
    if (++fCompilation.includeCount > limits.includeCount) {
        fCursor.failAt(fSubject,
                       "more includes than the limit includeCount (" + std::to_string(limits.includeCount) + ")");
    }
    const std::string path = fCompilation.includes.find(name, fSource.directory());
    if (path.empty()) {
        warn("Could not open include file " + name);
        return;
    }
    if (name[0] == '/') {
        fCompilation.portability.report(fCursor, fSubject, "an absolute include path");
    }
    compileIncluded(path);
}

void FileCompiler::compileIncluded(const std::string& path)
{
    const bool isOwn = fCompilation.includes.isOwn(path);
    if (!isOwn && !fCompilation.options.includesAny) {
        fCursor.failAt(fSubject, "include file " + path + " lies outside the folder of the compiled file and the -I " +
                                     "folders; cimmof --any-include accepts it");
    }
    try {
        const auto source = std::make_shared<SourceText>(SourceText::read(path, fCompilation.options.limits.fileBytes));
        if (!isOwn) {
            source->hideLines();
        }
        FileCompiler(source, fCompilation).run();
    } catch (const FileError& error) {
        fCursor.failAt(fSubject, error.what());
    }
}

void FileCompiler::warn(const std::string& text)
{
    fCursor.warn(fSubject, text);
}

} // namespace Pegasus::mof
