#include "pegasus/repository/QualifierStore.h"

#include "pegasus/repository/Failure.h"
#include "pegasus/repository/Names.h"

namespace Pegasus::repository {

namespace {

// A schema has a hundred declarations; beyond this many it is cheaper to start over than to choose.
constexpr std::size_t kMaxKnown = 4096;

std::string keyOf(NamespaceId nameSpace, const CIMName& name)
{
    return std::to_string(nameSpace) + ":" + folded(name);
}

} // namespace

CIMQualifierDecl QualifierStore::find(NamespaceId nameSpace, const CIMName& name)
{
    const std::string key = keyOf(nameSpace, name);
    const auto known = fKnown.find(key);
    if (known != fKnown.end()) {
        return known->second;
    }
    const std::optional<std::string> text = fStorage.findQualifier(nameSpace, utf8(name));
    if (!text) {
        return CIMQualifierDecl();
    }
    if (fKnown.size() >= kMaxKnown) {
        fKnown.clear();
    }
    return fKnown[key] = fTexts.toQualifier(*text);
}

std::vector<CIMQualifierDecl> QualifierStore::list(NamespaceId nameSpace)
{
    std::vector<CIMQualifierDecl> all;
    for (const std::string& text : fStorage.listQualifiers(nameSpace)) {
        all.push_back(fTexts.toQualifier(text));
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
    fStorage.putQualifier(nameSpace, utf8(name), fTexts.fromQualifier(declaration));
    fKnown.erase(keyOf(nameSpace, name));
}

void QualifierStore::remove(NamespaceId nameSpace, const CIMName& name)
{
    if (!fStorage.deleteQualifier(nameSpace, utf8(name))) {
        fail(CIM_ERR_NOT_FOUND, utf8(name));
    }
    fKnown.erase(keyOf(nameSpace, name));
}

QualifierLookup QualifierStore::lookupIn(NamespaceId nameSpace)
{
    return [this, nameSpace](const CIMName& name, CIMQualifierDecl& declaration) {
        declaration = find(nameSpace, name);
        return !declaration.isUninitialized();
    };
}

} // namespace Pegasus::repository
