// SPDX-License-Identifier: MIT
// The forms of a comparison.
#pragma once

#include "host/cli/formats/JsonValues.h"

namespace vrxhost {

// Returns: a heading for each class, then what was added, removed and changed, and what is unknown.
std::string DifferenceLines(const TComparison& comparison, const TFormatOptions& options);

// Returns: "added", "removed", "changed" or "unknown".
const char* NameOf(EDifference kind);

TJson JsonDifference(const TDifference& difference);
TJson JsonComparison(const TComparison& comparison);

} // namespace vrxhost
