// SPDX-License-Identifier: MIT
#include "pegasus/repository/Repository.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"
#include "pegasus/repository/InstanceRules.h"
#include "pegasus/repository/InstanceStore.h"
#include "pegasus/repository/NamespaceTable.h"
#include "pegasus/repository/QualifierStore.h"
#include "pegasus/wire/ElementEncoder.h"

#include <cerrno>
#include <cstring>
#include <mutex>

#include <sys/stat.h>

namespace Pegasus::repository {

namespace {

using Lock = std::lock_guard<std::mutex>;

constexpr const char* kFileName = "/repository.db";

// Like mkdir -p; only the owner may enter the new directories.
void makeDirectories(const std::string& directory)
{
    for (std::size_t end = directory.find('/', 1);; end = directory.find('/', end + 1)) {
        const std::string part = directory.substr(0, end);
        if (::mkdir(part.c_str(), S_IRWXU) != 0 && errno != EEXIST) {
            fail(CIM_ERR_FAILED, "cannot create directory " + part + ": " + std::strerror(errno));
        }
        if (end == std::string::npos) {
            return;
        }
    }
}

std::string preparedFile(const std::string& directory)
{
    makeDirectories(directory);
    return directory + kFileName;
}

} // namespace

// The stores, and the lock that makes operations run one after the other. Each member may use those before it.
class Repository::State
{
  public:
    State(const std::string& directory, const RepositoryLimits& givenLimits)
        : limits(givenLimits), storage(preparedFile(directory)), codec(limits.objectBytes),
          namespaces(storage, limits.namespaceCount), qualifiers(storage, codec), classes(storage, codec, limits),
          instances(storage, codec, classes)
    {
    }

    const RepositoryLimits limits;
    std::mutex mutex;
    Storage storage;
    ObjectCodec codec;
    NamespaceTable namespaces;
    QualifierStore qualifiers;
    ClassStore classes;
    InstanceStore instances;
};

Repository::Repository(const std::string& directory, const RepositoryLimits& limits)
    : fState(std::make_unique<State>(directory, limits))
{
}

Repository::~Repository() = default;

void Repository::createNamespace(const CIMNamespaceName& nameSpace)
{
    const Lock lock(fState->mutex);
    fState->namespaces.create(nameSpace);
}

bool Repository::hasNamespace(const CIMNamespaceName& nameSpace) const
{
    const Lock lock(fState->mutex);
    return fState->namespaces.has(nameSpace);
}

std::vector<CIMNamespaceName> Repository::namespaces() const
{
    const Lock lock(fState->mutex);
    return fState->namespaces.list();
}

CIMQualifierDecl Repository::getQualifier(const CIMNamespaceName& nameSpace, const CIMName& name) const
{
    const Lock lock(fState->mutex);
    CIMQualifierDecl found = fState->qualifiers.find(fState->namespaces.id(nameSpace), name);
    if (found.isUninitialized()) {
        fail(CIM_ERR_NOT_FOUND, base::utf8(name));
    }
    return found;
}

std::vector<CIMQualifierDecl> Repository::enumerateQualifiers(const CIMNamespaceName& nameSpace) const
{
    const Lock lock(fState->mutex);
    return fState->qualifiers.list(fState->namespaces.id(nameSpace));
}

void Repository::setQualifier(const CIMNamespaceName& nameSpace, const CIMConstQualifierDecl& declaration)
{
    const Lock lock(fState->mutex);
    fState->qualifiers.set(fState->namespaces.id(nameSpace), declaration);
}

CIMConstClass Repository::getClass(const CIMNamespaceName& nameSpace, const CIMName& className,
                                   const ClassOptions& options) const
{
    CIMClass whole;
    {
        const Lock lock(fState->mutex);
        whole = fState->classes.existing(fState->namespaces.id(nameSpace), className);
    }
    return filterClass(whole, options);
}

std::shared_ptr<const std::string> Repository::getClassText(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                            const ClassOptions& options) const
{
    const bool isKept = options.propertyList.isNull();
    CIMClass whole;
    {
        const Lock lock(fState->mutex);
        const NamespaceId id = fState->namespaces.id(nameSpace);
        if (const auto kept = isKept ? fState->classes.findText(id, className, options) : nullptr) {
            return kept;
        }
        whole = fState->classes.existing(id, className);
    }
    auto made = std::make_shared<std::string>();
    wire::appendClass(*made, filterClass(whole, options));
    if (isKept) {
        const Lock lock(fState->mutex);
        fState->classes.keepText(fState->namespaces.id(nameSpace), className, options, made);
    }
    return made;
}

bool Repository::hasClass(const CIMNamespaceName& nameSpace, const CIMName& className) const
{
    const Lock lock(fState->mutex);
    return fState->classes.has(fState->namespaces.id(nameSpace), className);
}

std::vector<CIMName> Repository::enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                     bool deepInheritance) const
{
    const Lock lock(fState->mutex);
    return fState->classes.listNames(fState->namespaces.id(nameSpace), className, deepInheritance);
}

