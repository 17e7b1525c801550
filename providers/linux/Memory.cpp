// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

namespace lnx {
namespace {

constexpr std::uint64_t kKilobyte = 1024;

class MemoryInfo
{
  public:
    explicit MemoryInfo(const std::string& text) : fFields(fields(text, ':')) {}

    std::optional<std::uint64_t> bytes(const char* name) const
    {
        const auto text = field(fFields, name);
        const auto kilobytes = text ? toNatural(words(*text).front()) : std::nullopt;
        return kilobytes ? std::optional<std::uint64_t>(*kilobytes * kKilobyte) : std::nullopt;
    }

  private:
    Fields fFields;
};

std::optional<std::uint64_t> blocks(const std::optional<std::uint64_t>& bytes)
{
    return bytes ? std::optional<std::uint64_t>(*bytes / kKilobyte) : std::nullopt;
}

void describeUse(const MemoryInfo& info, Record& record)
{
    const auto total = info.bytes("MemTotal");
    const auto available = info.bytes("MemAvailable");
    record.set("BlockSize", kKilobyte);
    record.set("NumberOfBlocks", blocks(total));
    record.set("ConsumableBlocks", blocks(available));
    record.set("TotalBytes", total);
    record.set("FreeBytes", info.bytes("MemFree"));
    record.set("AvailableBytes", available);
    record.set("CachedBytes", info.bytes("Cached"));
    if (total && available && *total > 0 && *available <= *total) {
        record.set("UsedPercentage", static_cast<std::uint8_t>((*total - *available) * 100 / *total));
    }
    const auto limit = info.bytes("CommitLimit");
    const auto committed = info.bytes("Committed_AS");
    if (limit && committed) {
        record.set("CommitHeadroom", static_cast<std::int64_t>(*limit) - static_cast<std::int64_t>(*committed));
    }
}

} // namespace

std::vector<Record> memories(const SystemTree& tree)
{
    const auto text = tree.word("/proc/meminfo");
    if (!text) {
        return {};
    }
    Record record = device(tree, "LNX_Memory", "Memory");
    record.set("Name", std::string("Memory"));
    record.set("ElementName", std::string("Memory"));
    record.set("EnabledState", std::uint16_t{2}); // Enabled
    record.set("Access", std::uint16_t{3});       // Read/Write Supported
    record.set("Volatile", true);
    describeUse(MemoryInfo(*text), record);
    return {record};
}

} // namespace lnx
