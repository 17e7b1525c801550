// SPDX-License-Identifier: MIT
#pragma once

#include "src/schema/QualifierValues.h"

#include <Pegasus/Client/CIMClient.h>
#include <host/ICIMQualifierDecl.h>
#include <host/TCIMValue.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

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
    // A qualifier as it occurs throughout a class.
    struct TQualifierKind
    {
        Pegasus::String fServed;                           // the name as it came
        boost::shared_ptr<ICIMQualifierDecl> fDeclaration; // null: the server failed to give it
        std::string fKey;                                  // the declaration's name, normalised
        Pegasus::CIMFlavor fServedFlavor;                  // the last one's
        ICIMQualifierDecl::EFlavor fFlavor = ICIMQualifierDecl::kFlavorNone;
    };

    // The failure's text and the name are how the log names the element; the values are those of elements of its name.
    template <typename TSource, typename TElement>
    void MirrorQualifiers(const TSource& source, TElement& element, TQualifierValues::TElement& values,
                          const char* failureText, const std::string& name);
    template <typename TElement>
    void MirrorQualifier(const Pegasus::CIMConstQualifier& source, TElement& element,
                         TQualifierValues::TElement& values);
    TCIMValue SharedValueOf(const Pegasus::CIMConstQualifier& source, TQualifierValues::TElement& values) const;
    TQualifierKind& KindOf(const Pegasus::CIMName& qualifier);
    void MirrorProperty(const Pegasus::CIMConstProperty& source, const std::string& name);
    void MirrorMethod(const Pegasus::CIMConstMethod& source, const std::string& name);
    void MirrorParameter(const Pegasus::CIMConstParameter& source, TPEGASUSMethodDecl& method);
    TCIMValue::TCIMType PropertyType(const Pegasus::CIMConstProperty& source, const std::string& name) const;
    template <typename TSource> TCIMValue ValueOf(const TSource& source) const;
    boost::shared_ptr<ICIMQualifierDecl> FetchDeclaration(const Pegasus::CIMName& qualifier,
                                                          const std::string& name) const;

    TPEGASUSClass& fTarget;
    const TOwningNamespace& fNamespace;
    TQualifierValues& fValues;
    std::vector<TQualifierKind> fKinds; // a class has few, on many elements
};

} // namespace NKOLVRX20
