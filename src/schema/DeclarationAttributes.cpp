// SPDX-License-Identifier: MIT
#include "src/schema/DeclarationAttributes.h"

#include <map>
#include <sstream>

namespace NKOLVRX20 {

namespace {

// The words arrive in upper case from CIMFlavor and CIMScope, whatever the MOF had. A word that the host lacks a bit
// for is skipped, so that a server of a later version can still be read.
template <typename TBits> TBits BitsFromText(const std::string& text, const std::map<std::string, TBits>& words)
{
    TBits bits = TBits(0);
    std::istringstream stream(text);
    for (std::string word; stream >> word;) {
        const auto known = words.find(word);
        if (known != words.end()) {
            bits = WithBits(bits, known->second);
        }
    }
    return bits;
}

} // namespace

ICIMQualifierDecl::EFlavor FlavorFromText(const std::string& text)
{
    using TDecl = ICIMQualifierDecl;
    return BitsFromText<TDecl::EFlavor>(text, {{"OVERRIDABLE", TDecl::kFlavorOverridable},
                                               {"TOSUBCLASS", TDecl::kFlavorToSubclass},
                                               {"TOINSTANCE", TDecl::kFlavorToInstance},
                                               {"TRANSLATABLE", TDecl::kFlavorTranslatable},
                                               {"DISABLEOVERRIDE", TDecl::kFlavorDisableOverride},
                                               {"RESTRICTED", TDecl::kFlavorRestricted}});
}

ICIMQualifierDecl::EScope ScopeFromText(const std::string& text)
{
    using TDecl = ICIMQualifierDecl;
    return BitsFromText<TDecl::EScope>(text, {{"CLASS", TDecl::kScopeClass},
                                              {"ASSOCIATION", TDecl::kScopeAssociation},
                                              {"INDICATION", TDecl::kScopeIndication},
                                              {"PROPERTY", TDecl::kScopeProperty},
                                              {"REFERENCE", TDecl::kScopeReference},
                                              {"METHOD", TDecl::kScopeMethod},
                                              {"PARAMETER", TDecl::kScopeParameter}});
}

} // namespace NKOLVRX20
