// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/Compilation.h"
#include "pegasus/mof/TokenCursor.h"

#include <Pegasus/Common/CIMQualifier.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <vector>

namespace Pegasus::mof {

using Qualifiers = std::vector<CIMQualifier>;

// Parses uses and declarations of qualifiers.
// Throws: MofError from every member.
class QualifierParser
{
  public:
    QualifierParser(TokenCursor& cursor, Compilation& compilation) : fCursor(cursor), fCompilation(compilation) {}

    // Parses a list in brackets, or nothing. A use without flavors has the flavor NONE: its declaration decides.
    Qualifiers parseList();
    // Parses what follows the word "qualifier", up to and including the semicolon.
    CIMQualifierDecl parseDeclaration();

  private:
    CIMQualifier parseUse();
    KnownQualifier known(const Token& name);
    CIMValue parseParameter(const CIMQualifierDecl& declaration);
    CIMScope parseScopes();
    CIMFlavor parseUseFlavors(CIMFlavor declared);
    CIMFlavor parseDeclaredFlavors();
    bool applyFlavorWord(CIMFlavor& flavor);

    TokenCursor& fCursor;
    Compilation& fCompilation;
};

// Adds a parsed list to a class, property, method or parameter.
template <typename Owner> void addQualifiers(Owner& owner, const Qualifiers& qualifiers)
{
    for (const CIMQualifier& qualifier : qualifiers) {
        owner.addQualifier(qualifier);
    }
}

} // namespace Pegasus::mof
