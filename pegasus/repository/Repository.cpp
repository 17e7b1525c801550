// SPDX-License-Identifier: MIT
#include "pegasus/repository/Repository.h"

#include "pegasus/base/Text.h"
#include "pegasus/repository/CimError.h"
#include "pegasus/repository/ClassRules.h"
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

// The stores, and the lock of the storage, the table of namespaces and the caches. The stores take it for themselves,
// to read and write rows alone: one client's large object may not keep the others waiting. Each member may use those
// before it.
class Repository::State
{
  public:
    State(const std::string& directory, const RepositoryLimits& givenLimits)
        : limits(givenLimits), storage(preparedFile(directory)), encoder(limits.objectBytes),
          namespaces(storage, limits.namespaceCount), qualifiers(mutex, storage, encoder),
          classes(mutex, storage, encoder, limits), instances(mutex, storage, encoder, classes)
    {
    }

    NamespaceId idOf(const CIMNamespaceName& nameSpace)
    {
        const Lock lock(mutex);
        return namespaces.id(nameSpace);
    }

    const RepositoryLimits limits;
    std::mutex mutex;
    Storage storage;
    const ObjectEncoder encoder;
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
    CIMQualifierDecl found = fState->qualifiers.find(fState->idOf(nameSpace), name);
    if (found.isUninitialized()) {
        fail(CIM_ERR_NOT_FOUND, base::utf8(name));
    }
    return found;
}

std::vector<CIMQualifierDecl> Repository::enumerateQualifiers(const CIMNamespaceName& nameSpace) const
{
    return fState->qualifiers.list(fState->idOf(nameSpace));
}

void Repository::setQualifier(const CIMNamespaceName& nameSpace, const CIMConstQualifierDecl& declaration)
{
    fState->qualifiers.set(fState->idOf(nameSpace), declaration);
}

CIMConstClass Repository::getClass(const CIMNamespaceName& nameSpace, const CIMName& className,
                                   const ClassOptions& options) const
{
    return filterClass(fState->classes.existing(fState->idOf(nameSpace), className), options);
}

CIMConstClass Repository::getWholeClass(const CIMNamespaceName& nameSpace, const CIMName& className) const
{
    return fState->classes.existing(fState->idOf(nameSpace), className);
}

std::shared_ptr<const std::string> Repository::getClassText(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                            const ClassOptions& options) const
{
    const bool isKept = options.propertyList.isNull();
    const NamespaceId id = fState->idOf(nameSpace);
    if (const auto kept = isKept ? fState->classes.findText(id, className, options) : nullptr) {
        return kept;
    }
    auto made = std::make_shared<std::string>();
    wire::appendClass(*made, filterClass(fState->classes.existing(id, className), options));
    if (isKept) {
        fState->classes.keepText(id, className, options, made);
    }
    return made;
}

bool Repository::hasClass(const CIMNamespaceName& nameSpace, const CIMName& className) const
{
    return fState->classes.has(fState->idOf(nameSpace), className);
}

std::vector<CIMName> Repository::enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                     bool deepInheritance) const
{
    return fState->classes.listNames(fState->idOf(nameSpace), className, deepInheritance);
}

void Repository::createClass(const CIMNamespaceName& nameSpace, const CIMConstClass& newClass)
{
    const NamespaceId id = fState->idOf(nameSpace);
    fState->classes.create(id, newClass, [&](const CIMName& name, CIMQualifierDecl& declaration) {
        declaration = fState->qualifiers.find(id, name);
        return !declaration.isUninitialized();
    });
}

CIMObjectPath Repository::createInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& newInstance)
{
    return fState->instances.create(fState->idOf(nameSpace), newInstance);
}

CIMInstance Repository::getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                                    const InstanceOptions& options) const
{
    return fState->instances.get(fState->idOf(nameSpace), path, options);
}

void Repository::modifyInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& modified,
                                const CIMPropertyList& propertyList)
{
    fState->instances.modify(fState->idOf(nameSpace), modified, propertyList);
}

void Repository::deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path)
{
    fState->instances.remove(fState->idOf(nameSpace), path);
}

void Repository::enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className,
                                    const InstanceOptions& options, const InstanceVisitor& visit) const
{
    fState->instances.visit(fState->idOf(nameSpace), className, options, visit);
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
