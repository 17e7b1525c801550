// SPDX-License-Identifier: MIT
#include "pegasus/mof/InstanceParser.h"

#include "pegasus/base/Text.h"
#include "pegasus/common/EmbeddedKind.h"
#include "pegasus/mof/ValueBuilder.h"

#include <Pegasus/Common/CIMObject.h>

#include <algorithm>

namespace Pegasus::mof {

namespace {

// Returns: true when the property had a value or waited for one.
bool removeProperty(ParsedInstance& parsed, const CIMName& name)
{
    const Uint32 index = parsed.instance.findProperty(name);
    if (index != PEG_NOT_FOUND) {
        parsed.instance.removeProperty(index);
        return true;
    }
    const auto isSame = [&name](const OpenReference& reference) { return reference.property.equal(name); };
    const auto removed = std::remove_if(parsed.open.begin(), parsed.open.end(), isSame);
    const bool wasOpen = removed != parsed.open.end();
    parsed.open.erase(removed, parsed.open.end());
    return wasOpen;
}

// Diagnostics of an embedded instance have the place of its string; this text leads to the place within.
std::string inEmbedded(const SourcePlace& place)
{
    return "in the embedded instance, line " + std::to_string(place.line) + ", column " + std::to_string(place.column) +
           ": ";
}

} // namespace

ParsedInstance InstanceParser::parse()
{
    if (!fCursor.skipWord("of")) {
        fCursor.failExpected("'of'");
    }
    ParsedInstance parsed;
    parsed.place = fCursor.place(fCursor.current().offset);
    parsed.itsClass = parseClass();
    parsed.instance = CIMInstance(parsed.itsClass.getClassName());
    if (fCursor.skipWord("as")) {
        parsed.alias = fCursor.expect(TokenKind::kAlias, "an alias").text;
    }
    fCursor.expectPunctuation('{');
    while (!fCursor.skipPunctuation('}')) {
        parseValue(parsed);
    }
    fCursor.expectPunctuation(';');
    return parsed;
}

CIMClass InstanceParser::parseClass()
{
    const Token name = fCursor.expect(TokenKind::kIdentifier, "a class name");
    CIMClass found;
    if (!fCompilation.delivery.findClass(CIMName(name.text.c_str()), found)) {
        fCursor.failAt(name.offset, "Error getting class " + name.text + " from namespace " +
                                        base::utf8(fCompilation.options.nameSpace.getString()) +
                                        ": CIM_ERR_NOT_FOUND: " + name.text);
    }
    return found;
}

// Qualifiers of instances have lost their meaning (DSP0004, 7.9): they are parsed and dropped.
void InstanceParser::parseValue(ParsedInstance& parsed)
{
    fQualifiers.parseList();
    const Token word = fCursor.expect(TokenKind::kIdentifier, "a property name");
    const CIMConstClass itsClass = parsed.itsClass;
    const Uint32 index = itsClass.findProperty(CIMName(word.text.c_str()));
    if (index == PEG_NOT_FOUND) {
        fCursor.failAt(word.offset,
                       "class " + base::utf8(itsClass.getClassName()) + " has no such property: " + word.text);
    }
    const CIMConstProperty declared = itsClass.getProperty(index);
    if (removeProperty(parsed, declared.getName())) {
        fCursor.warn(word.offset, "property " + word.text + " is given twice: the last value holds");
    }
    fCursor.expectPunctuation('=');
    setValue(parsed, declared);
    fCursor.expectPunctuation(';');
}

void InstanceParser::setValue(ParsedInstance& parsed, const CIMConstProperty& declared)
{
    const Initializer initializer = parseInitializer(fCursor, EmptyArray::kAccepted);
    if (declared.getType() == CIMTYPE_REFERENCE && isOpen(initializer)) {
        const Literal& alias = initializer.elements.front();
        parsed.open.push_back({declared.getName(), alias.text, fCursor.place(alias.offset)});
        return;
    }
    if (!initializer.isNull() && embeddedKind(declared) != EmbeddedKind::kNone) {
        fCompilation.portability.report(fCursor, initializer.offset,
                                        "an instance with a value of an embedded property");
        parsed.instance.addProperty(CIMProperty(declared.getName(), embeddedValue(initializer, declared), 0, CIMName(),
                                                declared.getClassOrigin()));
        return;
    }
    const ValueType type{declared.getType(), declared.isArray(), declared.getArraySize()};
    parsed.instance.addProperty(
        CIMProperty(declared.getName(), buildValue(fCursor, fCompilation.aliases, initializer, type), type.arraySize,
                    declared.getReferenceClassName(), declared.getClassOrigin()));
}

bool InstanceParser::isOpen(const Initializer& initializer) const
{
    return !initializer.isArray && initializer.elements.front().kind == Literal::Kind::kAlias &&
           !fCompilation.aliases.find(initializer.elements.front().text);
}

CIMValue InstanceParser::embeddedValue(const Initializer& initializer, const CIMConstProperty& declared)
{
    if (initializer.isArray != declared.isArray()) {
        fCursor.failAt(initializer.offset,
                       declared.isArray() ? "expected an array" : "expected one value, not an array");
    }
    Array<CIMInstance> instances;
    Array<CIMObject> objects;
    for (const Literal& element : initializer.elements) {
        instances.append(parseEmbedded(element));
        objects.append(CIMObject(instances[instances.size() - 1]));
    }
    if (embeddedKind(declared) == EmbeddedKind::kObject) {
        return declared.isArray() ? CIMValue(objects) : CIMValue(objects[0]);
    }
    return declared.isArray() ? CIMValue(instances) : CIMValue(instances[0]);
}

// An embedded instance is a string that holds its MOF (DSP0004, EmbeddedInstance). Recursion is bounded by the length
// of a string: each level doubles the escapes of the quotes within.
CIMInstance InstanceParser::parseEmbedded(const Literal& literal)
{
    if (literal.kind != Literal::Kind::kString) {
        fCursor.failAt(literal.offset, "expected a string with the MOF of an instance instead of " + literal.shown());
    }
    const SourceText text("embedded instance", literal.text);
    try {
        TokenCursor cursor(text, fCursor.limits(), [&](const SourcePlace& place, const std::string& warning) {
            fCursor.warn(literal.offset, inEmbedded(place) + warning);
        });
        if (!cursor.skipWord("instance")) {
            cursor.failExpected("'instance'");
        }
        const ParsedInstance parsed = InstanceParser(cursor, fCompilation).parse();
        if (!parsed.alias.empty() || !parsed.open.empty()) {
            cursor.failAt(0, "an embedded instance has no alias and uses none that is not defined yet");
        }
        if (cursor.current().kind != TokenKind::kEnd) {
            cursor.failExpected("the end of the string");
        }
        return parsed.instance;
    } catch (const MofError& error) {
        fCursor.failAt(literal.offset, inEmbedded(error.place()) + error.cause());
    }
}

} // namespace Pegasus::mof
