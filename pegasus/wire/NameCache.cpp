// SPDX-License-Identifier: MIT
#include "pegasus/wire/NameCache.h"

#include "pegasus/base/Text.h"

namespace Pegasus::wire {
namespace {

// More than a message of one class uses. When they are used up, the cache begins again.
constexpr std::size_t kMaxNames = 1024;
// Longer names are converted each time.
constexpr std::size_t kMaxKeptBytes = 128;

} // namespace

const CIMName& NameCache::name(std::string_view utf8)
{
    if (utf8.size() > kMaxKeptBytes) {
        fLongName = base::fromUtf8(utf8);
        return fLongName;
    }
    const auto found = fNames.find(utf8);
    if (found != fNames.end()) {
        return found->second;
    }
    const CIMName name(base::fromUtf8(utf8));
    if (fNames.size() >= kMaxNames) {
        fNames.clear();
    }
    return fNames.emplace(utf8, name).first->second;
}

} // namespace Pegasus::wire
