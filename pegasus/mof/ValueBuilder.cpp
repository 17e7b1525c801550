// SPDX-License-Identifier: MIT
#include "pegasus/mof/ValueBuilder.h"

#include "pegasus/base/Text.h"

#include <Pegasus/Common/CIMDateTime.h>
#include <Pegasus/Common/Exception.h>

#include <charconv>
#include <cmath>
#include <limits>

namespace Pegasus::mof {

namespace {

// Converts the literals of one value to one type.
class Converter
{
  public:
    Converter(const TokenCursor& cursor, const AliasTable& aliases, CIMType type)
        : fCursor(cursor), fAliases(aliases), fType(type)
    {
    }

    template <typename T> T integer(const Literal& literal) const;
    template <typename T> T real(const Literal& literal) const;
    Boolean boolean(const Literal& literal) const;
    Char16 character(const Literal& literal) const;
    String string(const Literal& literal) const;
    CIMDateTime dateTime(const Literal& literal) const;
    CIMObjectPath reference(const Literal& literal) const;

  private:
    void require(const Literal& literal, Literal::Kind kind) const
    {
        if (literal.kind != kind) {
            invalid(literal);
        }
    }
    [[noreturn]] void invalid(const Literal& literal) const
    {
        fCursor.failAt(literal.offset, std::string("Invalid ") + cimTypeToString(fType) + " value: " + literal.shown());
    }

