#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>

namespace Pegasus::mof {

// What the parser asks of, and delivers to, the place where definitions go: a server, or memory in a test.
//
// Throws: any function may throw a Pegasus::Exception; the parser turns it into an error at the definition's place
// in the text and stops.
// Thread: called on the thread that parses.
class DefinitionHandler
{
  public:
    virtual ~DefinitionHandler() = default;

    // The target of all that follows: the initial one before the first definition, then each `#pragma namespace`.
    virtual void useNamespace(const CIMNamespaceName& nameSpace) = 0;

    // Looks a declaration up, so that a qualifier's value can be given its type. Returns false if there is none.
    virtual bool findQualifier(const CIMName& name, CIMQualifierDecl& declaration) = 0;
    // Looks a class up with everything it inherits, for the types of an instance's properties and for the keys of an
    // alias's path. Returns false if there is none.
    virtual bool findClass(const CIMName& name, CIMClass& found) = 0;

    virtual void declareQualifier(const CIMQualifierDecl& declaration) = 0;
    // Returns false if the class exists and was left as it is.
    virtual bool createClass(const CIMClass& newClass) = 0;
    // Returns false if the instance exists and was left as it is.
    virtual bool createInstance(const CIMInstance& newInstance) = 0;

    // A remark that does not stop the compilation; place is "file:line:column".
    virtual void warn(const std::string& place, const std::string& text) = 0;
};

} // namespace Pegasus::mof
