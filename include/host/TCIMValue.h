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
// A default-constructed value is null and has no type. Copies are cheap and independent.
// Thread: distinct values may be used by distinct threads, also when one was copied from the other.
class TCIMValue
{
  public:
    // A type code: DMTF's intrinsic types in order from 1, an array is the element's code plus 16.
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
            kArrayOffset = 16, // also the array of no type
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
        // Returns: the scalar code; itself for a scalar.
        TCIMType GetElementType() const noexcept { return IsArray() ? ECIMType(fCode - kArrayOffset) : fCode; }
        // Returns: the DMTF name ("uint32"), without any array mark; "none" for no type. Static lifetime.
        const char* GetName() const noexcept;

      private:
        ECIMType fCode;
    };

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
    TCIMValue(const char* value); // a string; without it a literal would become a boolean
    TCIMValue(const TCIMChar16& value);
    TCIMValue(const TCIMDateTime& value);
    TCIMValue(const TCIMReference& value);

    // A typed null (scalar code) or an empty array (code 17-31). The count is reserved; pass 0.
    // Throws: TVRXException 14 for a code above 31.
    TCIMValue(TCIMType type, unsigned int count);

    // An array. The type is the element's scalar code (1-15); the count is reserved; pass 0.
    // Throws: TVRXException 14 when the code is no element code or an element is of another type.
    TCIMValue(TCIMType elementType, unsigned int count, const std::vector<TCIMValue>& elements);

    TCIMValue(const TCIMValue& other);
    TCIMValue(TCIMValue&& other) noexcept;
    TCIMValue& operator=(const TCIMValue& other);
    TCIMValue& operator=(TCIMValue&& other) noexcept;
    ~TCIMValue();

    // Numbers, booleans and char16 convert among each other as C++ does (integers wrap, reals truncate and
    // saturate). Throws: TVRXException 14 for a null, an array, or a kind that does not convert.
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

    // The elements. Throws: TVRXException 14 unless the value is an array.
    operator const std::vector<TCIMValue>&() const;
    operator std::vector<TCIMValue>&();

    // Returns: the scalar code; for an array the element's code (see IsArray).
    TCIMType GetType() const;
    bool IsArray() const;
    bool IsNull() const;

    // Reads the text as the value's own type (a value without type becomes a string) and makes it not null. Integers
    // and char16 codes are decimal; an array takes the empty text alone and becomes empty.
    // Throws: TVRXException 14 when the text is no such value; the value is then unchanged.
    void Set(const std::string& text);

    // Returns: integers in the radix (2 to 36); reals in %g form with just the digits that tell them apart; booleans
    // "true"/"false"; char16 its code in the radix; datetime its 25 characters; reference its path text; arrays their
    // elements joined by ", "; null the empty text. No locale has influence.
    // Throws: TVRXException 14 for another radix.
    std::string ToString(unsigned char radix) const;

    // The class that a reference value refers to.
    // Ownership: the value does not keep it alive; Get returns null when it is gone.
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