    const TokenCursor& fCursor;
    const AliasTable& fAliases;
    CIMType fType;
};

bool parseDigits(const char* begin, const char* end, int base, Uint64& magnitude)
{
    const auto [stop, error] = std::from_chars(begin, end, magnitude, base);
    return error == std::errc() && stop == end && begin != end;
}

// DSP0004: 0x… hexadecimal, …b binary, 0… octal, else decimal. `start` is after the sign.
bool parseMagnitude(const std::string& text, std::size_t start, Uint64& magnitude)
{
    const char* begin = text.data() + start;
    const char* end = text.data() + text.size();
    if (begin == end) {
        return false;
    }
    const bool hasZero = *begin == '0' && end - begin > 1;
    if (hasZero && (begin[1] == 'x' || begin[1] == 'X')) {
        return parseDigits(begin + 2, end, 16, magnitude);
    }
    if (end[-1] == 'b' || end[-1] == 'B') {
        return parseDigits(begin, end - 1, 2, magnitude);
    }
    return parseDigits(begin, end, hasZero ? 8 : 10, magnitude);
}

template <typename T> bool fits(Uint64 magnitude, bool isNegative)
{
    const auto most = static_cast<Uint64>(std::numeric_limits<T>::max());
    if (!isNegative) {
        return magnitude <= most;
    }
    return magnitude == 0 || (std::is_signed_v<T> && magnitude <= most + 1);
}

template <typename T> T Converter::integer(const Literal& literal) const
{
    require(literal, Literal::Kind::kInteger);
    const bool isNegative = literal.text[0] == '-';
    const bool hasSign = isNegative || literal.text[0] == '+';
    Uint64 magnitude = 0;
    if (!parseMagnitude(literal.text, hasSign ? 1 : 0, magnitude) || !fits<T>(magnitude, isNegative)) {
        invalid(literal);
    }
    return static_cast<T>(isNegative ? Uint64(0) - magnitude : magnitude);
}

// By from_chars: MOF has a decimal point in every locale, which strtod would read by the process's own. A digit must
// follow the point.
template <typename T> T Converter::real(const Literal& literal) const
{
    if (literal.kind == Literal::Kind::kInteger) {
        return static_cast<T>(literal.text[0] == '-' ? static_cast<Real64>(integer<Sint64>(literal))
                                                     : static_cast<Real64>(integer<Uint64>(literal)));
    }
    require(literal, Literal::Kind::kReal);
    const char* begin = literal.text.data() + (literal.text[0] == '+' ? 1 : 0);
    const char* end = literal.text.data() + literal.text.size();
    T value = 0;
    const auto [stop, error] = std::from_chars(begin, end, value);
    if (error != std::errc() || stop != end || !std::isfinite(value) || end[-1] == '.') {
        invalid(literal);
    }
    return value;
}

Boolean Converter::boolean(const Literal& literal) const
{
    require(literal, Literal::Kind::kBoolean);
    return literal.text == "true";
}

Char16 Converter::character(const Literal& literal) const
{
    if (literal.kind == Literal::Kind::kInteger) {
        return Char16(integer<Uint16>(literal));
    }
    if (literal.kind != Literal::Kind::kString) { // "A" for 'A' is accepted, as by OpenPegasus's compiler
        require(literal, Literal::Kind::kCharacter);
    }
    const String text = cimString(fCursor, literal.text, literal.offset);
    if (text.size() != 1) {
        invalid(literal);
    }
    return text[0];
}

String Converter::string(const Literal& literal) const
{
    require(literal, Literal::Kind::kString);
    return cimString(fCursor, literal.text, literal.offset);
}

CIMDateTime Converter::dateTime(const Literal& literal) const
{
    try {
        return CIMDateTime(string(literal));
    } catch (const Exception& error) {
        fCursor.failAt(literal.offset,
                       "Invalid datetime value: " + literal.text + ": " + base::utf8(error.getMessage()));
    }
}

CIMObjectPath Converter::reference(const Literal& literal) const
{
    if (literal.kind == Literal::Kind::kAlias) {
        const CIMObjectPath* path = fAliases.find(literal.text);
        if (!path) {
            fCursor.failAt(literal.offset, "alias $" + literal.text + " is not defined");
        }
        return *path;
    }
    try {
        return CIMObjectPath(string(literal));
    } catch (const Exception& error) {
        fCursor.failAt(literal.offset, "Invalid reference value: " + base::utf8(error.getMessage()));
    }
}

template <typename T, typename Convert>
CIMValue assemble(const TokenCursor& cursor, const Initializer& initializer, const Convert& convert)
{
    if (!initializer.isArray) {
        return CIMValue(T(convert(initializer.elements.front())));
    }
    Array<T> values;
    values.reserveCapacity(static_cast<Uint32>(initializer.elements.size()));
    for (const Literal& literal : initializer.elements) {
        if (literal.kind == Literal::Kind::kNull) {
            cursor.warn(literal.offset, "an array holds no nulls: the element becomes the type's default");
            values.append(T());
        } else {
            values.append(convert(literal));
        }
    }
    return CIMValue(values);
}

void checkShape(const TokenCursor& cursor, const Initializer& initializer, const ValueType& type)
{
    if (initializer.isArray != type.isArray) {
        cursor.failAt(initializer.offset, std::string("type mismatch: ") +
                                              (type.isArray ? "an array of " : "a single ") +
                                              cimTypeToString(type.type) + " value is expected");
    }
    if (type.arraySize != 0 && initializer.elements.size() != type.arraySize) {
        cursor.failAt(initializer.offset, "type mismatch: " + std::to_string(initializer.elements.size()) +
                                              " elements for an array of " + std::to_string(type.arraySize));
    }
    if (type.isArray && type.type == CIMTYPE_REFERENCE) {
        cursor.failAt(initializer.offset, "type mismatch: there are no arrays of references");
    }
}

template <typename T>
CIMValue assembleInteger(const TokenCursor& cursor, const Initializer& initializer, const Converter& c)
{
    return assemble<T>(cursor, initializer, [&c](const Literal& l) { return c.integer<T>(l); });
}

template <typename T>
CIMValue assembleReal(const TokenCursor& cursor, const Initializer& initializer, const Converter& c)
{
    return assemble<T>(cursor, initializer, [&c](const Literal& l) { return c.real<T>(l); });
}

CIMValue assembleOther(const TokenCursor& cursor, const Initializer& initializer, const Converter& c, CIMType type)
{
    switch (type) {
    case CIMTYPE_BOOLEAN:
        return assemble<Boolean>(cursor, initializer, [&c](const Literal& l) { return c.boolean(l); });
    case CIMTYPE_CHAR16:
        return assemble<Char16>(cursor, initializer, [&c](const Literal& l) { return c.character(l); });
    case CIMTYPE_STRING:
        return assemble<String>(cursor, initializer, [&c](const Literal& l) { return c.string(l); });
    case CIMTYPE_DATETIME:
        return assemble<CIMDateTime>(cursor, initializer, [&c](const Literal& l) { return c.dateTime(l); });
    case CIMTYPE_REFERENCE:
        return CIMValue(c.reference(initializer.elements.front()));
    default:
        cursor.failAt(initializer.offset, "an embedded object has no default value");
    }
}

} // namespace

CIMValue buildValue(const TokenCursor& cursor, const AliasTable& aliases, const Initializer& initializer,
                    const ValueType& type)
{
    if (initializer.isNull()) {
        return CIMValue(type.type, type.isArray, type.arraySize);
    }
    checkShape(cursor, initializer, type);
    const Converter converter(cursor, aliases, type.type);
    switch (type.type) {
    case CIMTYPE_UINT8:
        return assembleInteger<Uint8>(cursor, initializer, converter);
    case CIMTYPE_SINT8:
        return assembleInteger<Sint8>(cursor, initializer, converter);
    case CIMTYPE_UINT16:
        return assembleInteger<Uint16>(cursor, initializer, converter);
    case CIMTYPE_SINT16:
        return assembleInteger<Sint16>(cursor, initializer, converter);
    case CIMTYPE_UINT32:
        return assembleInteger<Uint32>(cursor, initializer, converter);
    case CIMTYPE_SINT32:
        return assembleInteger<Sint32>(cursor, initializer, converter);
    case CIMTYPE_UINT64:
        return assembleInteger<Uint64>(cursor, initializer, converter);
    case CIMTYPE_SINT64:
        return assembleInteger<Sint64>(cursor, initializer, converter);
    case CIMTYPE_REAL32:
        return assembleReal<Real32>(cursor, initializer, converter);
    case CIMTYPE_REAL64:
        return assembleReal<Real64>(cursor, initializer, converter);
    default:
        return assembleOther(cursor, initializer, converter, type.type);
    }
}

String cimString(const TokenCursor& cursor, const std::string& text, std::size_t offset)
{
    try {
        return base::fromUtf8(text);
    } catch (const Exception& error) {
        cursor.failAt(offset, base::utf8(error.getMessage()));
    }
}

} // namespace Pegasus::mof
