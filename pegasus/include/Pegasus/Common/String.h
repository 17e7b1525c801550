// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/Char16.h>
#include <Pegasus/Common/RepPointer.h>

PEGASUS_NAMESPACE_BEGIN

// UTF-8 bytes, owned. A pointer taken from a temporary dies with the full expression.
class PEGASUS_COMMON_LINKAGE CString
{
  public:
    CString() = default;
    CString(const CString& other);
    CString(CString&& other) noexcept : fBytes(other.fBytes) { other.fBytes = nullptr; }
    ~CString();
    CString& operator=(const CString& other);
    operator const char*() const { return fBytes; }

  private:
    friend class String;
    explicit CString(char* adopted) noexcept : fBytes(adopted) {}

    char* fBytes = nullptr;
};

struct StringRep;
extern template class RepPointer<StringRep>;

// Text as UTF-16 code units; copies share until one is changed.
// Every `const char*` is read as UTF-8. Throws: Exception (invalid UTF-8), NullPointer (null pointer).
class PEGASUS_COMMON_LINKAGE String
{
  public:
    String() noexcept = default;
    String(const String& str) = default;
    String(String&& str) noexcept = default;
    String(const String& str, Uint32 n);
    String(const Char16* str);
    String(const Char16* str, Uint32 n);
    String(const char* str);
    String(const char* str, Uint32 n);
    ~String() = default;

    static const String EMPTY;

    String& operator=(const String& str) = default;
    String& operator=(String&& str) noexcept = default;
    String& assign(const String& str);
    String& assign(const Char16* str);
    String& assign(const Char16* str, Uint32 n);
    String& assign(const char* str);
    String& assign(const char* str, Uint32 n);
    void clear();
    void reserveCapacity(Uint32 capacity);

    // Returns: the number of code units.
    Uint32 size() const;
    // Zero-terminated; valid until the string is changed or destroyed.
    const Char16* getChar16Data() const;
    // The text as UTF-8; a lone surrogate becomes its three bytes.
    CString getCString() const;

    // Throws: IndexOutOfBoundsException above size(); at size() reads 0.
    Char16& operator[](Uint32 index);
    const Char16 operator[](Uint32 index) const;

    String& append(const Char16& c);
    String& append(const Char16* str, Uint32 n);
    String& append(const String& str);
    // Throws: IndexOutOfBoundsException when index, or index and size, reach past the end.
    void remove(Uint32 index, Uint32 size = PEG_NOT_FOUND);
    String subString(Uint32 index, Uint32 n = PEG_NOT_FOUND) const;
    Uint32 find(Char16 c) const;
    Uint32 find(Uint32 index, Char16 c) const;
    Uint32 find(const String& s) const;
    Uint32 reverseFind(Char16 c) const;
    // ASCII letters only, as in the comparisons that ignore case.
    void toLower();
    void appendPrintf(const char* format, ...) PEGASUS_FORMAT(2, 3);

    static int compare(const String& s1, const String& s2);
    static int compare(const String& s1, const String& s2, Uint32 n);
    static int compareNoCase(const String& s1, const String& s2);
    static Boolean equal(const String& s1, const String& s2);
    static Boolean equalNoCase(const String& s1, const String& s2);

  private:
    friend struct StringAccess;

    RepPointer<StringRep> fRep;
};

PEGASUS_COMMON_LINKAGE Boolean operator==(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator==(const String& s1, const char* s2);
PEGASUS_COMMON_LINKAGE Boolean operator==(const char* s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator!=(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator<(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator<=(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator>(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE Boolean operator>=(const String& s1, const String& s2);
PEGASUS_COMMON_LINKAGE String operator+(const String& s1, const String& s2);

// The text as UTF-8. In OpenPegasus the encoding depends on how the library was built.
PEGASUS_COMMON_LINKAGE std::ostream& operator<<(std::ostream& os, const String& str);

PEGASUS_NAMESPACE_END
