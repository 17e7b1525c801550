#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace Pegasus::server {

// A set of Linux's capabilities: bit N is the capability N of <linux/capability.h>.
using CapabilitySet = std::uint64_t;

constexpr CapabilitySet kAllCapabilities = ~CapabilitySet{0};

// Reads "all", "none", or names as in capabilities(7), in small letters, without "cap_", separated by commas.
// Returns: nothing when a name is unknown. Thread: any.
std::optional<CapabilitySet> parseCapabilities(const std::string& list);

} // namespace Pegasus::server
