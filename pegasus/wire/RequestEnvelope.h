// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

// The CIM-XML request message (DSP0200, DSP0201) that clients send to a server, and the server to its agents.
namespace Pegasus::wire {

// Writes an IMETHODCALL element, parameter by parameter, in the order of the calls. A parameter with its default value
// is left out.
class IntrinsicCall
{
  public:
    // `method` is written unescaped. Throws: InvalidNamespaceNameException for a null namespace.
    IntrinsicCall(std::string_view method, const CIMNamespaceName& nameSpace);

    // A null name is left out.
    IntrinsicCall& className(std::string_view parameter, const CIMName& name);
    IntrinsicCall& instanceName(const CIMObjectPath& path);
    // Left out when the value is `ifMissing`, the server's default.
    IntrinsicCall& flag(std::string_view parameter, Boolean value, Boolean ifMissing);
    IntrinsicCall& text(std::string_view parameter, const String& value);
    // A null list is left out.
    IntrinsicCall& propertyList(const CIMPropertyList& list);
    IntrinsicCall& newClass(const CIMClass& cimClass);
    IntrinsicCall& newInstance(const CIMInstance& instance);
    // With its path.
    IntrinsicCall& modifiedInstance(const CIMInstance& instance);
    IntrinsicCall& qualifierDeclaration(const CIMQualifierDecl& declaration);

    const std::string& method() const { return fMethod; }
    const CIMNamespaceName& nameSpace() const { return fNameSpace; }
    // Returns: the finished element. The call is empty afterwards.
    std::string finish();

  private:
    void open(std::string_view parameter);
    void close();

    std::string fMethod;
    CIMNamespaceName fNameSpace;
    std::string fElement;
};

// Returns: a METHODCALL element, on an instance when the path has keys, else on a class. The path's host and namespace
// are ignored.
std::string encodeMethodCall(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                             const Array<CIMParamValue>& parameters);

// Returns: the whole message around a METHODCALL or IMETHODCALL element. `messageId` is written unescaped.
std::string encodeRequestMessage(std::string_view messageId, std::string_view call);

} // namespace Pegasus::wire
