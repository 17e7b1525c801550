// SPDX-License-Identifier: MIT
#include "host/cli/model/Document.h"

#include "host/cli/model/Names.h"

#include <algorithm>
#include <fstream>

namespace vrxhost {
namespace {

template <typename Record> const Record* FindByName(const std::vector<Record>& records, const std::string& name)
{
    const auto found = std::find_if(records.begin(), records.end(),
                                    [&name](const Record& record) { return IsSame(record.fName, name); });
    return found == records.end() ? nullptr : &*found;
}

} // namespace

const TPropertyRecord* TInstanceRecord::Find(const std::string& name) const
{
    return FindByName(fProperties, name);
}

std::string TInstanceRecord::TextOf(const std::vector<std::string>& names) const
{
    for (const std::string& name : names) {
        const TPropertyRecord* const property = Find(name);
        if (property && !property->fText.empty()) {
            return property->fText;
        }
    }
    return "";
}

const TPropertyDeclRecord* TClassRecord::Find(const std::string& name) const
{
    return FindByName(fProperties, name);
}

bool TClassRecord::IsA(const std::string& className) const
{
    const auto isSame = [&className](const std::string& ancestor) { return IsSame(ancestor, className); };
    return isSame(fName) || std::any_of(fAncestors.begin(), fAncestors.end(), isSame);
}

TDocumentHead MakeHead(const std::string& command)
{
    TDocumentHead head{command, ReadHostFacts(), "", TimeNow(), ""};
    std::ifstream id("/proc/sys/kernel/random/uuid");
    std::getline(id, head.fRunId);
    return head;
}

} // namespace vrxhost
