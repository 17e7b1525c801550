#include "pegasus/wire/NameCache.h"

#include "pegasus/base/Text.h"

#include <cstdint>

namespace Pegasus::wire {
namespace {

// More than a message of one class uses; a power of two.
constexpr std::size_t kSlots = 1024;
// Longer names are converted each time.
constexpr std::size_t kMaxKeptBytes = 128;

std::size_t hashOf(std::string_view text)
{
    std::uint32_t hash = 2166136261u;
    for (const char c : text) {
        hash = (hash ^ static_cast<unsigned char>(c)) * 16777619u;
    }
    return hash ^ (hash >> 15);
}

} // namespace

struct NameCache::Entry
{
    std::string utf8;
    CIMName name;
};

NameCache::NameCache() = default;
NameCache::~NameCache() = default;

const CIMName& NameCache::name(std::string_view utf8)
{
    if (utf8.size() > kMaxKeptBytes) {
        fLongName = base::fromUtf8(utf8);
        return fLongName;
    }
    if (fEntries.empty()) {
        fEntries.resize(kSlots);
    }
    Entry& entry = fEntries[hashOf(utf8) % kSlots];
    if (entry.utf8 != utf8 || entry.name.isNull()) {
        const CIMName name(base::fromUtf8(utf8));
        entry.utf8 = utf8;
        entry.name = name;
    }
    return entry.name;
}

} // namespace Pegasus::wire
