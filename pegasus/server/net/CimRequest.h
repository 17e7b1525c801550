// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/ElementDecoder.h"

#include <Pegasus/Common/CIMPropertyList.h>

#include <string>
#include <vector>

namespace Pegasus::server {

// The parameters of an intrinsic method, decoded from the message when an operation asks for them.
//
// Throws: wire::XmlError when a parameter has another form than is asked for; with the place of the call when a
// required one is absent, which check() excludes.
// Thread: one at a time.
class IntrinsicParameters
{
  public:
    IntrinsicParameters() = default;
    // Requires: decoder outlives this.
    IntrinsicParameters(wire::XmlElement call, wire::ElementDecoder& decoder) : fCall(call), fDecoder(&decoder) {}

    // `value` is null for a parameter without a value, which counts as absent.
    void add(std::string_view name, wire::XmlElement value);

    // Checks the names that were sent against those of an operation, each list separated by blanks.
    // Throws: CIMException, without a text as in OpenPegasus: CIM_ERR_NOT_SUPPORTED for a name that the operation
    // lacks; CIM_ERR_INVALID_PARAMETER for one that came twice, or whose required value is absent. The log has the
    // names.
    void check(std::string_view required, std::string_view optional) const;

    CIMName className(std::string_view parameter) const;         // required
    CIMName optionalClassName(std::string_view parameter) const; // the null name if absent
    CIMName name(std::string_view parameter) const;              // a string that is a name; required
    bool boolean(std::string_view parameter, bool defaultValue) const;
    CIMPropertyList propertyList() const; // PropertyList; the null list if absent
    CIMObjectPath instanceName(std::string_view parameter) const;
    CIMInstance instance(std::string_view parameter) const;
    CIMInstance namedInstance(std::string_view parameter) const; // with its path
    // A property's value, which comes without its type; null if absent. Throws: CIM_ERR_TYPE_MISMATCH when an array
    // came for a scalar or the other way round, or a reference for another type or the other way round;
    // CIM_ERR_INVALID_PARAMETER for a text that does not convert.
    CIMValue value(std::string_view parameter, CIMType type, bool isArray) const;
    CIMClass cimClass(std::string_view parameter) const;
    CIMQualifierDecl qualifierDeclaration(std::string_view parameter) const;

  private:
    // Returns: the parameter's value; null for an absent parameter as for an empty one.
    wire::XmlElement find(std::string_view parameter) const;
    wire::XmlElement require(std::string_view parameter, const char* element) const;

    struct Parameter
    {
        std::string_view name;
        wire::XmlElement value;
    };
    std::vector<Parameter> fParameters;
    wire::XmlElement fCall;
    wire::ElementDecoder* fDecoder = nullptr;
};

// One operation request (DSP0200, SIMPLEREQ). Valid as long as the decoder that made it and the text that it came from.
struct CimRequest
{
    std::string messageId;
    std::string method; // as sent; a legal name
    bool isIntrinsic = true;
    CIMNamespaceName nameSpace;

    IntrinsicParameters parameters; // of an intrinsic method

    CIMObjectPath object; // of an extrinsic method: class or instance path without host and namespace
    Array<CIMParamValue> arguments;
};

} // namespace Pegasus::server
