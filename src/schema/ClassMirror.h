// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Client/CIMClient.h>
#include <host/ICIMNamedElement.h>

#include <set>
#include <string>

namespace NKOLVRX20 {

class TPEGASUSClass;
class TOwningNamespace;
class TPEGASUSMethodDecl;
class TPEGASUSQualifierDecl;

// Carries the declarations of a server's class over into the host's image of it: qualifiers first, because a reference
// property is accepted in an association only, then properties, then methods. What fails is logged and left out.
//
// The server is asked for a qualifier's declaration once per namespace; after a failure, once per class.
class TClassMirror
{
  public:
    explicit TClassMirror(TPEGASUSClass& target);

    // Throws: Pegasus::UninitializedObjectException when the source is uninitialized.
    // Blocks: up to the client's timeout for each qualifier that is new.
    void Mirror(const Pegasus::CIMClass& source);

  private:
    // Where the qualifiers of an element go, and how the log names it.
    struct TElement
    {
        ICIMNamedElement& fElement;
        const char* fFailureText;
        std::string fName;
    };

    template <typename TSource> void MirrorQualifiers(const TSource& source, const TElement& element);
    void MirrorQualifier(const Pegasus::CIMConstQualifier& source, ICIMNamedElement& element);
    void MirrorProperty(const Pegasus::CIMConstProperty& source, const std::string& name);
    void MirrorMethod(const Pegasus::CIMConstMethod& source, const std::string& name);
    void MirrorParameter(const Pegasus::CIMConstParameter& source, TPEGASUSMethodDecl& method);
    TCIMValue::TCIMType PropertyType(const Pegasus::CIMConstProperty& source, const std::string& name) const;
    template <typename TSource> TCIMValue ValueOf(const TSource& source, const std::string& name) const;
    boost::shared_ptr<ICIMQualifierDecl> DeclarationOf(const Pegasus::CIMName& qualifier, const std::string& name);
    boost::shared_ptr<ICIMQualifierDecl> FetchDeclaration(const Pegasus::CIMName& qualifier, const std::string& name);

    TPEGASUSClass& fTarget;
    const TOwningNamespace& fNamespace;
    std::set<std::string> fUnknownQualifiers;
};

} // namespace NKOLVRX20
