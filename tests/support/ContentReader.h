// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"

#include <string>

namespace test {

// Decodes a content element of an answer, of any kind, and appends the object's encoding to `out`.
inline void encodeAgain(const Pegasus::wire::XmlElement& element, Pegasus::wire::ElementDecoder& decoder,
                        std::string& out)
{
    using namespace Pegasus;
    if (element.is("CLASS")) {
        wire::appendClass(out, decoder.decodeClass(element));
    } else if (element.is("VALUE.NAMEDINSTANCE")) {
        wire::appendNamedInstance(out, decoder.decodeNamedInstance(element));
    } else if (element.is("INSTANCE")) {
        wire::appendInstance(out, decoder.decodeInstance(element));
    } else if (element.is("QUALIFIER.DECLARATION")) {
        wire::appendQualifierDeclaration(out, decoder.decodeQualifierDeclaration(element));
    } else if (element.is("CLASSNAME")) {
        wire::appendClassName(out, decoder.decodeClassName(element));
    } else if (element.is("RETURNVALUE")) {
        wire::appendReturnValue(out, decoder.decodeReturnValue(element));
    } else if (element.is("PARAMVALUE")) {
        wire::appendParamValue(out, decoder.decodeParamValue(element));
    } else {
        wire::appendInstanceName(out, decoder.decodeInstanceName(element));
    }
}

} // namespace test
