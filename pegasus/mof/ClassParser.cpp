// SPDX-License-Identifier: MIT
#include "pegasus/mof/ClassParser.h"

#include "pegasus/base/Text.h"
#include "pegasus/mof/DataType.h"
#include "pegasus/mof/ValueBuilder.h"

namespace Pegasus::mof {

ParsedClass ClassParser::parse(const Qualifiers& qualifiers)
{
    ParsedClass parsed;
    const CIMName name = parseName(fCursor, "a class name");
    if (fCursor.skipWord("as")) {
        parsed.alias = fCursor.expect(TokenKind::kAlias, "an alias").text;
    }
    CIMName superClass;
    if (fCursor.skipPunctuation(':')) {
        superClass = parseName(fCursor, "a superclass name");
    }

    parsed.itsClass = CIMClass(name, superClass);
    addQualifiers(parsed.itsClass, qualifiers);
    fCursor.expectPunctuation('{');
    while (!fCursor.skipPunctuation('}')) {
        parseFeature(parsed.itsClass);
    }
    fCursor.expectPunctuation(';');
    return parsed;
}

void ClassParser::parseFeature(CIMClass& owner)
{
    checkMemberCount(owner.getPropertyCount() + owner.getMethodCount());
    const Qualifiers qualifiers = fQualifiers.parseList();
    CIMName referenceClass;
    const std::size_t typeOffset = fCursor.current().offset;
    const ValueType type = parseElementType(fCursor, referenceClass);
    const std::size_t offset = fCursor.current().offset;
    const CIMName name = parseName(fCursor, "a property or method name");
    if (fCursor.atPunctuation('(')) {
        if (type.type == CIMTYPE_REFERENCE) {
            fCursor.failAt(offset, "a method cannot return a reference");
        }
        CIMMethod method = parseMethod(name, type.type);
        addQualifiers(method, qualifiers);
        addMethod(owner, method, offset);
    } else {
        CIMProperty property = parseProperty(name, type, referenceClass);
        addQualifiers(property, qualifiers);
        checkNamedClasses(owner, property, typeOffset);
        addProperty(owner, property, offset);
    }
}

CIMProperty ClassParser::parseProperty(const CIMName& name, ValueType type, const CIMName& referenceClass)
{
    const std::size_t suffix = fCursor.current().offset;
    parseArraySuffix(fCursor, type);
    if (type.isArray && type.type == CIMTYPE_REFERENCE) {
        fCursor.failAt(suffix, "a reference property cannot be an array");
    }
    CIMValue value(type.type, type.isArray, type.arraySize);
    if (fCursor.skipPunctuation('=')) {
        value = buildValue(fCursor, fCompilation.aliases, parseInitializer(fCursor), type);
    }
    fCursor.expectPunctuation(';');
    return CIMProperty(name, value, type.arraySize, referenceClass);
}

CIMMethod ClassParser::parseMethod(const CIMName& name, CIMType type)
{
    CIMMethod method(name, type);
    fCursor.expectPunctuation('(');
    if (!fCursor.skipPunctuation(')')) {
        do {
            checkMemberCount(method.getParameterCount());
            const std::size_t offset = fCursor.current().offset;
            const CIMParameter parameter = parseParameter();
            if (method.findParameter(parameter.getName()) != PEG_NOT_FOUND) {
                fCursor.failAt(offset, "parameter " + base::utf8(parameter.getName()) + " is given twice");
            }
            method.addParameter(parameter);
        } while (fCursor.skipPunctuation(','));
        fCursor.expectPunctuation(')');
    }
    fCursor.expectPunctuation(';');
    return method;
}

CIMParameter ClassParser::parseParameter()
{
    const Qualifiers qualifiers = fQualifiers.parseList();
    CIMName referenceClass;
    ValueType type = parseElementType(fCursor, referenceClass);
    const std::size_t offset = fCursor.current().offset;
    const CIMName name = parseName(fCursor, "a parameter name");
    if (name.equal(CIMName("Ref"))) {
        fCompilation.portability.report(fCursor, offset, "a parameter named Ref");
    }
    parseArraySuffix(fCursor, type);
    if (fCursor.atPunctuation('=')) {
        fCursor.fail("a parameter cannot have a default value");
    }
    CIMParameter parameter(name, type.type, type.isArray, type.arraySize, referenceClass);
    addQualifiers(parameter, qualifiers);
    return parameter;
}

// Leaves out a second property of one name with a warning, as OpenPegasus's compiler does.
// Members are looked up one by one, here and in CIMClass: a class of 300 takes milliseconds, one at the limit
// memberCount about 5 s.
void ClassParser::addProperty(CIMClass& owner, const CIMProperty& property, std::size_t offset)
{
    if (owner.findProperty(property.getName()) == PEG_NOT_FOUND) {
        owner.addProperty(property);
    } else {
        fCursor.warn(offset, "Property " + base::utf8(property.getName()) + " already exists in class " +
                                 base::utf8(owner.getClassName()));
    }
}

void ClassParser::addMethod(CIMClass& owner, const CIMMethod& method, std::size_t offset)
{
    if (owner.findMethod(method.getName()) == PEG_NOT_FOUND) {
        owner.addMethod(method);
    } else {
        fCursor.warn(offset, "Method " + base::utf8(method.getName()) + " already exists in class " +
                                 base::utf8(owner.getClassName()));
    }
}

// Other servers look a property's class up when the class is created; a class may name itself.
void ClassParser::checkNamedClasses(const CIMClass& owner, const CIMConstProperty& property, std::size_t offset)
{
    const auto check = [&](const CIMName& name, const std::string& kind) {
        if (!name.isNull() && !name.equal(owner.getClassName()) && fCompilation.portability.isNews(kind) &&
            !fCompilation.delivery.hasClass(name))
        {
            fCompilation.portability.report(fCursor, offset, kind);
        }
    };
    check(property.getReferenceClassName(), "a reference to a class that is not declared yet");
    const Uint32 index = property.findQualifier(CIMName("EmbeddedInstance"));
    const CIMValue embedded = index == PEG_NOT_FOUND ? CIMValue() : property.getQualifier(index).getValue();
    if (embedded.isNull() || embedded.getType() != CIMTYPE_STRING || embedded.isArray()) {
        return;
    }
    String name;
    embedded.get(name);
    if (CIMName::legal(name)) {
        check(CIMName(name), "EmbeddedInstance of a class that is not declared yet");
    }
}

void ClassParser::checkMemberCount(std::size_t count)
{
    if (count >= fCursor.limits().memberCount) {
        fCursor.fail("more members than the limit memberCount (" + std::to_string(fCursor.limits().memberCount) + ")");
    }
}

} // namespace Pegasus::mof
