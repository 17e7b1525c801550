// SPDX-License-Identifier: MIT
#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"
#include "pegasus/base/Utf8.h"
#include "pegasus/common/StringRep.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <new>
#include <ostream>
#include <vector>

namespace Pegasus {

// A null pointer where text was expected.
class PEGASUS_COMMON_LINKAGE NullPointer : public Exception
{
  public:
    NullPointer() : Exception("null pointer") {}
};

template class RepPointer<StringRep>;

const String String::EMPTY;

StringRep* StringRep::create(std::size_t capacity)
{
    if (capacity >= PEG_NOT_FOUND / sizeof(Char16)) {
        throw std::bad_alloc();
    }
    void* memory = ::operator new(sizeof(StringRep) + (capacity + 1) * sizeof(Char16));
    auto* rep = new (memory) StringRep();
    rep->fCapacity = static_cast<Uint32>(capacity);
    new (rep->units()) Char16();
    return rep;
}

namespace {

using StringPointer = RepPointer<StringRep>;

const Char16 kNoUnits[1];

StringPointer makeRep(const Char16* units, std::size_t count, std::size_t capacity)
{
    StringPointer rep(StringRep::create(capacity));
    if (count) {
        std::memcpy(static_cast<void*>(rep->units()), units, count * sizeof(Char16));
    }
    rep->fSize = static_cast<Uint32>(count);
    rep->units()[count] = Char16();
    return rep;
}

StringPointer makeRep(const Char16* units, std::size_t count)
{
    return count ? makeRep(units, count, count) : StringPointer();
}

// Makes the units the holder's own, with room for `capacity`.
void makeWritable(StringPointer& rep, std::size_t capacity)
{
    if (rep && !rep->isShared() && rep->fCapacity >= capacity) {
        return;
    }
    const std::size_t count = rep ? rep->fSize : 0;
    rep = makeRep(rep ? rep->units() : nullptr, count, std::max(capacity, count));
}

std::size_t lengthOf(const Char16* units)
{
    if (!units) {
        throw NullPointer();
    }
    std::size_t count = 0;
    while (Uint16(units[count]) != 0) {
        ++count;
    }
    return count;
}

const char* notNull(const char* text)
{
    if (!text) {
        throw NullPointer();
    }
    return text;
}

// The text up to the bad byte, then that byte and the next few in hexadecimal.
[[noreturn]] void throwNotUtf8(std::string_view text, std::size_t index)
{
    constexpr std::size_t kShownBytes = 6;
    std::string message =
        "The byte sequence starting at index " + std::to_string(index) + " is not valid UTF-8 encoding: ";
    message.append(text.substr(0, index));
    for (const char byte : text.substr(index, kShownBytes)) {
        char hex[8];
        std::snprintf(hex, sizeof(hex), " 0x%02X", static_cast<unsigned>(static_cast<unsigned char>(byte)));
        message += hex;
    }
    throw Exception(base::fromUtf8(message));
}

StringPointer repFromUtf8(std::string_view utf8)
{
    if (utf8.empty()) {
        return StringPointer();
    }
    StringPointer rep(StringRep::create(utf8.size()));
    const base::Utf8DecodeResult result = base::decodeUtf8(utf8.data(), utf8.size(), rep->units());
    if (result.invalid) {
        throwNotUtf8(utf8, static_cast<std::size_t>(result.invalid - utf8.data()));
    }
    const auto count = static_cast<std::size_t>(result.end - rep->units());
    // Mostly non-ASCII text would keep up to two thirds of its memory unused.
    if (count < utf8.size()) {
        return makeRep(rep->units(), count);
    }
    rep->fSize = static_cast<Uint32>(count);
    rep->units()[count] = Char16();
    return rep;
}

int signOf(int difference)
{
    return difference < 0 ? -1 : (difference > 0 ? 1 : 0);
}

template <typename Fold> int compareUnits(const String& s1, const String& s2, Uint32 n, Fold fold)
{
    const Uint32 count1 = std::min(s1.size(), n);
    const Uint32 count2 = std::min(s2.size(), n);
    const Char16* data1 = s1.getChar16Data();
    const Char16* data2 = s2.getChar16Data();
    for (Uint32 i = 0; i < std::min(count1, count2); ++i) {
        const int difference = int(fold(Uint16(data1[i]))) - int(fold(Uint16(data2[i])));
        if (difference != 0) {
            return signOf(difference);
        }
    }
    return count1 == count2 ? 0 : (count1 < count2 ? -1 : 1);
}

Uint16 asIs(Uint16 unit)
{
    return unit;
}

Uint16 lowered(Uint16 unit)
{
    return base::lowerAscii(unit);
}

} // namespace

// ---- CString

namespace {

char* copyBytes(const char* bytes)
{
    if (!bytes) {
        return nullptr;
    }
    const std::size_t size = std::strlen(bytes) + 1;
    return static_cast<char*>(std::memcpy(new char[size], bytes, size));
}

} // namespace

CString::CString(const CString& other) : fBytes(copyBytes(other.fBytes)) {}

CString::~CString()
{
    delete[] fBytes;
}

CString& CString::operator=(const CString& other)
{
    CString copy(other);
    std::swap(fBytes, copy.fBytes);
    return *this;
}

// ---- String

String::String(const String& str, Uint32 n) : fRep(makeRep(str.getChar16Data(), std::min(n, str.size()))) {}
String::String(const Char16* str) : fRep(makeRep(str, lengthOf(str))) {}
String::String(const Char16* str, Uint32 n) : fRep(makeRep(str, n)) {}
String::String(const char* str) : fRep(repFromUtf8(notNull(str))) {}
String::String(const char* str, Uint32 n) : fRep(repFromUtf8(std::string_view(notNull(str), n))) {}

String& String::assign(const String& str)
{
    return *this = str;
}

String& String::assign(const Char16* str)
{
    return *this = String(str);
}

String& String::assign(const Char16* str, Uint32 n)
{
    return *this = String(str, n);
}

String& String::assign(const char* str)
{
    return *this = String(str);
}

String& String::assign(const char* str, Uint32 n)
{
    return *this = String(str, n);
}

void String::clear()
{
    fRep = RepPointer<StringRep>();
}

void String::reserveCapacity(Uint32 capacity)
{
    makeWritable(fRep, capacity);
}

Uint32 String::size() const
{
    return fRep ? fRep->fSize : 0;
}

const Char16* String::getChar16Data() const
{
    return fRep ? fRep->units() : kNoUnits;
}

CString String::getCString() const
{
    // An embedded zero stays: the bytes are the whole text.
    const Char16* units = getChar16Data();
    const Uint32 count = size();
    std::unique_ptr<char[]> bytes(new char[count + 1UL]);
    Uint32 ascii = 0;
    for (; ascii < count && Uint16(units[ascii]) < 0x80; ++ascii) {
        bytes[ascii] = static_cast<char>(Uint16(units[ascii]));
    }
    if (ascii < count) {
        const std::string utf8 = base::utf8(*this);
        bytes.reset(new char[utf8.size() + 1]);
        std::memcpy(bytes.get(), utf8.c_str(), utf8.size() + 1);
    } else {
        bytes[count] = '\0';
    }
    return CString(bytes.release());
}

Char16& String::operator[](Uint32 index)
{
    if (index > size()) {
        throw IndexOutOfBoundsException();
    }
    makeWritable(fRep, size());
    return fRep->units()[index];
}

const Char16 String::operator[](Uint32 index) const
{
    if (index > size()) {
        throw IndexOutOfBoundsException();
    }
    return getChar16Data()[index];
}

String& String::append(const Char16& c)
{
    return append(&c, 1);
}

String& String::append(const Char16* str, Uint32 n)
{
    const Char16* own = getChar16Data();
    if (!std::less<const Char16*>()(str, own) && std::less<const Char16*>()(str, own + size())) {
        const String copy(str, n); // `str` points into this very string
        return append(copy.getChar16Data(), n);
    }
    const std::size_t newSize = std::size_t(size()) + n;
    const std::size_t capacity = fRep ? fRep->fCapacity : 0;
    makeWritable(fRep, newSize > capacity ? std::max(newSize, 2 * capacity) : newSize);
    if (n) {
        std::memmove(static_cast<void*>(fRep->units() + fRep->fSize), str, n * sizeof(Char16));
    }
    fRep->fSize = static_cast<Uint32>(newSize);
    fRep->units()[newSize] = Char16();
    return *this;
}

String& String::append(const String& str)
{
    if (size() == 0) {
        return *this = str;
    }
    const String kept(str); // NOLINT(performance-unnecessary-copy-initialization): str may be *this
    return append(kept.getChar16Data(), kept.size());
}

void String::remove(Uint32 index, Uint32 size)
{
    const Uint32 oldSize = this->size();
    if (size == PEG_NOT_FOUND && index <= oldSize) {
        size = oldSize - index;
    }
    if (index > oldSize || size > oldSize - index) {
        throw IndexOutOfBoundsException();
    }
    if (size == 0) {
        return;
    }
    makeWritable(fRep, oldSize);
    Char16* hole = fRep->units() + index;
    // The zero after the text moves along.
    std::memmove(static_cast<void*>(hole), hole + size, (oldSize - index - size + 1) * sizeof(Char16));
    fRep->fSize = oldSize - size;
}

String String::subString(Uint32 index, Uint32 n) const
{
    if (index >= size()) {
        return String();
    }
    return String(getChar16Data() + index, std::min(n, size() - index));
}

Uint32 String::find(Char16 c) const
{
    return find(0, c);
}

Uint32 String::find(Uint32 index, Char16 c) const
{
    const Char16* data = getChar16Data();
    for (Uint32 i = index; i < size(); ++i) {
        if (data[i] == c) {
            return i;
        }
    }
    return PEG_NOT_FOUND;
}

Uint32 String::find(const String& s) const
{
    if (s.size() == 0) {
        return PEG_NOT_FOUND;
    }
    const Char16* begin = getChar16Data();
    const Char16* end = begin + size();
    const Char16* found = std::search(begin, end, s.getChar16Data(), s.getChar16Data() + s.size());
    return found == end ? PEG_NOT_FOUND : static_cast<Uint32>(found - begin);
}

Uint32 String::reverseFind(Char16 c) const
{
    const Char16* data = getChar16Data();
    for (Uint32 i = size(); i > 0; --i) {
        if (data[i - 1] == c) {
            return i - 1;
        }
    }
    return PEG_NOT_FOUND;
}

void String::toLower()
{
    makeWritable(fRep, size());
    for (Uint32 i = 0; i < fRep->fSize; ++i) {
        fRep->units()[i] = base::lowerAscii(fRep->units()[i]);
    }
}

void String::appendPrintf(const char* format, ...)
{
    va_list arguments;
    va_start(arguments, format);
    va_list again;
    va_copy(again, arguments);
    const int size = std::vsnprintf(nullptr, 0, format, arguments);
    va_end(arguments);
    std::vector<char> text(size > 0 ? static_cast<std::size_t>(size) + 1 : 1);
    std::vsnprintf(text.data(), text.size(), format, again);
    va_end(again);
    append(base::fromUtf8(text.data()));
}

int String::compare(const String& s1, const String& s2)
{
    return compareUnits(s1, s2, PEG_NOT_FOUND, asIs);
}

int String::compare(const String& s1, const String& s2, Uint32 n)
{
    return compareUnits(s1, s2, n, asIs);
}

int String::compareNoCase(const String& s1, const String& s2)
{
    return compareUnits(s1, s2, PEG_NOT_FOUND, lowered);
}

Boolean String::equal(const String& s1, const String& s2)
{
    return s1.size() == s2.size() &&
           std::memcmp(s1.getChar16Data(), s2.getChar16Data(), s1.size() * sizeof(Char16)) == 0;
}

Boolean String::equalNoCase(const String& s1, const String& s2)
{
    return s1.size() == s2.size() && compareNoCase(s1, s2) == 0;
}

// ---- free functions

Boolean operator==(const String& s1, const String& s2)
{
    return String::equal(s1, s2);
}

Boolean operator==(const String& s1, const char* s2)
{
    return String::equal(s1, String(s2));
}

Boolean operator==(const char* s1, const String& s2)
{
    return String::equal(String(s1), s2);
}

Boolean operator!=(const String& s1, const String& s2)
{
    return !String::equal(s1, s2);
}

Boolean operator<(const String& s1, const String& s2)
{
    return String::compare(s1, s2) < 0;
}

Boolean operator<=(const String& s1, const String& s2)
{
    return String::compare(s1, s2) <= 0;
}

Boolean operator>(const String& s1, const String& s2)
{
    return String::compare(s1, s2) > 0;
}

Boolean operator>=(const String& s1, const String& s2)
{
    return String::compare(s1, s2) >= 0;
}

String operator+(const String& s1, const String& s2)
{
    return String(s1).append(s2);
}

// UTF-8, as OpenPegasus writes it when it is built with ICU.
std::ostream& operator<<(std::ostream& os, const String& str)
{
    return os << base::utf8(str);
}

} // namespace Pegasus
