// SPDX-License-Identifier: MIT
#pragma once

#include <vector>

namespace servertest {

// An answer of ours that differs from the recorded one on purpose.
struct KnownDifference
{
    const char* name;
    const char* ours; // what stands in ours
    const char* reason;
};

const std::vector<KnownDifference>& differencesOfVendor();
const std::vector<KnownDifference>& differencesOfProbes();

} // namespace servertest
