// SPDX-License-Identifier: MIT
#include "pegasus/mof/QualifierParser.h"

#include "pegasus/base/Text.h"
#include "pegasus/mof/DataType.h"
#include "pegasus/mof/ValueBuilder.h"

#include <algorithm>

namespace Pegasus::mof {

namespace {

struct ScopeWord
{
    std::string_view word;
    const CIMScope& scope;
};

const CIMScope* findScope(const Token& word)
{
    static const ScopeWord kWords[] = {
        {"class", CIMScope::CLASS},           {"association", CIMScope::ASSOCIATION},
        {"indication", CIMScope::INDICATION}, {"property", CIMScope::PROPERTY},
        {"reference", CIMScope::REFERENCE},   {"method", CIMScope::METHOD},
        {"parameter", CIMScope::PARAMETER},   {"any", CIMScope::ANY},
    };
    for (const ScopeWord& known : kWords) {
        if (word.isWord(known.word)) {
            return &known.scope;
        }
    }
    return nullptr;
}

// Sets one of a pair of opposite flavors.
void choose(CIMFlavor& flavor, const CIMFlavor& chosen, const CIMFlavor& opposite)
{
    flavor.removeFlavor(opposite);
    flavor.addFlavor(chosen);
}

// OpenPegasus's compiler takes one value in parentheses for an array and one in braces for a scalar; vendors use both.
Initializer reshaped(Initializer initializer, const ValueType& type)
{
    if (initializer.elements.size() == 1 && !initializer.isNull()) {
        initializer.isArray = type.isArray;
    }
    return initializer;
}

bool isAmong(const Qualifiers& qualifiers, const CIMName& name)
{
    return std::any_of(qualifiers.begin(), qualifiers.end(),
                       [&name](const CIMQualifier& other) { return other.getName().equal(name); });
}

} // namespace

Qualifiers QualifierParser::parseList()
{
    Qualifiers list;
    if (!fCursor.skipPunctuation('[')) {
        return list;
    }
    do {
        const std::size_t offset = fCursor.current().offset;
        if (list.size() == fCursor.limits().memberCount) {
            fCursor.fail("more qualifiers than the limit memberCount (" + std::to_string(fCursor.limits().memberCount) +
                         ")");
        }
        const CIMQualifier qualifier = parseUse();
        if (isAmong(list, qualifier.getName())) {
            fCursor.failAt(offset, "qualifier " + base::utf8(qualifier.getName()) + " is given twice");
        }
        list.push_back(qualifier);
    } while (fCursor.skipPunctuation(','));
    fCursor.expectPunctuation(']');
    return list;
}

CIMQualifier QualifierParser::parseUse()
{
    const KnownQualifier qualifier = known(fCursor.expect(TokenKind::kIdentifier, "a qualifier name"));
    const CIMValue value = parseParameter(qualifier.declaration);
    CIMFlavor flavor;
    if (fCursor.skipPunctuation(':')) {
        flavor = parseUseFlavors(qualifier.declaration.getFlavor());
    }
    return CIMQualifier(qualifier.name, value, flavor);
}

KnownQualifier QualifierParser::known(const Token& name)
{
    const KnownQualifier* const found = fCompilation.delivery.findQualifier(name.text);
    if (found == nullptr) {
        fCursor.failAt(name.offset, "Could not find declaration for Qualifier named " + name.text);
    }
    return *found;
}

// The parameter may be left out: a boolean qualifier is true then, any other null (DSP0004, 7.6.3).
CIMValue QualifierParser::parseParameter(const CIMQualifierDecl& declaration)
{
    const ValueType type{declaration.getType(), declaration.isArray(), declaration.getArraySize()};
    if (fCursor.atPunctuation('{')) {
        return buildValue(fCursor, fCompilation.aliases, reshaped(parseArrayInitializer(fCursor), type), type);
    }
    if (fCursor.skipPunctuation('(')) {
        const Initializer initializer = reshaped(parseInitializer(fCursor), type);
        fCursor.expectPunctuation(')');
        return buildValue(fCursor, fCompilation.aliases, initializer, type);
    }
    if (type.type == CIMTYPE_BOOLEAN && !type.isArray) {
        return CIMValue(Boolean(true));
    }
    return CIMValue(type.type, type.isArray);
}

CIMQualifierDecl QualifierParser::parseDeclaration()
{
    const CIMName name = parseName(fCursor, "a qualifier name");
    fCursor.expectPunctuation(':');
    ValueType type;
    if (!isDataType(fCursor.current(), type.type)) {
        fCursor.failExpected("a data type");
    }
    fCursor.take();
    parseArraySuffix(fCursor, type);
    CIMValue value(type.type, type.isArray, type.arraySize);
    if (fCursor.skipPunctuation('=')) {
        value = buildValue(fCursor, fCompilation.aliases, parseInitializer(fCursor), type);
    }

    CIMScope scope;
    CIMFlavor flavor(CIMFlavor::DEFAULTS);
    while (fCursor.skipPunctuation(',')) {
        if (fCursor.skipWord("scope")) {
            scope = parseScopes();
        } else if (fCursor.skipWord("flavor")) {
            flavor = parseDeclaredFlavors();
        } else {
            fCursor.failExpected("'Scope' or 'Flavor'");
        }
    }
    if (scope.equal(CIMScope())) {
        fCursor.failExpected("', Scope (…)'");
    }
    fCursor.expectPunctuation(';');
    return CIMQualifierDecl(name, value, scope, flavor, type.arraySize);
}

CIMScope QualifierParser::parseScopes()
{
    CIMScope scopes;
    fCursor.expectPunctuation('(');
    do {
        const CIMScope* scope = findScope(fCursor.current());
        if (!scope) {
            fCursor.failExpected("a scope");
        }
        scopes.addScope(*scope);
        fCursor.take();
    } while (fCursor.skipPunctuation(','));
    fCursor.expectPunctuation(')');
    return scopes;
}

// Parses the flavors after the colon of a use: words side by side.
CIMFlavor QualifierParser::parseUseFlavors(CIMFlavor flavor)
{
    do {
        if (!applyFlavorWord(flavor)) {
            fCursor.failExpected("a flavor");
        }
    } while (fCursor.current().kind == TokenKind::kIdentifier);
    return flavor;
}

CIMFlavor QualifierParser::parseDeclaredFlavors()
{
    CIMFlavor flavor(CIMFlavor::DEFAULTS);
    fCursor.expectPunctuation('(');
    do {
        if (!applyFlavorWord(flavor)) {
            fCursor.failExpected("a flavor");
        }
    } while (fCursor.skipPunctuation(','));
    fCursor.expectPunctuation(')');
    return flavor;
}

bool QualifierParser::applyFlavorWord(CIMFlavor& flavor)
{
    if (fCursor.skipWord("enableoverride")) {
        choose(flavor, CIMFlavor::OVERRIDABLE, CIMFlavor::DISABLEOVERRIDE);
    } else if (fCursor.skipWord("disableoverride")) {
        choose(flavor, CIMFlavor::DISABLEOVERRIDE, CIMFlavor::OVERRIDABLE);
    } else if (fCursor.skipWord("tosubclass")) {
        choose(flavor, CIMFlavor::TOSUBCLASS, CIMFlavor::RESTRICTED);
    } else if (fCursor.skipWord("restricted")) {
        choose(flavor, CIMFlavor::RESTRICTED, CIMFlavor::TOSUBCLASS);
    } else if (fCursor.skipWord("toinstance")) {
        flavor.addFlavor(CIMFlavor::TOINSTANCE);
    } else if (fCursor.skipWord("translatable")) {
        flavor.addFlavor(CIMFlavor::TRANSLATABLE);
    } else {
        return false;
    }
    return true;
}

} // namespace Pegasus::mof
