// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Literal.h"
#include "pegasus/mof/QualifierParser.h"

namespace Pegasus::mof {

// Parses instances. The types of their values come from their classes.
// Throws: MofError from every member.
class InstanceParser
{
  public:
    InstanceParser(TokenCursor& cursor, Compilation& compilation)
        : fCursor(cursor), fCompilation(compilation), fQualifiers(cursor, compilation)
    {
    }

    // Parses what follows the word "instance", up to and including the semicolon.
    ParsedInstance parse();

  private:
    CIMClass parseClass();
    void parseValue(ParsedInstance& parsed);
    void setValue(ParsedInstance& parsed, const CIMConstProperty& declared);
    bool isOpen(const Initializer& initializer) const;
    CIMValue embeddedValue(const Initializer& initializer, const CIMConstProperty& declared);
    CIMInstance parseEmbedded(const Literal& literal);

    TokenCursor& fCursor;
    Compilation& fCompilation;
    QualifierParser fQualifiers;
};

} // namespace Pegasus::mof
