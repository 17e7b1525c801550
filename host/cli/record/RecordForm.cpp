// SPDX-License-Identifier: MIT
#include "host/cli/record/RecordForm.h"

#include <host/TVRXException.h>

#include <charconv>
#include <cinttypes>
#include <cstdio>
#include <stdexcept>

namespace vrxhost {
namespace {

using NKOLVRX20::TCIMValue;
using TType = TCIMValue::TCIMType;

constexpr char kNull[] = "\\N";
constexpr char kArray[] = "[]";
constexpr unsigned char kDecimal = 10;

std::string ScalarField(const TCIMValue& value)
{
    return value.IsNull() ? kNull : RecordField(value.ToString(kDecimal));
}

// Returns: the byte that a hexadecimal escape "xHH" stands for.
char HexByte(std::string_view escape)
{
    unsigned char byte = 0;
    const bool isWhole = escape.size() >= 3;
    const char* const end = escape.data() + 3;
    const auto result = std::from_chars(escape.data() + 1, isWhole ? end : escape.data() + 1, byte, 16);
    if (!isWhole || result.ec != std::errc() || result.ptr != end) {
        throw std::runtime_error("an escape \\x needs two hexadecimal digits");
    }
    return static_cast<char>(byte);
}

std::string Unescaped(std::string_view field)
{
    std::string text;
    text.reserve(field.size());
    for (std::size_t i = 0; i < field.size(); ++i) {
        if (field[i] != '\\') {
            text += field[i];
            continue;
        }
        const char escape = ++i < field.size() ? field[i] : '\0';
        switch (escape) {
        case '\\':
            text += '\\';
            break;
        case 't':
            text += '\t';
            break;
        case 'n':
            text += '\n';
            break;
        case 'x':
            text += HexByte(field.substr(i));
            i += 2;
            break;
        default:
            throw std::runtime_error("an unknown escape stands after a backslash");
        }
    }
    return text;
}

} // namespace

std::string RecordField(std::string_view text)
{
    std::string field;
    field.reserve(text.size());
    for (const char c : text) {
        if (c == '\\') {
            field += "\\\\";
        } else if (c == '\t') {
            field += "\\t";
        } else if (c == '\n') {
            field += "\\n";
        } else if (static_cast<unsigned char>(c) < ' ' || c == 0x7f) {
            char escape[8];
            std::snprintf(escape, sizeof escape, "\\x%02x", static_cast<unsigned char>(c));
            field += escape;
        } else {
            field += c;
        }
    }
    return field;
}

std::string RecordValue(const TCIMValue& value)
{
    const std::string type = value.GetType().GetName();
    if (!value.IsArray()) {
        return type + "\t" + ScalarField(value);
    }
    const auto& elements = static_cast<const std::vector<TCIMValue>&>(value);
    if (elements.size() > kMaxRecordElements) {
        throw std::length_error("an array of " + std::to_string(elements.size()) +
                                " elements is larger than a record can hold");
    }
    std::string fields = type + kArray;
    for (const TCIMValue& element : elements) {
        fields += "\t" + ScalarField(element);
    }
    return fields;
}

std::string_view TRecordFields::NextRaw()
{
    if (!fHasMore) {
        throw std::runtime_error("a field is missing");
    }
    const std::size_t tab = fRest.find('\t');
    const std::string_view field = fRest.substr(0, tab);
    fHasMore = tab != std::string_view::npos;
    fRest.remove_prefix(fHasMore ? tab + 1 : fRest.size());
    return field;
}

std::string TRecordFields::Next()
{
    return Unescaped(NextRaw());
}

std::uint64_t TRecordFields::NextNumber()
{
    const std::string_view field = NextRaw();
    std::uint64_t number = 0;
    const auto result = std::from_chars(field.data(), field.data() + field.size(), number);
    if (result.ec != std::errc() || result.ptr != field.data() + field.size()) {
        throw std::runtime_error("\"" + RecordField(field.substr(0, 32)) + "\" is not a number");
    }
    return number;
}

TType TRecordFields::NextType()
{
    const std::string_view field = NextRaw();
    const std::string_view suffix = kArray;
    const bool isArray = field.size() > suffix.size() && field.substr(field.size() - suffix.size()) == suffix;
    const std::string_view name = field.substr(0, field.size() - (isArray ? suffix.size() : 0));
    for (unsigned int code = TType::kNone; code <= TType::kReference; ++code) {
        const TType type = TType::ECIMType(code);
        if (name == type.GetName()) {
            return TType::ECIMType(code + (isArray ? TType::kArrayOffset : 0u));
        }
    }
    throw std::runtime_error("\"" + RecordField(field.substr(0, 32)) + "\" is not a type");
}

TCIMValue TRecordFields::NextScalar(TType type)
{
    const std::string_view field = NextRaw();
    TCIMValue value(type, 0);
    if (field != kNull) {
        try {
            value.Set(Unescaped(field));
        } catch (const NKOLVRX20::TVRXException&) {
            throw std::runtime_error("\"" + std::string(field.substr(0, 32)) + "\" is not a value of type " +
                                     type.GetName());
        }
    }
    return value;
}

TCIMValue TRecordFields::NextValue()
{
    const TType type = NextType();
    if (type == TType::kNone) {
        if (NextRaw() != kNull) {
            throw std::runtime_error("a value without a type is not null");
        }
        return TCIMValue();
    }
    return type.IsArray() ? NextArray(type) : NextScalar(type);
}

TCIMValue TRecordFields::NextArray(TType type)
{
    std::vector<TCIMValue> elements;
    while (fHasMore) {
        if (elements.size() == kMaxRecordElements || type.GetElementType() == TType::kNone) {
            throw std::runtime_error("an array has more elements than it may have");
        }
        elements.push_back(NextScalar(type.GetElementType()));
    }
    return elements.empty() ? TCIMValue(type, 0) : TCIMValue(type.GetElementType(), 0, elements);
}

void TRecordSum::Add(std::string_view bytes)
{
    for (const char c : bytes) {
        fSum = (fSum ^ static_cast<unsigned char>(c)) * 1099511628211u;
    }
}

std::string TRecordSum::GetText() const
{
    char text[32];
    std::snprintf(text, sizeof text, "%016" PRIx64, fSum);
    return text;
}

} // namespace vrxhost
