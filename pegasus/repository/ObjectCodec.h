// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/ElementDecoder.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::repository {

// Encodes objects as the texts in which they are stored, the elements of CIM-XML, and decodes them.
//
// Throws: CIM_ERR_SERVER_LIMITS_EXCEEDED for an object beyond the limit; CIM_ERR_FAILED for a malformed stored
//     text.
// Thread: encoding any; decoding one thread at a time.
class ObjectCodec
{
  public:
    // `maxBytes`: limit of one encoded object.
    explicit ObjectCodec(std::size_t maxBytes);

    std::string encodeClass(const CIMConstClass& object) const;
    std::string encodeInstance(const CIMConstInstance& object) const;
    std::string encodeQualifier(const CIMConstQualifierDecl& object) const;

    CIMClass decodeClass(std::string text);
    CIMInstance decodeInstance(std::string text);
    CIMQualifierDecl decodeQualifier(std::string text);

  private:
    std::string checked(std::string text) const;
    template <typename Object>
    Object decode(std::string& text, Object (wire::ElementDecoder::*function)(const wire::XmlElement&));

    std::size_t fMaxBytes;
    wire::XmlDocument fDocument;
    wire::ElementDecoder fDecoder;
};

} // namespace Pegasus::repository
