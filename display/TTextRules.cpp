// SPDX-License-Identifier: MIT
#include "display/TTextRules.h"

#include "display/PlainText.h"

#include <host/ICIMNamedElement.h>
#include <host/ICIMQualifier.h>

#include <algorithm>
#include <charconv>
#include <optional>

namespace NKOLVRX20 {
namespace {

using TType = TCIMValue::TCIMType;
using TTexts = std::vector<std::string>;

constexpr unsigned char kDecimal = 10;
constexpr unsigned int kBitCount = 64; // of the widest integer

bool IsInteger(const TCIMValue& value)
{
    return value.GetType() >= TType::kUint8 && value.GetType() <= TType::kSint64;
}

bool IsText(const TCIMValue& value)
{
    return value.GetType() == TType::kString || value.GetType() == TType::kChar16;
}

TWideInteger WideValue(const TCIMValue& integer)
{
    if (integer.GetType() == TType::kUint64) {
        return static_cast<unsigned long>(integer);
    }
    return static_cast<long>(integer);
}

// Returns: the bits in the integer's own width: a sint8 of -1 has eight, where sign extension would make 64.
unsigned long BitsOf(const TCIMValue& integer)
{
    switch (integer.GetType()) {
    case TType::kSint8:
        return static_cast<unsigned char>(integer);
    case TType::kSint16:
        return static_cast<unsigned short>(integer);
    case TType::kSint32:
        return static_cast<unsigned int>(integer);
    default:
        return static_cast<unsigned long>(integer);
    }
}

std::string HexText(unsigned long number)
{
    char digits[2 * sizeof number];
    const auto end = std::to_chars(std::begin(digits), std::end(digits), number, 16);
    return "0x" + std::string(digits, end.ptr);
}

TCIMValue QualifierValue(const ICIMNamedElement& declaration, const char* name)
{
    const auto qualifier = declaration.GetQualifier(name, {});
    return qualifier ? qualifier->GetValue({}) : TCIMValue();
}

TTexts QualifierTexts(const ICIMNamedElement& declaration, const char* name)
{
    TTexts texts;
    const TCIMValue value = QualifierValue(declaration, name);
    if (value.IsArray()) {
        for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
            texts.push_back(element.ToString(kDecimal));
        }
    }
    return texts;
}

// Units is deprecated in favour of PUnit (DSP0004, 5.6.3), but reads better.
std::string UnitText(const ICIMNamedElement& declaration)
{
    const std::string units = QualifierValue(declaration, "Units").ToString(kDecimal);
    return units.empty() ? QualifierValue(declaration, "PUnit").ToString(kDecimal) : units;
}

std::optional<std::size_t> IndexIn(const TValueMap& valueMap, const TCIMValue& value)
{
    if (IsInteger(value)) {
        return valueMap.Find(WideValue(value));
    }
    return IsText(value) ? valueMap.Find(PlainText(value)) : std::nullopt;
}

// An entry that is a range may cover several of the bits.
void AddOnce(TTexts& texts, const std::string& text)
{
    if (std::find(texts.begin(), texts.end(), text) == texts.end()) {
        texts.push_back(text);
    }
}

} // namespace

TTextRules::TTextRules(const ICIMNamedElement& declaration)
    : fValueMap(QualifierTexts(declaration, "ValueMap")), fValues(QualifierTexts(declaration, "Values")),
      fBitMap(QualifierTexts(declaration, "BitMap")), fBitValues(QualifierTexts(declaration, "BitValues")),
      fUnit(UnitText(declaration))
{
}

std::string TTextRules::Text(const TCIMValue& value) const
{
    // ValueMap may have more entries than Values has texts; such a value has no text of its own.
    const auto index = IndexIn(fValueMap, value);
    if (index && *index < fValues.size()) {
        return fValues[*index];
    }
    std::string bits = IsInteger(value) ? BitText(BitsOf(value)) : "";
    if (!bits.empty()) {
        return bits;
    }
    return fUnit.empty() || !IsNumber(value) ? PlainText(value) : PlainText(value) + " " + fUnit;
}

std::string TTextRules::BitText(unsigned long bits) const
{
    TTexts texts;
    unsigned long rest = bits;
    for (unsigned int bit = 0; bit < kBitCount; ++bit) {
        const unsigned long mask = 1UL << bit;
        const auto index = (bits & mask) != 0 ? fBitMap.Find(TWideInteger(bit)) : std::nullopt;
        if (index && *index < fBitValues.size()) {
            AddOnce(texts, fBitValues[*index]);
            rest &= ~mask;
        }
    }
    if (!texts.empty() && rest != 0) {
        texts.push_back(HexText(rest));
    }
    return JoinTexts(texts, " | ");
}

} // namespace NKOLVRX20
