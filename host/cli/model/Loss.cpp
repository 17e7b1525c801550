// SPDX-License-Identifier: MIT
#include "host/cli/model/Loss.h"

namespace vrxhost {

std::string JoinNames(const std::vector<std::string>& names)
{
    std::string joined;
    for (const std::string& name : names) {
        joined += (joined.empty() ? "" : ", ") + name;
    }
    return joined;
}

TLoss LossOf(const std::string& sentence)
{
    TLoss loss;
    loss.fBegin = sentence;
    return loss;
}

std::string TLoss::GetText() const
{
    if (fIsCause) {
        const std::string missing = fClasses.empty() ? "" : "; missing as a consequence: " + JoinNames(fClasses);
        return fBegin + JoinNames(fObjects) + fEnd + missing;
    }
    const std::string where = fFile.empty() ? "" : ", " + fFile;
    return (fVendor.empty() ? "" : "vendor " + fVendor + where + ": ") + fBegin + JoinNames(fObjects) + fEnd;
}

} // namespace vrxhost
