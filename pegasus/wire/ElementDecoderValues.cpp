// SPDX-License-Identifier: MIT
#include "pegasus/base/NumberText.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/ValueText.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/common/ObjectReps.h"
#include "pegasus/wire/ElementDecoder.h"
#include "pegasus/wire/XmlText.h"

namespace Pegasus::wire {
namespace {

using Kind = XmlError::Kind;

// "Uint8", from "uint8".
template <typename T> std::string typeWord()
{
    std::string word = cimTypeToString(CIMTypeOf<T>::kType);
    word.front() = static_cast<char>(word.front() - ('a' - 'A'));
    return word;
}

// Returns: what is wrong with a text that fails to be a value of the type.
template <typename T> std::string complaintAbout(std::string_view text)
{
    if constexpr (std::is_same_v<T, Boolean>) {
        return "Invalid boolean value";
    } else if constexpr (std::is_floating_point_v<T>) {
        return "Invalid real number value";
    } else if constexpr (std::is_unsigned_v<T>) {
        return base::parseUnsigned(text) ? typeWord<T>() + " value out of range" : "Invalid unsigned integer value";
    } else {
        return base::parseSigned(text) ? typeWord<T>() + " value out of range" : "Invalid signed integer value";
    }
}

// Counts one embedded object while it is decoded.
class EmbeddingGuard
{
  public:
    explicit EmbeddingGuard(std::size_t& depth) : fDepth(++depth) {}
    ~EmbeddingGuard() { --fDepth; }
    EmbeddingGuard(const EmbeddingGuard&) = delete;
    EmbeddingGuard& operator=(const EmbeddingGuard&) = delete;

