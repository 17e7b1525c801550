// SPDX-License-Identifier: MIT
#include "pegasus/repository/ClassStore.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

ClassStore::ClassStore(Storage& storage, ObjectCodec& codec, const RepositoryLimits& limits)
    : fStorage(storage), fCodec(codec), fLimits(limits), fCache(limits.cachedClassCount)
{
}

// Resolves from the root class down, and keeps every class on the way. The recursion is bounded: superClassFor() limits
// the depth.
CIMClass ClassStore::resolved(NamespaceId nameSpace, const CIMName& name)
{
    const std::string key = nameKey(name);
    CIMClass cached = fCache.find(nameSpace, key);
    if (!cached.isUninitialized()) {
        return cached;
    }
    const std::optional<std::string> text = fStorage.findClass(nameSpace, key);
    if (!text) {
        return CIMClass();
    }
    const CIMClass local = withEmbeddedTypes(fCodec.decodeClass(*text));
    const CIMName& superName = local.getSuperClassName();
    CIMClass whole = resolveClass(local, superName.isNull() ? CIMClass() : resolved(nameSpace, superName));
    fCache.insert(nameSpace, key, whole);
    return whole;
}

CIMClass ClassStore::existing(NamespaceId nameSpace, const CIMName& name)
{
    CIMClass whole = resolved(nameSpace, name);
    if (whole.isUninitialized()) {
        fail(CIM_ERR_NOT_FOUND, base::utf8(name));
    }
    return whole;
}

std::shared_ptr<const std::string> ClassStore::findText(NamespaceId nameSpace, const CIMName& name,
                                                        const ClassOptions& options)
{
    return fCache.findText(nameSpace, nameKey(name), options);
}

void ClassStore::keepText(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options,
                          const std::shared_ptr<const std::string>& text)
{
    fCache.keepText(nameSpace, nameKey(name), options, text);
}

bool ClassStore::has(NamespaceId nameSpace, const CIMName& name)
{
    return fStorage.findSuperClass(nameSpace, base::utf8(name)).has_value();
}

std::vector<CIMName> ClassStore::listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep)
{
    if (!name.isNull() && !has(nameSpace, name)) {
        fail(CIM_ERR_INVALID_CLASS, base::utf8(name));
    }
    std::vector<CIMName> names;
    for (const std::string& text : fStorage.listSubclasses(nameSpace, base::utf8(name), isDeep)) {
        names.emplace_back(text.c_str());
    }
    return names;
}

void ClassStore::requireAbsent(NamespaceId nameSpace, const CIMName& name)
{
    if (has(nameSpace, name)) {
        fail(CIM_ERR_ALREADY_EXISTS, base::utf8(name));
    }
}

CIMClass ClassStore::superClassFor(NamespaceId nameSpace, const CIMConstClass& newClass)
{
    requireAbsent(nameSpace, newClass.getClassName());
    checkDepth(nameSpace, newClass);
    const CIMName& superName = newClass.getSuperClassName();
    if (superName.isNull()) {
        return CIMClass();
    }
    CIMClass superClass = resolved(nameSpace, superName);
    if (superClass.isUninitialized() || superName.equal(newClass.getClassName())) {
        fail(CIM_ERR_INVALID_SUPERCLASS, base::utf8(superName));
    }
    return superClass;
}

void ClassStore::insert(NamespaceId nameSpace, const CIMConstClass& local, const std::string& text,
                        const CIMClass& whole)
{
    requireAbsent(nameSpace, local.getClassName());
    fStorage.insertClass(nameSpace, base::utf8(local.getClassName()), base::utf8(local.getSuperClassName()), text);
    // Into the cache at once: a compiler creates subclasses of it next.
    fCache.insert(nameSpace, nameKey(local.getClassName()), whole);
}

void ClassStore::checkDepth(NamespaceId nameSpace, const CIMConstClass& newClass)
{
    std::size_t depth = 1;
    std::string above = base::utf8(newClass.getSuperClassName());
    while (!above.empty()) {
        if (++depth > fLimits.inheritanceDepth) {
            fail(CIM_ERR_SERVER_LIMITS_EXCEEDED,
                 "class is deeper than the limit inheritanceDepth (" + std::to_string(fLimits.inheritanceDepth) + ")");
        }
        above = fStorage.findSuperClass(nameSpace, above).value_or("");
    }
}

} // namespace Pegasus::repository
