// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/QualifierParser.h"
#include "pegasus/mof/ValueBuilder.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMMethod.h>
#include <Pegasus/Common/CIMParameter.h>
#include <Pegasus/Common/CIMProperty.h>

namespace Pegasus::mof {

// A class and its declaration's alias, which may be empty.
struct ParsedClass
{
    CIMClass itsClass;
    std::string alias;
};

// Parses classes, associations and indications, which differ in their qualifiers only.
// Throws: MofError from every member.
class ClassParser
{
  public:
    ClassParser(TokenCursor& cursor, Compilation& compilation)
        : fCursor(cursor), fCompilation(compilation), fQualifiers(cursor, compilation)
    {
    }

    // Parses what follows the word "class", up to and including the semicolon.
    ParsedClass parse(const Qualifiers& qualifiers);

  private:
    void parseFeature(CIMClass& owner);
    CIMProperty parseProperty(const CIMName& name, ValueType type, const CIMName& referenceClass);
    CIMMethod parseMethod(const CIMName& name, CIMType type);
    CIMParameter parseParameter();
    void addProperty(CIMClass& owner, const CIMProperty& property, std::size_t offset);
    void addMethod(CIMClass& owner, const CIMMethod& method, std::size_t offset);
    void checkNamedClasses(const CIMClass& owner, const CIMConstProperty& property, std::size_t offset);
    void checkMemberCount(std::size_t count);

    TokenCursor& fCursor;
    Compilation& fCompilation;
    QualifierParser fQualifiers;
};

} // namespace Pegasus::mof
