// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>

namespace Pegasus::mof {

// Where the compiler delivers definitions and looks up earlier ones: a server, or memory when a file is only checked.
//
// Throws: any function may throw a Pegasus::Exception. The compiler turns it into an error at the definition's place in
//     the text and stops.
// Thread: createClass(), and warn() for a class that exists already, may be called on a thread of the compiler's own;
//     the others on the thread that compiles. One call at a time, in the order of the text.
class DefinitionHandler
{
  public:
    virtual ~DefinitionHandler() = default;

    // Sets the target of all definitions; called once, before the first one.
    virtual void useNamespace(const CIMNamespaceName& nameSpace) = 0;

    // Looks up a declaration, which gives a qualifier's value its type.
    // Returns: false when it is absent.
    virtual bool findQualifier(const CIMName& name, CIMQualifierDecl& declaration) = 0;
    // Looks up a class with everything it inherits, for the types of an instance's properties and for the keys of an
    // alias's path.
    // Returns: false when it is absent.
    virtual bool findClass(const CIMName& name, CIMClass& found) = 0;
    // Returns: whether the class exists.
    virtual bool hasClass(const CIMName& name) = 0;

    virtual void declareQualifier(const CIMQualifierDecl& declaration) = 0;
    // Returns: false when the class exists already; it stays as it is.
    virtual bool createClass(const CIMClass& newClass) = 0;
    // Returns: false when the instance exists already; it stays as it is.
    virtual bool createInstance(const CIMInstance& newInstance) = 0;

    // Reports a warning; `place` is "file:line:column".
    virtual void warn(const std::string& place, const std::string& text) = 0;
};

} // namespace Pegasus::mof
