// SPDX-License-Identifier: MIT
#include "pegasus/client/KnownClasses.h"

#include <algorithm>
#include <utility>

namespace Pegasus::client {
namespace {

constexpr std::size_t kMaxClasses = 8; // from a class up to its root; few hierarchies are deeper
constexpr std::size_t kMaxClassBytes = 512UL * 1024;

std::string textOf(const wire::XmlElement& element)
{
    std::string text(element.startTag());
    text.append(element.content()).append("</").append(element.name());
    return text += '>';
}

} // namespace

void KnownClasses::learn(const wire::XmlElement& element, const CIMClass& decoded, std::size_t bytes)
{
    if (element.content().empty() || element.content().size() > kMaxClassBytes) {
        return;
    }
    if (fClasses.size() == kMaxClasses) {
        fClasses.erase(fClasses.begin());
    }
    fClasses.push_back({textOf(element), decoded.clone(), bytes});
}

wire::XmlOffer KnownClasses::take(std::string_view text, CIMClass& decoded)
{
    // A hierarchy comes back in the other order.
    const auto known = std::find_if(fClasses.rbegin(), fClasses.rend(), [&](const Known& one) {
        return text.substr(0, one.text.size()) == std::string_view(one.text).substr(0, text.size());
    });
    if (known == fClasses.rend()) {
        return {};
    }
    const std::size_t size = known->text.size();
    if (text.size() < size) {
        return {wire::XmlOffer::Result::kCut, 0};
    }
    decoded = known->decoded;
    fBytes = known->bytes;
    fClasses.erase(std::next(known).base());
    return {wire::XmlOffer::Result::kTaken, size};
}

} // namespace Pegasus::client
