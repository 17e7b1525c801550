#include "pegasus/mof/InstanceParser.h"
#include "pegasus/mof/ValueBuilder.h"

#include <algorithm>

namespace Pegasus::mof {

namespace {

bool isGiven(const ParsedInstance& parsed, const CIMName& name)
{
    const auto isSame = [&name](const OpenReference& reference) { return reference.property.equal(name); };
    return parsed.instance.findProperty(name) != PEG_NOT_FOUND ||
           std::any_of(parsed.open.begin(), parsed.open.end(), isSame);
}

} // namespace

ParsedInstance InstanceParser::parse()
{
    if (!fCursor.skipWord("of"))
        fCursor.failExpected("'of'");
    ParsedInstance parsed;
    parsed.place = fCursor.place(fCursor.current().offset);
    parsed.itsClass = parseClass();
    parsed.instance = CIMInstance(parsed.itsClass.getClassName());
    if (fCursor.skipWord("as"))
        parsed.alias = fCursor.expect(TokenKind::Alias, "an alias").text;
    fCursor.expectPunctuation('{');
    while (!fCursor.skipPunctuation('}'))
        parseValue(parsed);
    fCursor.expectPunctuation(';');
    return parsed;
}

CIMClass InstanceParser::parseClass()
{
    const Token name = fCursor.expect(TokenKind::Identifier, "a class name");
    CIMClass found;
    if (!fCompilation.handler.findClass(CIMName(name.text.c_str()), found))
        fCursor.failAt(name.offset, "Error getting class " + name.text + " from namespace " +
                                        std::string(fCompilation.nameSpace.getString().getCString()) +
                                        ": CIM_ERR_NOT_FOUND: " + name.text);
    return found;
}

/// Qualifiers of instances have no meaning any more (DSP0004, 7.9): they are read and dropped.
void InstanceParser::parseValue(ParsedInstance& parsed)
{
    fQualifiers.parseList();
    const Token word = fCursor.expect(TokenKind::Identifier, "a property name");
    const CIMConstClass itsClass = parsed.itsClass;
    const Uint32 index = itsClass.findProperty(CIMName(word.text.c_str()));
    if (index == PEG_NOT_FOUND)
        fCursor.failAt(word.offset, "class " + std::string(itsClass.getClassName().getString().getCString()) +
                                        " has no such property: " + word.text);
    const CIMConstProperty declared = itsClass.getProperty(index);
    if (isGiven(parsed, declared.getName()))
        fCursor.failAt(word.offset, "property " + word.text + " is given twice");
    fCursor.expectPunctuation('=');
    setValue(parsed, declared);
    fCursor.expectPunctuation(';');
}

void InstanceParser::setValue(ParsedInstance& parsed, const CIMConstProperty& declared)
{
    const Initializer initializer = parseInitializer(fCursor);
    const Literal& first = initializer.elements.front();
    if (declared.getType() == CIMTYPE_REFERENCE && first.kind == Literal::Kind::Alias &&
        !fCompilation.aliases.find(first.text))
    {
        parsed.open.push_back({declared.getName(), first.text, fCursor.place(first.offset)});
        return;
    }
    const ValueType type{declared.getType(), declared.isArray(), declared.getArraySize()};
    parsed.instance.addProperty(
        CIMProperty(declared.getName(), buildValue(fCursor, fCompilation.aliases, initializer, type), type.arraySize,
                    declared.getReferenceClassName(), declared.getClassOrigin()));
}

} // namespace Pegasus::mof
