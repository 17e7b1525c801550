// SPDX-License-Identifier: MIT
#include "pegasus/repository/ClassStore.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"
#include "pegasus/repository/LookupKey.h"

namespace Pegasus::repository {

ClassStore::ClassStore(std::mutex& mutex, Storage& storage, const ObjectEncoder& encoder,
                       const RepositoryLimits& limits)
    : fMutex(mutex), fStorage(storage), fEncoder(encoder), fLimits(limits), fCache(limits.cachedClassCount)
{
}

// Resolves from the root class down, and keeps every class on the way. The recursion is bounded: superClassFor() limits
// the depth. Two threads may resolve the same class at once; the cache keeps the first result, and both are equal,
// since a stored class stays as it is.
ResolvedClass ClassStore::resolve(NamespaceId nameSpace, const CIMName& name)
{
    const std::string key = nameKey(name);
    ResolvedClass cached;
    std::optional<std::string> text;
    {
        const Lock lock(fMutex);
        cached = fCache.find(nameSpace, key);
        if (!cached.whole.isUninitialized()) {
            return cached;
        }
        if (cached.depth == 0) {
            text = fStorage.findClass(nameSpace, key);
        }
    }
    CIMClass local = cached.created;
    if (cached.depth == 0) {
        if (!text) {
            return ResolvedClass();
        }
        local = withEmbeddedTypes(ObjectDecoder(fEncoder).decodeClass(std::move(*text)));
    }
    const CIMName& superName = local.getSuperClassName();
    const ResolvedClass superClass = superName.isNull() ? ResolvedClass() : resolve(nameSpace, superName);
    ResolvedClass found{resolveClass(local, superClass.whole), superClass.depth + 1};
    const Lock lock(fMutex);
    fCache.insert(nameSpace, key, found);
    return found;
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
    const Lock lock(fMutex);
    return fCache.findText(nameSpace, nameKey(name), options);
}

void ClassStore::keepText(NamespaceId nameSpace, const CIMName& name, const ClassOptions& options,
                          const std::shared_ptr<const std::string>& text)
{
    const Lock lock(fMutex);
    fCache.keepText(nameSpace, nameKey(name), options, text);
}

bool ClassStore::has(NamespaceId nameSpace, const CIMName& name)
{
    const Lock lock(fMutex);
    return fCache.find(nameSpace, nameKey(name)).depth != 0 ||
           fStorage.findSuperClass(nameSpace, base::utf8(name)).has_value();
}

std::vector<CIMName> ClassStore::listNames(NamespaceId nameSpace, const CIMName& name, bool isDeep)
{
    if (!name.isNull() && !has(nameSpace, name)) {
        fail(CIM_ERR_INVALID_CLASS, base::utf8(name));
    }
    std::vector<CIMName> names;
    const Lock lock(fMutex);
    for (const std::string& text : fStorage.listSubclasses(nameSpace, base::utf8(name), isDeep)) {
        names.emplace_back(text.c_str());
    }
    return names;
}

// Returns: the superclass of a class that can be created; absent for a root class.
// Throws: CIM_ERR_ALREADY_EXISTS, CIM_ERR_INVALID_SUPERCLASS, CIM_ERR_SERVER_LIMITS_EXCEEDED.
ResolvedClass ClassStore::superClassFor(NamespaceId nameSpace, const CIMConstClass& newClass)
{
    if (has(nameSpace, newClass.getClassName())) {
        fail(CIM_ERR_ALREADY_EXISTS, base::utf8(newClass.getClassName()));
    }
    const CIMName& superName = newClass.getSuperClassName();
    ResolvedClass superClass = superName.isNull() ? ResolvedClass() : resolve(nameSpace, superName);
    if (superClass.depth >= fLimits.inheritanceDepth) {
        fail(CIM_ERR_SERVER_LIMITS_EXCEEDED,
             "class is deeper than the limit inheritanceDepth (" + std::to_string(fLimits.inheritanceDepth) + ")");
    }
    if (!superName.isNull() && superClass.depth == 0) {
        fail(CIM_ERR_INVALID_SUPERCLASS, base::utf8(superName));
    }
    return superClass;
}

void ClassStore::create(NamespaceId nameSpace, const CIMConstClass& newClass, const QualifierLookup& lookup)
{
    const ResolvedClass superClass = superClassFor(nameSpace, newClass);
    const CIMClass local = checkClass(newClass, superClass.whole, lookup);
    const std::string text = fEncoder.encodeClass(local);
    const std::string name = base::utf8(local.getClassName());
    const Lock lock(fMutex);
    if (!fStorage.insertClass(nameSpace, name, base::utf8(local.getSuperClassName()), text)) {
        fail(CIM_ERR_ALREADY_EXISTS, name); // another thread was faster
    }
    // Into the cache at once: a compiler creates subclasses of it next.
    fCache.insert(nameSpace, nameKey(local.getClassName()), {CIMClass(), superClass.depth + 1, local});
}

} // namespace Pegasus::repository
