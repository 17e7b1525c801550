// SPDX-License-Identifier: MIT
#include "pegasus/wire/instances/InstancePattern.h"

#include "pegasus/base/AsciiCase.h"
#include "pegasus/base/Text.h"

#include <string_view>
#include <unordered_map>
#include <unordered_set>

namespace Pegasus::wire {
namespace {

std::string foldedName(const CIMConstProperty& property)
{
    return base::foldCase(base::utf8(property.getName()));
}

} // namespace

std::size_t InstancePattern::bytes() const
{
    std::size_t sum = 0;
    for (const std::string& part : fHead) {
        sum += part.size();
    }
    for (const Property& property : fProperties) {
        sum += property.start.size();
    }
    return sum;
}

bool InstancePattern::add(const InstancePattern& other)
{
    std::unordered_map<std::string_view, std::size_t> places;
    std::unordered_set<std::string> names;
    for (std::size_t i = 0; i < fProperties.size(); ++i) {
        places.emplace(fProperties[i].start, i);
        names.insert(foldedName(fLayout->fProperties[i]));
    }
    InstancePattern merged;
    merged.fHead = fHead;
    const auto layout = std::make_shared<InstanceLayout>();
    layout->fClassName = fLayout->fClassName;
    layout->fKeys = fLayout->fKeys;
    const auto append = [&](const InstancePattern& from, std::size_t at) {
        merged.fProperties.push_back(from.fProperties[at]);
        layout->fProperties.push_back(from.fLayout->fProperties[at]);
    };
    std::size_t done = 0; // of our own properties
    for (std::size_t i = 0; i < other.fProperties.size(); ++i) {
        const auto place = places.find(other.fProperties[i].start);
        if (place == places.end()) {
            if (names.count(foldedName(other.fLayout->fProperties[i])) != 0) {
                return false; // the same property with another tag
            }
            append(other, i);
            continue;
        }
        if (place->second < done) {
            return false; // in another order
        }
        while (done <= place->second) {
            append(*this, done++);
        }
    }
    while (done < fProperties.size()) {
        append(*this, done++);
    }
    if (merged.fProperties.size() == fProperties.size()) {
        return true; // its instances go on sharing one layout
    }
    if (merged.bytes() > kMaxPatternBytes) {
        return false;
    }
    merged.fLayout = layout;
    *this = std::move(merged);
    return true;
}

} // namespace Pegasus::wire
