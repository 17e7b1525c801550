// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/ElementDecoder.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::repository {

// Encodes objects as the texts in which they are stored, the elements of CIM-XML.
//
// Throws: CIM_ERR_SERVER_LIMITS_EXCEEDED for an object beyond the limit.
// Thread: any.
class ObjectEncoder
{
  public:
    // `maxBytes`: limit of one encoded object.
    explicit ObjectEncoder(std::size_t maxBytes) : fMaxBytes(maxBytes) {}

    std::string encodeClass(const CIMConstClass& object) const;
    std::string encodeInstance(const CIMConstInstance& object) const;
    std::string encodeQualifier(const CIMConstQualifierDecl& object) const;

    std::size_t maxBytes() const { return fMaxBytes; }

  private:
    std::string checked(std::string text) const;

    const std::size_t fMaxBytes;
};

// Decodes stored texts. Objects of one decoder share the texts of equal names.
//
// Throws: CIM_ERR_FAILED for a malformed stored text.
// Thread: one thread at a time. An operation makes a decoder of its own, so that several may decode at once.
class ObjectDecoder
{
  public:
    // Accepts all that `encoder` accepts.
    explicit ObjectDecoder(const ObjectEncoder& encoder);

    CIMClass decodeClass(std::string text);
    CIMInstance decodeInstance(std::string text);
    CIMQualifierDecl decodeQualifier(std::string text);

  private:
    template <typename Object>
    Object decode(std::string& text, Object (wire::ElementDecoder::*function)(const wire::XmlElement&));

    wire::XmlDocument fDocument;
    wire::ElementDecoder fDecoder;
};

} // namespace Pegasus::repository
