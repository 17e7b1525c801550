#pragma once

#include "pegasus/wire/ElementDecoder.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::repository {

// Objects to the texts in which they are stored, and back: the elements of CIM-XML.
//
// Throws: CIM_ERR_SERVER_LIMITS_EXCEEDED for an object beyond the limit; CIM_ERR_FAILED for a stored text that cannot
// be read. Thread: one thread at a time.
class ObjectText
{
  public:
    explicit ObjectText(std::size_t maxBytes);

    std::string fromClass(const CIMConstClass& object) const;
    std::string fromInstance(const CIMConstInstance& object) const;
    std::string fromQualifier(const CIMConstQualifierDecl& object) const;

    CIMClass toClass(std::string text);
    CIMInstance toInstance(std::string text);
    CIMQualifierDecl toQualifier(std::string text);

  private:
    std::string checked(std::string text) const;
    template <class Object>
    Object decode(std::string& text, Object (wire::ElementDecoder::*function)(const wire::XmlElement&));

    std::size_t fMaxBytes;
    wire::XmlDocument fDocument;
    wire::ElementDecoder fDecoder;
};

} // namespace Pegasus::repository
