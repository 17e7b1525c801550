// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace Pegasus::server {

// A set of Linux's capabilities: bit N is the capability N of <linux/capability.h>.
using CapabilitySet = std::uint64_t;

constexpr CapabilitySet kAllCapabilities = ~CapabilitySet{0};

// Reads "all", "none", or names as in capabilities(7), in small letters, without "cap_", separated by commas.
// A capability that this list does not have yet, on a newer kernel, is kept by "all" alone.
// Returns: nothing when a name is unknown. Thread: any.
std::optional<CapabilitySet> parseCapabilities(const std::string& list);

// Takes all other capabilities from this process, and from what it will start: the bounding set is cut down too, so
// that root's programs gain none of them back.
//
// A process of an ordinary user has no capabilities, and lacks the right to cut the bounding set down; it stays then.
// Requires: the process has one thread.
void keepCapabilities(CapabilitySet kept);

} // namespace Pegasus::server
