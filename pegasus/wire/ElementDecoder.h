// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/common/ArrayImpl.h"
#include "pegasus/wire/NameCache.h"
#include "pegasus/wire/XmlDocument.h"

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMObject.h>
#include <Pegasus/Common/CIMParamValue.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <string>
#include <string_view>

namespace Pegasus::wire {

// CIM-XML elements (DSP0201) to objects. One decoder serves many messages: it remembers the names that it has seen, so
// that equal names share one text.
//
// Each function takes the element that its comment names and checks everything in it.
// Throws: XmlError, with the place. Thread: one thread at a time.
class ElementDecoder
{
  public:
    explicit ElementDecoder(const XmlLimits& limits = XmlLimits()) : fLimits(limits) {}

    // CLASS. The class's path is its name.
    CIMClass decodeClass(const XmlElement& element);
    // INSTANCE. The instance's path is its class name.
    CIMInstance decodeInstance(const XmlElement& element);
    // VALUE.NAMEDINSTANCE: INSTANCENAME and INSTANCE. Throws: TypeMismatchException when their classes differ.
    CIMInstance decodeNamedInstance(const XmlElement& element);
    // QUALIFIER.DECLARATION
    CIMQualifierDecl decodeQualifierDeclaration(const XmlElement& element);

    // CLASSNAME
    CIMName decodeClassName(const XmlElement& element);
    // INSTANCENAME
    CIMObjectPath decodeInstanceName(const XmlElement& element);
    // INSTANCEPATH, LOCALINSTANCEPATH, INSTANCENAME, CLASSPATH, LOCALCLASSPATH or CLASSNAME
    CIMObjectPath decodeObjectPath(const XmlElement& element);
    // VALUE.REFERENCE
    CIMObjectPath decodeReference(const XmlElement& element);
    // LOCALNAMESPACEPATH
    CIMNamespaceName decodeLocalNamespacePath(const XmlElement& element);

    // PARAMVALUE. If PARAMTYPE is absent, the value is a string (or a reference) and the result is untyped.
    CIMParamValue decodeParamValue(const XmlElement& element);
    // RETURNVALUE
    CIMValue decodeReturnValue(const XmlElement& element);
    // VALUE, VALUE.ARRAY, VALUE.REFERENCE or VALUE.REFARRAY, read as `type`. An empty embedded object is null. Arrays
    // lack nulls, so VALUE.NULL in one is an error, as in OpenPegasus.
    CIMValue decodeValue(const XmlElement& element, CIMType type);

    // An attribute that holds a name. Throws: XmlError "Illegal value for PROPERTY.NAME attribute", or "missing ...".
    const CIMName& nameAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value);
    // Returns: the text. Throws: XmlError with the element's place on invalid UTF-8.
    String toString(const XmlElement& element, std::string_view utf8);

    const XmlLimits& limits() const { return fLimits; }
    // Returns: about how many bytes of memory all objects that were decoded so far took, the allocator's share
    // included. A name that is remembered counts once: objects share its text.
    std::size_t decodedBytes() const { return fDecodedBytes; }
    // Adds to it what an object takes that was decoded elsewhere.
    void addDecodedBytes(std::size_t bytes) { fDecodedBytes += bytes; }

  private:
    // A piece of memory, and the allocator's share.
    void countPiece(std::size_t size) { fDecodedBytes += size + kAllocationBytes; }
    // A representation, and its handle in the owner.
    void countObject(std::size_t size) { countPiece(size + sizeof(void*)); }
    // A text of so many units at most; an empty one has no memory.
    void countText(std::size_t units);
    // A finished list, without the places of its items.
    template <typename Item> void countList(const Array<Item>& items)
    {
        if (items.size() > 0) {
            countPiece(sizeof(ArrayHeader) + (items.getCapacity() - items.size()) * sizeof(Item));
        }
    }
    static constexpr std::size_t kAllocationBytes = 16;

    // ElementDecoder.cpp
    CIMProperty decodeProperty(const XmlElement& element);
    XmlElement beginProperty(const XmlElement& element, const XmlAttribute* values, CIMPropertyRep& rep);
    void readTypedProperty(const XmlElement& element, bool isArray, CIMPropertyRep& rep);
    void readReferenceProperty(const XmlElement& element, CIMPropertyRep& rep);
    CIMQualifier decodeQualifier(const XmlElement& element);
    CIMMethod decodeMethod(const XmlElement& element);
    CIMParameter decodeParameter(const XmlElement& element);
    CIMScope decodeScope(const XmlElement& element);
    CIMValue nullValue(CIMType type, bool isArray, Uint32 arraySize);
    XmlElement decodeQualifiers(XmlElement child, Array<CIMQualifier>& qualifiers);
    XmlElement decodeProperties(XmlElement child, Array<CIMProperty>& properties);
    CIMName optionalName(const XmlElement& element, std::string_view attribute, XmlAttribute value);
    bool boolAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value, bool ifMissing);
    CIMType typeAttribute(const XmlElement& element, std::string_view attribute, XmlAttribute value);
    Uint32 sizeAttribute(const XmlElement& element, XmlAttribute value);
    CIMFlavor flavor(const XmlElement& element, const XmlAttribute* values);

    // ElementDecoderPaths.cpp
    CIMKeyBinding decodeKeyBinding(const XmlElement& element);
    CIMKeyBinding decodeKey(const XmlElement& element, const CIMName& name);
    CIMObjectPath decodeNameIn(const XmlElement& element, const String& host, const CIMNamespaceName& nameSpace);

    // ElementDecoderValues.cpp
    template <typename T> T parseText(const XmlElement& element, std::string_view text);
    template <typename T> T parseElement(const XmlElement& element);
    template <typename T> CIMValue decodeScalar(const XmlElement& element);
    template <typename T> CIMValue decodeArray(const XmlElement& element);
    CIMValue referenceValue(const CIMObjectPath& path);
    CIMValue decodeParameterContent(const XmlElement& element, CIMType type);
    CIMObject decodeEmbedded(const XmlElement& element, std::string_view text);
    CIMType embeddedType(const XmlElement& element, CIMType type, XmlAttribute value1, XmlAttribute value2);

    XmlLimits fLimits;
    NameCache fNames;
    std::string fScratch;
    std::size_t fEmbeddingDepth = 0;
    std::size_t fDecodedBytes = 0;
};

} // namespace Pegasus::wire
