#include "host/inmem/PropertyText.h"

#include "host/inmem/CharacterText.h"

#include <host/ICIMQualifier.h>

#include <charconv>
#include <climits>
#include <optional>

namespace NKOLVRX20 {
namespace {

typedef TCIMValue::TCIMType TType;

bool IsInteger(TType type)
{
    return type >= TType::kUint8 && type <= TType::kSint64;
}
bool IsReal(TType type)
{
    return type == TType::kReal32 || type == TType::kReal64;
}

TCIMValue QualifierValue(const ICIMPropertyDecl& declaration, const char* name)
{
    const auto qualifier = declaration.GetQualifier(name, TCIMContext());
    return qualifier ? qualifier->GetValue(TCIMContext()) : TCIMValue();
}

std::vector<std::string> QualifierTexts(const ICIMPropertyDecl& declaration, const char* name)
{
    std::vector<std::string> texts;
    const TCIMValue value = QualifierValue(declaration, name);
    if (value.IsArray()) {
        for (const TCIMValue& element : static_cast<const std::vector<TCIMValue>&>(value)) {
            texts.push_back(element.ToString(10));
        }
    }
    return texts;
}

std::string UnitText(const ICIMPropertyDecl& declaration)
{
    const std::string units = QualifierValue(declaration, "Units").ToString(10);
    return units.empty() ? QualifierValue(declaration, "PUnit").ToString(10) : units;
}

// A bound of a range; an empty one is open.
bool ParseBound(const std::string& text, std::optional<long>& bound)
{
    if (text.empty()) {
        return true;
    }
    long number = 0;
    const char* end = text.data() + text.size();
    const auto result = std::from_chars(text.data(), end, number);
    bound = number;
    return result.ec == std::errc() && result.ptr == end;
}

// "3..7", "..7", "3.." and ".." (everything that no other entry names).
bool IsInRange(const TCIMValue& value, const std::string& entry)
{
    const std::size_t dots = entry.find("..");
    if (dots == std::string::npos || !IsInteger(value.GetType())) {
        return false;
    }
    std::optional<long> low, high;
    if (!ParseBound(entry.substr(0, dots), low) || !ParseBound(entry.substr(dots + 2), high)) {
        return false;
    }
    // Maps with bounds beyond 63 bits do not occur.
    if (value.GetType() == TType::kUint64 && static_cast<unsigned long>(value) > static_cast<unsigned long>(LONG_MAX)) {
        return !high;
    }
    const long number = static_cast<long>(value);
    return (!low || number >= *low) && (!high || number <= *high);
}

// How a declaration turns one value into text; read from the qualifiers once for all elements.
class TTextRules
{
  public:
    explicit TTextRules(const ICIMPropertyDecl& declaration)
        : fValueMap(QualifierTexts(declaration, "ValueMap")), fValues(QualifierTexts(declaration, "Values")),
          fUnit(UnitText(declaration))
    {
    }

    std::string Text(const TCIMValue& value, const std::string& plain) const
    {
        const auto mapped = MapIndex(value, plain);
        if (mapped && *mapped < fValues.size()) {
            return fValues[*mapped];
        }
        const bool hasUnit = !fUnit.empty() && (IsInteger(value.GetType()) || IsReal(value.GetType()));
        return hasUnit ? plain + " " + fUnit : plain;
    }

  private:
    // Without a ValueMap an integer is itself the index. An entry for the very value goes before the ranges.
    std::optional<std::size_t> MapIndex(const TCIMValue& value, const std::string& plain) const
    {
        if (fValueMap.empty()) {
            return IsInteger(value.GetType()) ? std::optional<std::size_t>(static_cast<unsigned long>(value))
                                              : std::nullopt;
        }
        for (std::size_t i = 0; i < fValueMap.size(); ++i) {
            if (fValueMap[i] == plain) {
                return i;
            }
        }
        for (const bool catchAll : {false, true}) {
            for (std::size_t i = 0; i < fValueMap.size(); ++i) {
                if ((fValueMap[i] == "..") == catchAll && IsInRange(value, fValueMap[i])) {
                    return i;
                }
            }
        }
        return std::nullopt;
    }

    std::vector<std::string> fValueMap;
    std::vector<std::string> fValues;
    std::string fUnit;
};

std::string PlainText(const TCIMValue& value)
{
    if (value.IsNull()) {
        return "";
    }
    if (value.GetType() == TType::kDatetime) {
        return static_cast<TCIMDateTime>(value).ToUIString();
    }
    if (value.GetType() == TType::kChar16) {
        return CharacterText(static_cast<TCIMChar16>(value));
    }
    return value.ToString(10);
}

} // namespace

std::vector<std::string> PropertyTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration)
{
    if (value.IsNull()) {
        return {};
    }
    const auto elements =
        value.IsArray() ? static_cast<const std::vector<TCIMValue>&>(value) : std::vector<TCIMValue>{value};
    std::optional<TTextRules> rules;
    if (declaration) {
        rules.emplace(*declaration);
    }
    std::vector<std::string> texts;
    texts.reserve(elements.size());
    for (const TCIMValue& element : elements) {
        texts.push_back(rules && !element.IsNull() ? rules->Text(element, PlainText(element)) : PlainText(element));
    }
    return texts;
}

std::string PropertyText(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration)
{
    std::string joined;
    const auto texts = PropertyTexts(value, declaration);
    for (std::size_t i = 0; i < texts.size(); ++i) {
        joined += (i ? ", " : "") + texts[i];
    }
    return joined;
}

} // namespace NKOLVRX20
