// SPDX-License-Identifier: MIT
#include "pegasus/repository/QualifierStore.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

namespace {

// A schema has about a hundred declarations. Beyond this number the memory starts over: choosing which to drop would
// cost more than decoding them again.
constexpr std::size_t kMaxKnown = 4096;

std::string keyOf(NamespaceId nameSpace, const CIMName& name)
{
    return std::to_string(nameSpace) + ":" + nameKey(name);
}

} // namespace

CIMQualifierDecl QualifierStore::find(NamespaceId nameSpace, const CIMName& name)
{
    const std::string key = keyOf(nameSpace, name);
    const auto known = fKnown.find(key);
    if (known != fKnown.end()) {
        return known->second;
    }
    const std::optional<std::string> text = fStorage.findQualifier(nameSpace, base::utf8(name));
    if (!text) {
        return CIMQualifierDecl();
    }
    if (fKnown.size() >= kMaxKnown) {
        fKnown.clear();
    }
    return fKnown[key] = fCodec.decodeQualifier(*text);
}

std::vector<CIMQualifierDecl> QualifierStore::list(NamespaceId nameSpace)
{
    std::vector<CIMQualifierDecl> all;
    for (const std::string& text : fStorage.listQualifiers(nameSpace)) {
        all.push_back(fCodec.decodeQualifier(text));
    }
    return all;
}

void QualifierStore::set(NamespaceId nameSpace, const CIMConstQualifierDecl& declaration)
{
    const CIMName& name = declaration.getName();
    const CIMQualifierDecl existing = find(nameSpace, name);
    if (!existing.isUninitialized() &&
        (existing.getType() != declaration.getType() || existing.isArray() != declaration.isArray()))
    {
        return;
    }
    fStorage.putQualifier(nameSpace, base::utf8(name), fCodec.encodeQualifier(declaration));
    fKnown.erase(keyOf(nameSpace, name));
}

} // namespace Pegasus::repository
