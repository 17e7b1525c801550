// SPDX-License-Identifier: MIT
// The text forms of TCIMValue and TCIMChar16. Both directions ignore the locale.
#include "host/core/TCIMValueRep.h"

#include <host/TCIMValue.h>

#include <boost/make_shared.hpp>

#include <charconv>
#include <type_traits>

#include <strings.h>

namespace NKOLVRX20 {
namespace {

template <typename Number> Number ParseNumber(const std::string& text)
{
    Number number{};
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number);
    if (result.ec != std::errc() || result.ptr != end) {
        ThrowTypeMismatch();
    }
    return number;
}

bool ParseBoolean(const std::string& text)
{
    if (strcasecmp(text.c_str(), "true") == 0) {
        return true;
    }
    if (strcasecmp(text.c_str(), "false") == 0) {
        return false;
    }
    ThrowTypeMismatch();
}

TCIMReference ParseReference(const std::string& text)
{
    TCIMReference reference;
    reference.SetPath(text);
    return reference;
}

// Large enough for 64 bits in radix 2 with a sign.
constexpr std::size_t kNumberChars = 80;

struct TTextWriter
{
    int fRadix;

    std::string operator()(std::monostate) const { return ""; }
    std::string operator()(bool value) const { return value ? "true" : "false"; }
    std::string operator()(const TCIMChar16& value) const { return (*this)(value.GetCode()); }
    std::string operator()(const std::string& value) const { return value; }
    std::string operator()(const TCIMDateTime& value) const { return value.ToString(); }
    std::string operator()(const TCIMReference& value) const { return value.GetPath(); }

    template <typename Number>
    std::enable_if_t<std::is_arithmetic_v<Number>, std::string> operator()(Number value) const
    {
        char text[kNumberChars];
        std::to_chars_result end{};
        if constexpr (std::is_floating_point_v<Number>) {
            // The shortest digits that read back as the same number.
            end = std::to_chars(text, text + kNumberChars, value, std::chars_format::general);
        } else {
            end = std::to_chars(text, text + kNumberChars, value, fRadix);
        }
        return std::string(text, end.ptr);
    }

    std::string operator()(const std::vector<TCIMValue>& elements) const
    {
        std::string text;
        for (const TCIMValue& element : elements) {
            if (&element != &elements.front()) {
                text += ", ";
            }
            text += element.ToString(static_cast<unsigned char>(fRadix));
        }
        return text;
    }
};

} // namespace

TCIMChar16::TCIMChar16(const std::string& decimalText) : fCode(ParseNumber<unsigned short>(decimalText)) {}

void TCIMValue::Set(const std::string& text)
{
    if (IsArray()) {
        if (!text.empty()) {
            ThrowTypeMismatch();
        }
        // GetType is the element's code; the array's code makes an empty array again.
        *this = TCIMValue(TCIMType(TCIMType::ECIMType(GetType() + TCIMType::kArrayOffset)), 0);
        return;
    }
    TCIMValue parsed;
    switch (GetType()) {
    case TCIMType::kBoolean:
        parsed = ParseBoolean(text);
        break;
    case TCIMType::kUint8:
        parsed = ParseNumber<unsigned char>(text);
        break;
    case TCIMType::kSint8:
        parsed = ParseNumber<signed char>(text);
        break;
    case TCIMType::kUint16:
        parsed = ParseNumber<unsigned short>(text);
        break;
    case TCIMType::kSint16:
        parsed = ParseNumber<short>(text);
        break;
    case TCIMType::kUint32:
        parsed = ParseNumber<unsigned int>(text);
        break;
    case TCIMType::kSint32:
        parsed = ParseNumber<int>(text);
        break;
    case TCIMType::kUint64:
        parsed = ParseNumber<unsigned long>(text);
        break;
    case TCIMType::kSint64:
        parsed = ParseNumber<long>(text);
        break;
    case TCIMType::kReal32:
        parsed = ParseNumber<float>(text);
        break;
    case TCIMType::kReal64:
        parsed = ParseNumber<double>(text);
        break;
    case TCIMType::kChar16:
        parsed = TCIMChar16(text);
        break;
    case TCIMType::kDatetime:
        parsed = TCIMDateTime(text);
        break;
    case TCIMType::kReference:
        parsed = ParseReference(text);
        parsed.fRep->fReferencedClass = fRep->fReferencedClass;
        break;
    default:
        parsed = text;
        break;
    }
    *this = std::move(parsed);
}

std::string TCIMValue::ToString(unsigned char radix) const
{
    if (radix < 2 || radix > 36) {
        ThrowTypeMismatch();
    }
    return fRep ? std::visit(TTextWriter{radix}, fRep->fData) : std::string();
}

const char* TCIMValue::TCIMType::GetName() const noexcept
{
    static constexpr const char* kNames[] = {"none",   "boolean", "uint8",    "sint8",    "uint16", "sint16",
                                             "uint32", "sint32",  "uint64",   "sint64",   "real32", "real64",
                                             "char16", "string",  "datetime", "reference"};
    const ECIMType element = GetElementType();
    return element <= kReference ? kNames[element] : kNames[kNone];
}

} // namespace NKOLVRX20
