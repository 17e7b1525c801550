// SPDX-License-Identifier: MIT
#include "pegasus/mof/DataType.h"

#include <charconv>
#include <string_view>

namespace Pegasus::mof {

namespace {

struct TypeWord
{
    std::string_view word;
    CIMType type;
};

constexpr TypeWord kTypeWords[] = {
    {"string", CIMTYPE_STRING},     {"uint16", CIMTYPE_UINT16}, {"uint32", CIMTYPE_UINT32},
    {"uint64", CIMTYPE_UINT64},     {"uint8", CIMTYPE_UINT8},   {"boolean", CIMTYPE_BOOLEAN},
    {"datetime", CIMTYPE_DATETIME}, {"sint8", CIMTYPE_SINT8},   {"sint16", CIMTYPE_SINT16},
    {"sint32", CIMTYPE_SINT32},     {"sint64", CIMTYPE_SINT64}, {"real32", CIMTYPE_REAL32},
    {"real64", CIMTYPE_REAL64},     {"char16", CIMTYPE_CHAR16},
};

} // namespace

bool isDataType(const Token& word, CIMType& type)
{
    for (const TypeWord& known : kTypeWords) {
        if (word.isWord(known.word)) {
            type = known.type;
            return true;
        }
    }
    return false;
}

void parseArraySuffix(TokenCursor& cursor, ValueType& type)
{
    if (!cursor.skipPunctuation('[')) {
        return;
    }
    type.isArray = true;
    if (cursor.skipPunctuation(']')) {
        return;
    }
    const Token size = cursor.expect(TokenKind::kInteger, "an array size or ']'");
    const char* end = size.text.data() + size.text.size();
    const auto [stop, error] = std::from_chars(size.text.data(), end, type.arraySize);
    if (error != std::errc() || stop != end || type.arraySize == 0) {
        cursor.failAt(size.offset, "array size must be a positive decimal number");
    }
    if (type.arraySize > cursor.limits().arrayElementCount) {
        cursor.failAt(size.offset, "array size is beyond the limit arrayElementCount (" +
                                       std::to_string(cursor.limits().arrayElementCount) + ")");
    }
    cursor.expectPunctuation(']');
}

ValueType parseElementType(TokenCursor& cursor, CIMName& referenceClass)
{
    ValueType type;
    if (isDataType(cursor.current(), type.type)) {
        cursor.take();
        return type;
    }
    const Token word = cursor.expect(TokenKind::kIdentifier, "a type");
    if (!cursor.skipWord("ref")) {
        cursor.failAt(word.offset, "unknown type " + word.shown());
    }
    referenceClass = CIMName(word.text.c_str());
    type.type = CIMTYPE_REFERENCE;
    return type;
}

CIMName parseName(TokenCursor& cursor, std::string_view what)
{
    return CIMName(cursor.expect(TokenKind::kIdentifier, what).text.c_str());
}

} // namespace Pegasus::mof
