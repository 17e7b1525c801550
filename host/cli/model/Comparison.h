// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <string>
#include <vector>

namespace vrxhost {

// One of the two that are compared. The references outlive the call.
struct TSide
{
    std::string fName; // in sentences
    const std::vector<TProviderRecord>& fProviders;
    const std::vector<TLoss>& fLosses;
};

// Compares two machines by class, path and property; properties that differ from run to run (qualified Counter, Gauge
// or Volatile) are left out, and null equals absent. What is missing on one side counts as added or removed only when
// that side's losses leave no doubt: a loss that names a class makes that class uncertain, one that names none makes
// the whole side uncertain. Of an uncertain class there is one difference kUnknown in place of those.
TComparison Compare(const TSide& from, const TSide& to);

} // namespace vrxhost