  private:
    std::size_t& fDepth;
};

} // namespace

template <> String ElementDecoder::parseText<String>(const XmlElement& element, std::string_view text)
{
    return toString(element, text);
}

template <> Char16 ElementDecoder::parseText<Char16>(const XmlElement& element, std::string_view text)
{
    const String unit = toString(element, text);
    if (unit.size() != 1) {
        element.fail(Kind::kSemantic, "Invalid char16 value");
    }
    return unit[0];
}

template <> CIMDateTime ElementDecoder::parseText<CIMDateTime>(const XmlElement& element, std::string_view text)
{
    if (text.empty()) {
        return CIMDateTime();
    }
    try {
        return CIMDateTime(toString(element, text));
    } catch (const XmlError&) {
        throw;
    } catch (const Exception&) {
        element.fail(Kind::kSemantic, "Invalid datetime value");
    }
}

template <> CIMObject ElementDecoder::parseText<CIMObject>(const XmlElement& element, std::string_view text)
{
    return decodeEmbedded(element, text);
}

template <> CIMInstance ElementDecoder::parseText<CIMInstance>(const XmlElement& element, std::string_view text)
{
    const CIMObject object = decodeEmbedded(element, text);
    if (!object.isInstance()) {
        element.fail(Kind::kSemantic, "an embedded class where an instance is expected");
    }
    return CIMInstance(object);
}

template <typename T> T ElementDecoder::parseText(const XmlElement& element, std::string_view text)
{
    if (const auto value = base::parseValue<T>(text)) {
        return *value;
    }
    element.fail(Kind::kSemantic, complaintAbout<T>(text));
}

CIMObject ElementDecoder::decodeEmbedded(const XmlElement& element, std::string_view text)
{
    const EmbeddingGuard guard(fEmbeddingDepth);
    if (fEmbeddingDepth > fLimits.maxEmbedding) {
        element.fail(Kind::kTooLarge, "objects embedded more than " + std::to_string(fLimits.maxEmbedding) + " deep");
    }
    // A copy: decoding the object uses the scratch text that `text` may be in.
    const std::string xml(text);
    XmlDocument document(fLimits);
    try {
        const XmlElement root = document.parseFragment(xml);
        return root.is("CLASS") ? CIMObject(decodeClass(root)) : CIMObject(decodeInstance(root));
    } catch (const XmlError& error) {
        element.fail(error.kind(), "in an embedded object: " + base::utf8(error.getMessage()));
    }
}

CIMType ElementDecoder::embeddedType(const XmlElement& element, CIMType type, XmlAttribute value1, XmlAttribute value2)
{
    const XmlAttribute kind = value1 ? value1 : value2;
    if (!kind) {
        return type;
    }
    const bool agree = !value1 || !value2 || *value1 == *value2;
    if (type == CIMTYPE_STRING && agree && *kind == "instance") {
        return CIMTYPE_INSTANCE;
    }
    if (type == CIMTYPE_STRING && agree && *kind == "object") {
        return CIMTYPE_OBJECT;
    }
    element.fail(Kind::kSemantic, "Illegal value for " + std::string(element.name()) + ".EmbeddedObject attribute");
}

// ---- VALUE, VALUE.ARRAY

template <typename T> T ElementDecoder::parseElement(const XmlElement& element)
{
    if constexpr (std::is_same_v<T, Char16>) {
        // Servers write the character 0, which a null element of an array is to them, as a reference.
        if (isZeroReference(element.rawText())) {
            return Char16(0);
        }
    }
    return parseText<T>(element, element.text(fScratch));
}

template <typename T> CIMValue ElementDecoder::decodeScalar(const XmlElement& element)
{
    if constexpr (std::is_same_v<T, CIMObject> || std::is_same_v<T, CIMInstance>) {
        if (element.text(fScratch).empty()) {
            return CIMValue(CIMTypeOf<T>::kType, false);
        }
    }
    countObject(sizeof(CIMValueRep));
    return ValueAccess::make(parseElement<T>(element));
}

template <> CIMValue ElementDecoder::decodeScalar<CIMObjectPath>(const XmlElement& element)
{
    element.fail(Kind::kInvalid, "expected VALUE.REFERENCE element, got " + std::string(element.name()));
}

template <typename T> CIMValue ElementDecoder::decodeArray(const XmlElement& element)
{
    Array<T> array;
    for (XmlElement child = element.firstChild(); child; child = child.nextSibling()) {
        if (array.size() == fLimits.maxArrayElements) {
            child.fail(Kind::kTooLarge,
                       "an array of more than " + std::to_string(fLimits.maxArrayElements) + " elements");
        }
        if constexpr (std::is_same_v<T, CIMObjectPath>) {
            array.append(decodeReference(child));
        } else {
            if (!child.is("VALUE")) {
                child.failIn(element);
            }
            array.append(parseElement<T>(child));
        }
    }
    countObject(sizeof(CIMValueRep));
    countList(array);
    fDecodedBytes += array.size() * sizeof(T);
    return ValueAccess::make(std::move(array));
}

CIMValue ElementDecoder::referenceValue(const CIMObjectPath& path)
{
    countObject(sizeof(CIMValueRep));
    return CIMValue(path);
}

CIMValue ElementDecoder::decodeValue(const XmlElement& element, CIMType type)
{
    if (element.is("VALUE.REFERENCE")) {
        return referenceValue(decodeReference(element));
    }
    if (element.is("VALUE.REFARRAY")) {
        return decodeArray<CIMObjectPath>(element);
    }
    const bool isArray = element.is("VALUE.ARRAY");
    if (!isArray) {
        element.expectName("VALUE");
    }
    return visitType(type, [&](auto tag) {
        using T = typename decltype(tag)::Type;
        return isArray ? decodeArray<T>(element) : decodeScalar<T>(element);
    });
}

// ---- parameters

// What stands in a PARAMVALUE or RETURNVALUE: a value, or a path that is a reference; null when empty.
CIMValue ElementDecoder::decodeParameterContent(const XmlElement& element, CIMType type)
{
    const XmlElement child = element.firstChild();
    if (!child) {
        return CIMValue(type, false);
    }
    const XmlElement only = element.onlyChild();
    if (only.is("INSTANCENAME") || only.is("CLASSNAME")) {
        return referenceValue(decodeObjectPath(only));
    }
    const bool isReference = only.is("VALUE.REFERENCE") || only.is("VALUE.REFARRAY");
    if (isReference && type != CIMTYPE_REFERENCE && type != CIMTYPE_STRING) {
        only.fail(Kind::kSemantic, "a reference where " + std::string(cimTypeToString(type)) + " is expected");
    }
    return decodeValue(only, type);
}

CIMParamValue ElementDecoder::decodeParamValue(const XmlElement& element)
{
    element.expectName("PARAMVALUE");
    XmlAttribute values[4];
    element.attributes({"NAME", "PARAMTYPE", "EmbeddedObject", "EMBEDDEDOBJECT"}, values);
    const CIMName name = nameAttribute(element, "NAME", values[0]);
    countObject(sizeof(CIMParamValueRep));
    const bool isTyped = bool(values[1]);
    // An untyped null: the value is the untyped one that a default-constructed CIMValue is.
    if (!isTyped && !element.firstChild()) {
        return CIMParamValue(name.getString(), CIMValue(), false);
    }
    const CIMType type = isTyped ? typeAttribute(element, "PARAMTYPE", values[1]) : CIMTYPE_STRING;
    const CIMValue value = decodeParameterContent(element, embeddedType(element, type, values[2], values[3]));
    return CIMParamValue(name.getString(), value, isTyped);
}

CIMValue ElementDecoder::decodeReturnValue(const XmlElement& element)
{
    element.expectName("RETURNVALUE");
    XmlAttribute values[3];
    element.attributes({"PARAMTYPE", "EmbeddedObject", "EMBEDDEDOBJECT"}, values);
    const CIMType type = values[0] ? typeAttribute(element, "PARAMTYPE", values[0]) : CIMTYPE_STRING;
    return decodeParameterContent(element, embeddedType(element, type, values[1], values[2]));
}

} // namespace Pegasus::wire