// The lock is held to fetch what the checks need, and to store; the lookup of a qualifier takes it for itself.
void Repository::createClass(const CIMNamespaceName& nameSpace, const CIMConstClass& newClass)
{
    NamespaceId id = 0;
    CIMClass superClass;
    {
        const Lock lock(fState->mutex);
        id = fState->namespaces.id(nameSpace);
        superClass = fState->classes.superClassFor(id, newClass);
    }
    const CIMClass local = checkClass(newClass, superClass, [&](const CIMName& name, CIMQualifierDecl& declaration) {
        const Lock lock(fState->mutex);
        declaration = fState->qualifiers.find(id, name);
        return !declaration.isUninitialized();
    });
    const std::string text = fState->codec.encodeClass(local);
    const CIMClass whole = resolveClass(local, superClass);
    const Lock lock(fState->mutex);
    fState->classes.insert(id, local, text, whole);
}

CIMObjectPath Repository::createInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& newInstance)
{
    NamespaceId id = 0;
    CIMClass itsClass;
    {
        const Lock lock(fState->mutex);
        id = fState->namespaces.id(nameSpace);
        itsClass = fState->instances.classOf(id, newInstance.getClassName());
    }
    const CIMInstance completed = completeInstance(newInstance, itsClass);
    const CIMObjectPath path = instancePath(completed, itsClass);
    const std::string text = fState->codec.encodeInstance(completed);
    const Lock lock(fState->mutex);
    fState->instances.insert(id, path, text);
    return path;
}

CIMInstance Repository::getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                    const InstanceOptions& options) const
{
    const Lock lock(fState->mutex);
    return fState->instances.get(fState->namespaces.id(nameSpace), path, options);
}

void Repository::modifyInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& modified,
                                const CIMPropertyList& propertyList)
{
    const Lock lock(fState->mutex);
    fState->instances.modify(fState->namespaces.id(nameSpace), modified, propertyList);
}

void Repository::deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path)
{
    const Lock lock(fState->mutex);
    fState->instances.remove(fState->namespaces.id(nameSpace), path);
}

// The lock is held for one batch at a time: the server goes on during a slow visitor.
void Repository::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                    const InstanceOptions& options, const InstanceVisitor& visit) const
{
    std::int64_t after = 0;
    for (;;) {
        std::vector<CIMInstance> batch;
        {
            const Lock lock(fState->mutex);
            batch = fState->instances.nextBatch(fState->namespaces.id(nameSpace), className, options, after);
        }
        if (batch.empty()) {
            return;
        }
        for (const CIMInstance& instance : batch) {
            if (!visit(instance)) {
                return;
            }
        }
    }
}

std::vector<CIMObjectPath> Repository::enumerateInstanceNames(const CIMNamespaceName& nameSpace,
                                                              const CIMName& className) const
{
    std::vector<CIMObjectPath> paths;
    enumerateInstances(nameSpace, className, InstanceOptions(), [&paths](const CIMInstance& instance) {
        paths.push_back(instance.getPath());
        return true;
    });
    return paths;
}

} // namespace Pegasus::repository
