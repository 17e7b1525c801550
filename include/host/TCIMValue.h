// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/TCIMChar16.h>
#include <host/TCIMDateTime.h>
#include <host/TCIMReference.h>

#include <boost/shared_ptr.hpp>

#include <string>
#include <vector>

namespace NKOLVRX20 {

// The host's variant: one CIM value, scalar or array, possibly null.
//
// A default-constructed value is an untyped null. Copies are cheap and independent. The C++ type of a value decides its
// CIM type, so that a context entry needs the exact one: TCIMValue(7) is a kSint32, and TCIMValue(static_cast<signed
// char>(7)) the kSint8 that "pluginType" wants. An implementer of this class keeps the type codes, which a plug-in
// computes with (Pegasus code plus 1, arrays plus 17), and the text form of references and datetimes: a plug-in hands
// that text to the CIM client library.
// Ownership: a value owns its text and elements; it refers to a namespace (in a reference) and to a referenced class
// weakly.
// Thread: distinct values may be used by distinct threads, also when one was copied from the other.
class TCIMValue
{
  public:
    // A type code: DMTF's intrinsic types in order from 1; the code of an array is the element's code plus 16.
    // Declarations give array codes (ICIMPropertyDecl::GetType); a value gives its element's code and IsArray.
    class TCIMType
    {
      public:
        enum ECIMType : unsigned int
        {
            kNone = 0,
            kBoolean = 1,
            kUint8 = 2,
            kSint8 = 3,
            kUint16 = 4,
            kSint16 = 5,
            kUint32 = 6,
            kSint32 = 7,
            kUint64 = 8,
            kSint64 = 9,
            kReal32 = 10,
            kReal64 = 11,
            kChar16 = 12,
            kString = 13,
            kDatetime = 14,
            kReference = 15,
            kArrayOffset = 16, // also the array of kNone
            kBooleanArray = 17,
            kUint8Array = 18,
            kSint8Array = 19,
            kUint16Array = 20,
            kSint16Array = 21,
            kUint32Array = 22,
            kSint32Array = 23,
            kUint64Array = 24,
            kSint64Array = 25,
            kReal32Array = 26,
            kReal64Array = 27,
            kChar16Array = 28,
            kStringArray = 29,
            kDatetimeArray = 30,
            kReferenceArray = 31
        };

        TCIMType(ECIMType code = kNone) noexcept : fCode(code) {} // implicit by design
        operator ECIMType() const noexcept { return fCode; }

        bool IsArray() const noexcept { return fCode >= kArrayOffset; }
        // Returns: the element's code; the code itself for a scalar.
        TCIMType GetElementType() const noexcept { return IsArray() ? ECIMType(fCode - kArrayOffset) : fCode; }
        // Returns: the DMTF name of the element ("uint32"); "none" for kNone. Static lifetime.
        const char* GetName() const noexcept;

      private:
        ECIMType fCode;
    };

    // One constructor a C++ type, implicit by design. unsigned long and long are the 64-bit types.
    TCIMValue();
    TCIMValue(bool value);
    TCIMValue(unsigned char value);
    TCIMValue(signed char value);
    TCIMValue(unsigned short value);
    TCIMValue(short value);
    TCIMValue(unsigned int value);
    TCIMValue(int value);
    TCIMValue(unsigned long value);
    TCIMValue(long value);
    TCIMValue(float value);
    TCIMValue(double value);
    TCIMValue(const std::string& value);
    TCIMValue(const char* value); // a string; a literal would become a boolean otherwise
    TCIMValue(const TCIMChar16& value);
    TCIMValue(const TCIMDateTime& value);
    TCIMValue(const TCIMReference& value);

    // A typed null (scalar code), or an empty array (code 17 to 31), whose IsNull is false. The count is reserved; pass
    // 0.
    // Throws: TVRXException 14 for a code above 31.
    TCIMValue(TCIMType type, unsigned int count);

    // An array. The type is the element's scalar code (1 to 15); the count is reserved; pass 0.
    // Throws: TVRXException 14 when the code is not an element code or an element is of another type.
    TCIMValue(TCIMType elementType, unsigned int count, const std::vector<TCIMValue>& elements);

    TCIMValue(const TCIMValue& other);
    TCIMValue(TCIMValue&& other) noexcept;
    TCIMValue& operator=(const TCIMValue& other);
    TCIMValue& operator=(TCIMValue&& other) noexcept;
    ~TCIMValue();

    // Numbers, booleans and char16 convert among each other as C++ does (integers wrap, reals truncate and saturate).
    // Throws: TVRXException 14 for a null, an array, or a kind that does not convert.
    operator bool() const;
    operator unsigned char() const;
    operator signed char() const;
    operator unsigned short() const;
    operator short() const;
    operator unsigned int() const;
    operator int() const;
    operator unsigned long() const;
    operator long() const;
    operator float() const;
    operator double() const;

    // Throws: TVRXException 14 unless the value is of this very type and not null.
    operator std::string() const;
    operator TCIMChar16() const;
    operator TCIMDateTime() const;
    operator TCIMReference() const;

    // The elements, by reference: valid until the value is changed or destroyed. A change through the second form
    // leaves copies as they are.
    // Throws: TVRXException 14 unless the value is an array.
    operator const std::vector<TCIMValue>&() const;
    operator std::vector<TCIMValue>&();

    // Returns: the scalar code; for an array the element's code (see IsArray).
    TCIMType GetType() const;
    bool IsArray() const;
    bool IsNull() const;

    // Reads the text as the value's own type (an untyped null becomes a string); the value is then set. Integers
    // and char16 codes are decimal; an array takes the empty text alone and becomes empty.
    // Throws: TVRXException 14 when the text does not name such a value; the value is then unchanged.
    void Set(const std::string& text);

    // Returns: integers in the radix (2 to 36); reals in %g form with just the digits that tell them apart; booleans
    // "true"/"false"; char16 its code in the radix; datetime its 25 characters; reference its path text; arrays their
    // elements joined by ", "; null the empty text. Every locale gives the same text.
    // Throws: TVRXException 14 for another radix.
    std::string ToString(unsigned char radix) const;

    // The class that a reference value refers to.
    // Here: set on a key reference whose class could be fetched; null on other references, whose class name
    // TCIMReference::GetClassName reads out of the path.
    // Ownership: the value holds it weakly; Get returns null when it is gone.
    boost::shared_ptr<ICIMClass> GetReferencedClass() const;
    void SetReferencedClass(const boost::shared_ptr<ICIMClass>& referencedClass);

    // Same type, same array flag, both null or equal values; not-a-number equals itself.
    bool operator==(const TCIMValue& other) const;
    bool operator!=(const TCIMValue& other) const { return !(*this == other); }
    // A total order: by type code, nulls first, then by value (arrays lexicographically).
    bool operator<(const TCIMValue& other) const;

  private:
    struct TRep;
    boost::shared_ptr<TRep> fRep; // null for the untyped null; copied on write
};

} // namespace NKOLVRX20
