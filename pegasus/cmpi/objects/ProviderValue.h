// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMValue.h>
#include <cmpi/cmpi.h>

#include <string>

namespace Pegasus::cmpi {

// A value of a property or a key. Integers, booleans and texts are kept as the provider passed them: most are written
// for the client and read by nobody else, so a CIMValue is made for those who ask for one.
class ProviderValue
{
  public:
    // Not set.
    ProviderValue() = default;
    explicit ProviderValue(CIMValue value);

    // Copies what a provider passes as (value, type) if it is of the type `wanted` and can be kept as it is.
    // Returns: false for any other value, which decodeValue() reads; this one stays as it was.
    // Throws: with strict providers CMPI_RC_ERR_FAILED for a text that is not UTF-8.
    bool take(const CMPIValue* value, CMPIType type, CIMType wanted);

    // Makes it one that is not set; the memory of a short text stays for the next.
    void reset() noexcept;

    bool isSet() const { return fForm != Form::kUnset; }
    // Whether appendText() can write it.
    bool isPlain() const { return fForm == Form::kInteger || fForm == Form::kText; }
    bool isNull() const { return !isPlain() && fObject.isNull(); }
    CIMType type() const { return isPlain() ? fType : fObject.getType(); }
    // Returns: a null of no particular type when it is not set.
    CIMValue value() const;

    // Appends the value as the text of a VALUE or KEYVALUE element. Requires: isPlain().
    void appendText(std::string& out) const;

  private:
    enum class Form : unsigned char
    {
        kUnset,
        kInteger, // or a boolean: in fBits, extended by its sign
        kText,    // UTF-8, in fText
        kObject   // anything else, nulls too: in fObject
    };

    bool takeInteger(Uint64 bits, CIMType type, CIMType wanted);
    template <typename T> bool takeInteger(const CMPIValue* value, CIMType wanted);
    bool takeText(const char* text, CIMType wanted);

    Form fForm = Form::kUnset;
    bool fNeedsEscapes = false;
    CIMType fType = CIMTYPE_BOOLEAN; // of an integer or a text
    Uint64 fBits = 0;
    std::string fText;
    CIMValue fObject;
};

} // namespace Pegasus::cmpi
