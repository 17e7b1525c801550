// SPDX-License-Identifier: MIT
#include "src/schema/DeclarationAttributes.h"

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <string_view>

namespace NKOLVRX20 {

namespace {

using TDecl = ICIMQualifierDecl;

template <typename TBits> struct TWord
{
    std::string_view fText;
    TBits fBit;
};

// In upper case, as they arrive from CIMFlavor and CIMScope, whatever the MOF had.
constexpr TWord<TDecl::EFlavor> kFlavorWords[] = {
    {"OVERRIDABLE", TDecl::kFlavorOverridable},         {"TOSUBCLASS", TDecl::kFlavorToSubclass},
    {"TOINSTANCE", TDecl::kFlavorToInstance},           {"TRANSLATABLE", TDecl::kFlavorTranslatable},
    {"DISABLEOVERRIDE", TDecl::kFlavorDisableOverride}, {"RESTRICTED", TDecl::kFlavorRestricted},
};
constexpr TWord<TDecl::EScope> kScopeWords[] = {
    {"CLASS", TDecl::kScopeClass},           {"ASSOCIATION", TDecl::kScopeAssociation},
    {"INDICATION", TDecl::kScopeIndication}, {"PROPERTY", TDecl::kScopeProperty},
    {"REFERENCE", TDecl::kScopeReference},   {"METHOD", TDecl::kScopeMethod},
    {"PARAMETER", TDecl::kScopeParameter},
};

// A word that the host lacks a bit for is skipped, so that a server of a later version can still be read.
template <typename TBits, std::size_t kCount>
TBits BitsFromText(std::string_view text, const TWord<TBits> (&words)[kCount])
{
    TBits bits = TBits(0);
    while (!text.empty()) {
        const std::string_view word = text.substr(0, text.find(' '));
        const auto known = std::find_if(std::begin(words), std::end(words),
                                        [word](const TWord<TBits>& each) { return each.fText == word; });
        if (known != std::end(words)) {
            bits = WithBits(bits, known->fBit);
        }
        text.remove_prefix(std::min(word.size() + 1, text.size()));
    }
    return bits;
}

} // namespace

ICIMQualifierDecl::EFlavor FlavorFromText(const std::string& text)
{
    return BitsFromText(text, kFlavorWords);
}

ICIMQualifierDecl::EScope ScopeFromText(const std::string& text)
{
    return BitsFromText(text, kScopeWords);
}

} // namespace NKOLVRX20
