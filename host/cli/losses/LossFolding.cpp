// SPDX-License-Identifier: MIT
#include "host/cli/losses/TLossLog.h"

#include <algorithm>

namespace vrxhost {
namespace {

void AddName(std::vector<std::string>& names, const std::string& name)
{
    if (std::find(names.begin(), names.end(), name) == names.end()) {
        names.push_back(name);
    }
}

void AddNames(std::vector<std::string>& names, const std::vector<std::string>& more)
{
    for (const std::string& name : more) {
        AddName(names, name);
    }
}

void NameVendor(TLoss& loss, const TVendorFiles& vendors)
{
    const TClassList* list = loss.fClasses.empty() ? nullptr : vendors.FindClass(loss.fClasses.front());
    if (list && loss.fVendor.empty()) {
        loss.fVendor = list->fVendor;
        loss.fFile = list->fPath;
    }
    if (!list || list->fVendor != loss.fVendor) {
        list = vendors.FindOnlyList(loss.fVendor);
    }
    if (list) {
        loss.fProvider = list->fModule;
    }
}

TLoss* FindCause(std::vector<TLoss>& folded, const TLoss& loss)
{
    const auto found = std::find_if(folded.begin(), folded.end(), [&loss](const TLoss& earlier) {
        return earlier.fIsCause && loss.fIsConsequence && !loss.fVendor.empty() && earlier.fVendor == loss.fVendor;
    });
    return found == folded.end() ? nullptr : &*found;
}

TLoss* FindSameCause(std::vector<TLoss>& folded, const TLoss& loss)
{
    const auto found = std::find_if(folded.begin(), folded.end(), [&loss](const TLoss& earlier) {
        return earlier.fBegin == loss.fBegin && earlier.fEnd == loss.fEnd && earlier.fVendor == loss.fVendor &&
               earlier.fFile == loss.fFile && earlier.fObjects.empty() == loss.fObjects.empty();
    });
    return found == folded.end() ? nullptr : &*found;
}

} // namespace

std::vector<TLoss> FoldLosses(const std::vector<TLoss>& losses, const TVendorFiles& vendors)
{
    std::vector<TLoss> folded;
    for (TLoss loss : losses) {
        NameVendor(loss, vendors);
        if (TLoss* const cause = FindCause(folded, loss)) {
            AddNames(cause->fClasses, loss.fClasses);
        } else if (TLoss* const same = FindSameCause(folded, loss)) {
            AddNames(same->fObjects, loss.fObjects);
            AddNames(same->fClasses, loss.fClasses);
        } else {
            folded.push_back(std::move(loss));
        }
    }
    return folded;
}

} // namespace vrxhost
