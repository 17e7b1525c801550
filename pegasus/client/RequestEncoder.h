#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::client {

// One operation as it goes over the wire: the CIM-XML of its call, and what the HTTP header says about it.
struct Request
{
    std::string method;
    std::string object; // for the CIMObject field, percent-encoded
    std::string call;   // the METHODCALL or IMETHODCALL element
    bool isIntrinsic = true;
    // May it be sent again when the answer was lost? True for what only reads.
    bool isRepeatable = false;
    std::string_view result; // the element that an answer without an error has; empty when it may have none
};

// An intrinsic operation, parameter by parameter (DSP0200). Parameters with their default value are left out.
class IntrinsicRequest
{
  public:
    // Throws: InvalidNamespaceNameException (null).
    IntrinsicRequest(std::string_view method, const CIMNamespaceName& nameSpace, bool isRepeatable);

    IntrinsicRequest& className(std::string_view parameter, const CIMName& name);
    IntrinsicRequest& instanceName(const CIMObjectPath& path);
    IntrinsicRequest& flag(std::string_view parameter, Boolean value, Boolean ifMissing);
    IntrinsicRequest& text(std::string_view parameter, const String& value);
    IntrinsicRequest& propertyList(const CIMPropertyList& list);
    IntrinsicRequest& newClass(const CIMClass& cimClass);
    IntrinsicRequest& newInstance(const CIMInstance& instance);
    IntrinsicRequest& qualifierDeclaration(const CIMQualifierDecl& declaration);

    // The finished request; the encoder is empty afterwards.
    Request finish();

  private:
    void open(std::string_view parameter);
    void close();

    Request fRequest;
};

// Throws: InvalidNamespaceNameException (null).
Request encodeInvokeMethod(const CIMNamespaceName& nameSpace, const CIMObjectPath& path, const CIMName& method,
                           const Array<CIMParamValue>& parameters);

// The whole HTTP message. `host` is the Host field's text; `localUser` is named to the private socket, empty for TCP.
std::string encodeMessage(const Request& request, std::string_view messageId, std::string_view host,
                          std::string_view localUser);

} // namespace Pegasus::client
