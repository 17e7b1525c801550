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

TLoss LossOf(ELossKind kind, const std::string& sentence)
{
    TLoss loss;
    loss.fKind = kind;
    loss.fBegin = sentence;
    return loss;
}

TLoss LossOf(const std::string& sentence)
{
    return LossOf(ELossKind::kOther, sentence);
}

TLoss LossOf(const std::exception& failure)
{
    const auto* const known = dynamic_cast<const TFailure*>(&failure);
    return LossOf(known ? known->GetKind() : ELossKind::kOther, failure.what());
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
