// SPDX-License-Identifier: MIT
#include "pegasus/cmpi/objects/ProviderValue.h"

#include "pegasus/base/Text.h"
#include "pegasus/cmpi/objects/ValueCodec.h"
#include "pegasus/common/CIMValueRep.h"
#include "pegasus/wire/XmlText.h"

#include <charconv>
#include <utility>

namespace Pegasus::cmpi {
namespace {

constexpr std::size_t kKeptTextBytes = 256;

constexpr bool isSigned(CIMType type)
{
    return type == CIMTYPE_SINT8 || type == CIMTYPE_SINT16 || type == CIMTYPE_SINT32 || type == CIMTYPE_SINT64;
}

template <typename T> void appendNumber(std::string& out, T number)
{
    char digits[24];
    const auto [end, error] = std::to_chars(std::begin(digits), std::end(digits), number);
    out.append(digits, end);
}

} // namespace

ProviderValue::ProviderValue(CIMValue value) : fForm(Form::kObject), fObject(std::move(value)) {}

bool ProviderValue::takeInteger(Uint64 bits, CIMType type, CIMType wanted)
{
    if (type != wanted) {
        return false;
    }
    fForm = Form::kInteger;
    fType = type;
    fBits = bits;
    return true;
}

template <typename T> bool ProviderValue::takeInteger(const CMPIValue* value, CIMType wanted)
{
    return takeInteger(static_cast<Uint64>(readValue<T>(value)), CIMTypeOf<T>::kType, wanted);
}

bool ProviderValue::takeText(const char* text, CIMType wanted)
{
    if (text == nullptr || wanted != CIMTYPE_STRING) {
        return false;
    }
    const std::string_view bytes = text;
    const bool isPlain = wire::isPlainText(bytes);
    if (isPlain || base::isUtf8(bytes)) {
        fText.assign(bytes);
    } else {
        fText = base::utf8(decodeText(text));
    }
    fForm = Form::kText;
    fType = wanted;
    fNeedsEscapes = !isPlain;
    return true;
}

bool ProviderValue::take(const CMPIValue* value, CMPIType type, CIMType wanted)
{
    switch (type) {
    case CMPI_boolean:
        return takeInteger(readValue<CMPIBoolean>(value) != 0 ? 1 : 0, CIMTYPE_BOOLEAN, wanted);
    case CMPI_uint8:
        return takeInteger<Uint8>(value, wanted);
    case CMPI_uint16:
        return takeInteger<Uint16>(value, wanted);
    case CMPI_uint32:
        return takeInteger<Uint32>(value, wanted);
    case CMPI_uint64:
        return takeInteger<Uint64>(value, wanted);
    case CMPI_sint8:
        return takeInteger<Sint8>(value, wanted);
    case CMPI_sint16:
        return takeInteger<Sint16>(value, wanted);
    case CMPI_sint32:
        return takeInteger<Sint32>(value, wanted);
    case CMPI_sint64:
        return takeInteger<Sint64>(value, wanted);
    case CMPI_chars:
        return takeText(reinterpret_cast<const char*>(value), wanted);
    case CMPI_charsptr:
        return takeText(readValue<const char*>(value), wanted);
    case CMPI_string: {
        const CMPIString* const string = readValue<const CMPIString*>(value);
        return takeText(string == nullptr ? nullptr : static_cast<const char*>(string->hdl), wanted);
    }
    default:
        return false;
    }
}

void ProviderValue::reset() noexcept
{
    if (fText.capacity() > kKeptTextBytes) {
        fText = std::string();
    }
    if (fForm == Form::kObject) {
        fObject = CIMValue();
    }
    fForm = Form::kUnset;
}

CIMValue ProviderValue::value() const
{
    if (fForm == Form::kText) {
        return CIMValue(base::fromUtf8(fText));
    }
    if (fForm != Form::kInteger) {
        return fObject;
    }
    return visitType(fType, [&](auto tag) {
        using T = typename decltype(tag)::Type;
        if constexpr (std::is_integral_v<T>) {
            return CIMValue(static_cast<T>(fBits));
        } else {
            return CIMValue(); // not reached
        }
    });
}

void ProviderValue::appendText(std::string& out) const
{
    if (fForm == Form::kText) {
        if (fNeedsEscapes) {
            wire::appendEscaped(out, std::string_view(fText), wire::Blanks::kRaw);
        } else {
            out += fText;
        }
    } else if (fType == CIMTYPE_BOOLEAN) {
        out += fBits != 0 ? "TRUE" : "FALSE";
    } else if (isSigned(fType)) {
        appendNumber(out, static_cast<Sint64>(fBits));
    } else {
        appendNumber(out, fBits);
    }
}

} // namespace Pegasus::cmpi
