// SPDX-License-Identifier: MIT
#include "display/PropertyText.h"

#include "display/PlainText.h"
#include "display/TTextRules.h"

#include <host/ICIMPropertyDecl.h>

#include <optional>

namespace NKOLVRX20 {

namespace {

std::vector<std::string> Texts(const TCIMValue& value, const ICIMNamedElement* declaration)
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
        texts.push_back(rules && !element.IsNull() ? rules->Text(element) : PlainText(element));
    }
    return texts;
}

} // namespace

std::vector<std::string> PropertyTexts(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration)
{
    return Texts(value, declaration.get());
}

std::string PropertyText(const TCIMValue& value, const boost::shared_ptr<ICIMPropertyDecl>& declaration)
{
    return JoinTexts(PropertyTexts(value, declaration), ", ");
}

std::string ElementText(const TCIMValue& value, const ICIMNamedElement* declaration)
{
    return JoinTexts(Texts(value, declaration), ", ");
}

} // namespace NKOLVRX20
