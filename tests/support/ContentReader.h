// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/client/KnownClasses.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/ElementEncoder.h"
#include "pegasus/wire/instances/KnownInstances.h"

#include <string>
#include <string_view>

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

// The content of an answer as the client reads it: instances and classes are learned, and taken when they are offered.
// It appends the encoding of each object to `out`. All references must outlive it.
class ContentReader
{
  public:
    ContentReader(Pegasus::wire::ElementDecoder& decoder, std::string& out,
                  const Pegasus::wire::XmlLimits& limits = Pegasus::wire::XmlLimits())
        : fDecoder(decoder), fOut(out), fKnown(limits)
    {
    }

    void read(const Pegasus::wire::XmlElement& element)
    {
        encodeAgain(element, fDecoder, fOut);
        if (element.is("VALUE.NAMEDINSTANCE")) {
            fKnown.learn(element, fDecoder.decodeNamedInstance(element));
        } else if (element.is("CLASS")) {
            fClasses.learn(element, fDecoder.decodeClass(element), 0);
        }
    }

    Pegasus::wire::XmlOffer offer(std::string_view text)
    {
        using Result = Pegasus::wire::XmlOffer::Result;
        Pegasus::CIMClass cimClass;
        Pegasus::CIMInstance instance;
        Pegasus::wire::XmlOffer offer = fClasses.take(text, cimClass);
        if (offer.result == Result::kTaken) {
            Pegasus::wire::appendClass(fOut, cimClass);
        } else if (offer.result == Result::kRefused) {
            offer = fKnown.take(text, instance);
            if (offer.result == Result::kTaken) {
                Pegasus::wire::appendNamedInstance(fOut, instance);
            }
        }
        return offer;
    }

  private:
    Pegasus::wire::ElementDecoder& fDecoder;
    std::string& fOut;
    Pegasus::wire::KnownInstances fKnown;
    Pegasus::client::KnownClasses fClasses;
};

} // namespace test
