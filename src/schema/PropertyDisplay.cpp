#include "src/schema/PropertyDisplay.h"

#include <host/ICIMPropertyDecl.h>
#include <host/ICIMQualifier.h>

#include <algorithm>
#include <limits>
#include <optional>

namespace NKOLVRX20 {

namespace {

typedef TCIMValue::TCIMType TType;
typedef std::vector<std::string> TTexts;
typedef __int128 TWide; // holds every CIM integer, signed or not

constexpr unsigned char kDecimal = 10;
constexpr char kRangeMark[] = "..";
constexpr unsigned long kBitCount = 64;

bool IsInteger(const TCIMValue& value)
{
    return value.GetType() >= TType::kUint8 && value.GetType() <= TType::kSint64;
}

bool IsNumber(const TCIMValue& value)
{
    return value.GetType() >= TType::kUint8 && value.GetType() <= TType::kReal64;
}

TWide WideValue(const TCIMValue& integer)
{
    if (integer.GetType() == TType::kUint64) {
        return static_cast<unsigned long>(integer);
    }
    return static_cast<long>(integer);
}

// Returns: nothing when the text is no integer of at most 64 bits.
std::optional<TWide> ParseInteger(const std::string& text)
{
    const bool isNegative = !text.empty() && text.front() == '-';
    const std::string digits = isNegative ? text.substr(1) : text;
    if (digits.empty() || digits.size() > 20 || digits.find_first_not_of("0123456789") != std::string::npos) {
        return std::nullopt;
    }
    TWide number = 0;
    for (const char digit : digits) {
        number = number * 10 + (digit - '0');
    }
    return isNegative ? -number : number;
}

// Returns: the bound, or the fallback where the range is open.
std::optional<TWide> ParseBound(const std::string& text, TWide fallback)
{
    return text.empty() ? fallback : ParseInteger(text);
}

// "3..7", "..7", "3..", "..", or one number.
bool EntryCovers(const std::string& entry, TWide number)
{
    const auto mark = entry.find(kRangeMark);
    if (mark == std::string::npos) {
        return ParseInteger(entry) == number;
    }
    const auto low = ParseBound(entry.substr(0, mark), std::numeric_limits<long>::min());
    const auto high = ParseBound(entry.substr(mark + 2), std::numeric_limits<unsigned long>::max());
    return low && high && number >= *low && number <= *high;
}

// Lower is nearer: a single value, a range, all the rest.
int EntryRank(const std::string& entry)
{
    if (entry.find(kRangeMark) == std::string::npos) {
        return 0;
    }
    return entry == kRangeMark ? 2 : 1;
}

TCIMValue QualifierValue(const ICIMPropertyDecl& declaration, const char* name)
{
    const auto qualifier = declaration.GetQualifier(name, {});
    return qualifier ? qualifier->GetValue({}) : TCIMValue();
}

TTexts QualifierTexts(const ICIMPropertyDecl& declaration, const char* name)
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

std::string UnitText(const ICIMPropertyDecl& declaration)
{
    const std::string units = QualifierValue(declaration, "UNITS").ToString(kDecimal);
    return units.empty() ? QualifierValue(declaration, "PUNIT").ToString(kDecimal) : units;
}

std::string PlainText(const TCIMValue& value)
{
    if (value.GetType() == TType::kDatetime && !value.IsNull()) {
        return static_cast<TCIMDateTime>(value).ToUIString();
    }
    return value.ToString(kDecimal);
}

// What a declaration says about texts, read once for all elements.
class TDisplayRules
{
  public:
    explicit TDisplayRules(const ICIMPropertyDecl& declaration)
        : fValueMap(QualifierTexts(declaration, "VALUEMAP")), fValues(QualifierTexts(declaration, "VALUES")),
          fBitMap(QualifierTexts(declaration, "BITMAP")), fBitValues(QualifierTexts(declaration, "BITVALUES")),
          fUnit(UnitText(declaration))
    {
    }

    std::string Text(const TCIMValue& value) const
    {
        const auto place = Place(value);
        if (place && *place < fValues.size()) {
            return fValues[*place];
        }
        std::string bits = IsInteger(value) ? BitText(value) : "";
        if (!bits.empty()) {
            return bits;
        }
        return fUnit.empty() || !IsNumber(value) ? PlainText(value) : PlainText(value) + " " + fUnit;
    }

  private:
    // Returns: where in Values the text stands.
    std::optional<std::size_t> Place(const TCIMValue& value) const
    {
        if (IsInteger(value)) {
            return fValueMap.empty() ? PlaceByNumber(WideValue(value)) : PlaceInMap(WideValue(value));
        }
        const auto entry = std::find(fValueMap.begin(), fValueMap.end(), value.ToString(kDecimal));
        const bool isThere = value.GetType() == TType::kString && entry != fValueMap.end();
        return isThere ? std::make_optional<std::size_t>(entry - fValueMap.begin()) : std::nullopt;
    }

    static std::optional<std::size_t> PlaceByNumber(TWide number)
    {
        return number < 0 ? std::nullopt : std::make_optional(static_cast<std::size_t>(number));
    }

    std::optional<std::size_t> PlaceInMap(TWide number) const
    {
        std::optional<std::size_t> nearest;
        for (std::size_t i = 0; i < fValueMap.size(); ++i) {
            const bool isNearer = !nearest || EntryRank(fValueMap[i]) < EntryRank(fValueMap[*nearest]);
            if (isNearer && EntryCovers(fValueMap[i], number)) {
                nearest = i;
            }
        }
        return nearest;
    }

    // Without a BitMap the texts count from bit 0.
    bool IsBitSet(std::size_t place, unsigned long value) const
    {
        const auto bit = place < fBitMap.size() ? ParseInteger(fBitMap[place]) : PlaceAsBit(place);
        return bit && *bit >= 0 && *bit < TWide(kBitCount) && ((value >> static_cast<unsigned long>(*bit)) & 1) != 0;
    }

    std::optional<TWide> PlaceAsBit(std::size_t place) const
    {
        return fBitMap.empty() ? std::make_optional<TWide>(place) : std::nullopt;
    }

    std::string BitText(const TCIMValue& value) const
    {
        std::string text;
        for (std::size_t i = 0; i < fBitValues.size(); ++i) {
            if (IsBitSet(i, static_cast<unsigned long>(value))) {
                text += (text.empty() ? "" : " | ") + fBitValues[i];
            }
        }
        return text;
    }

    const TTexts fValueMap;
    const TTexts fValues;
    const TTexts fBitMap;
    const TTexts fBitValues;
    const std::string fUnit;
};

} // namespace

std::vector<std::string> DisplayTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration)
{
    if (value.IsNull()) {
        return {};
    }
    const auto elements =
        value.IsArray() ? static_cast<const std::vector<TCIMValue>&>(value) : std::vector<TCIMValue>{value};
    std::optional<TDisplayRules> rules;
    if (declaration) {
        rules.emplace(*declaration);
    }
    std::vector<std::string> texts;
    texts.reserve(elements.size());
    for (const TCIMValue& element : elements) {
        texts.push_back(rules && !element.IsNull() ? rules->Text(element) : PlainText(element));
    }
    return texts;
}

std::string JoinDisplayTexts(const std::vector<std::string>& texts)
{
    std::string joined;
    for (std::size_t i = 0; i < texts.size(); ++i) {
        joined += (i == 0 ? "" : ", ") + texts[i];
    }
    return joined;
}

} // namespace NKOLVRX20
