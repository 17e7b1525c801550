// SPDX-License-Identifier: MIT
#pragma once

#include <Pegasus/Common/CIMClass.h>
#include <Pegasus/Common/CIMInstance.h>
#include <Pegasus/Common/CIMName.h>
#include <Pegasus/Common/CIMObjectPath.h>
#include <Pegasus/Common/CIMPropertyList.h>
#include <Pegasus/Common/CIMQualifierDecl.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace Pegasus::repository {

// Which parts of a class an answer has (DSP0200, GetClass). The defaults are those of the operation.
struct ClassOptions
{
    bool localOnly = true;         // leave out inherited qualifiers, properties and methods; overriding ones stay
    bool includeQualifiers = true; // qualifiers of the class and of every element
    bool includeClassOrigin = false;
    CIMPropertyList propertyList = CIMPropertyList(); // null: all; names that the class lacks are ignored
};

// Which parts of a stored instance an answer has. Qualifiers of instances are dropped.
struct InstanceOptions
{
    bool deepInheritance = true; // false: subclass instances are cut down to the named class's properties
    bool includeClassOrigin = false;
    CIMPropertyList propertyList = CIMPropertyList();
};

// Sizes that bound what one repository keeps. Exceeding one throws CIM_ERR_SERVER_LIMITS_EXCEEDED; the message names
// the limit.
struct RepositoryLimits
{
    std::size_t objectBytes = 8u << 20; // encoded size of one class, instance or qualifier declaration
    std::size_t inheritanceDepth = 64;  // classes from a root class to the new one
    std::size_t namespaceCount = 1024;
    std::size_t cachedClassCount = 1024; // resolved classes held in memory; more are resolved again on demand
};

// Receives enumerated instances one by one. The visitor may call the repository: its lock is free.
// Returns: false to end the enumeration early.
using InstanceVisitor = std::function<bool(const CIMInstance&)>;

// The private server's store of namespaces, qualifier declarations, classes and instances.
//
// Four levels: this class finds the namespace; one store a kind of object (NamespaceTable, QualifierStore, ClassStore,
// InstanceStore) applies CIM's rules, keeps caches and takes the one lock; Storage maps names and encoded
// objects to tables; Database and Statement are SQLite.
//
// Classes are stored as they were created and resolved with what they inherit when they are read. A write that has
// returned survives the death of the process; a power cut may lose it. A failed write leaves the store as it was.
//
// Names compare in any case and are returned in the spelling of their creation. Enumerations are in order of
// creation.
//
// Throws: every operation throws CIMException. Its message is the cause alone (in the simple cases the name); the
//     symbolic code is left out. CIM_ERR_INVALID_NAMESPACE (message: the namespace) when the namespace is missing;
//     CIM_ERR_FAILED when the storage fails.
// Thread: all operations may be called on any thread at any time. Their accesses to the storage run one after the
//     other; objects are decoded, resolved, checked and encoded at the same time.
// Ownership: returned classes share their parts with the cache; clone() makes one that may be changed.
// Blocks: for file accesses of one operation, and while another thread accesses the storage; however large the object
//     that another thread works on.
class Repository
{
  public:
    // Opens the store in `directory`, which is created with its parents if missing. The namespace root always exists.
    // The directory may be deleted while the repository is open: operations go on with the deleted file.
    // Requires: this process alone has it open.
    explicit Repository(const std::string& directory, const RepositoryLimits& limits = {});
    ~Repository();
    Repository(const Repository&) = delete;
    Repository& operator=(const Repository&) = delete;

    // Parents are optional.
    // Throws: CIM_ERR_ALREADY_EXISTS.
    void createNamespace(const CIMNamespaceName& nameSpace);
    bool hasNamespace(const CIMNamespaceName& nameSpace) const;
    std::vector<CIMNamespaceName> namespaces() const;

    // Throws: CIM_ERR_NOT_FOUND.
    CIMQualifierDecl getQualifier(const CIMNamespaceName& nameSpace, const CIMName& name) const;
    std::vector<CIMQualifierDecl> enumerateQualifiers(const CIMNamespaceName& nameSpace) const;
    // Creates or replaces the declaration. An existing one of another type or array form stays as it is, silently,
    // as in OpenPegasus.
    void setQualifier(const CIMNamespaceName& nameSpace, const CIMConstQualifierDecl& declaration);

    // Throws: CIM_ERR_NOT_FOUND.
    CIMConstClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className,
                           const ClassOptions& options) const;
    // The class with everything that it inherits, as the cache has it: no part is copied.
    CIMConstClass getWholeClass(const CIMNamespaceName& nameSpace, const CIMName& className) const;
    // getClass() as a CLASS element (DSP0201). Forms that clients ask for repeatedly are encoded once.
    std::shared_ptr<const std::string> getClassText(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                    const ClassOptions& options) const;
    bool hasClass(const CIMNamespaceName& nameSpace, const CIMName& className) const;
    // Returns: the subclasses of `className`, or the root classes if it is null; with `deepInheritance` all below them
    //     too.
    // Throws: CIM_ERR_INVALID_CLASS.
    std::vector<CIMName> enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className,
                                             bool deepInheritance) const;
    // Checks and stores a class. Qualifiers take the flavors of their declarations; a use may narrow them.
    // Throws: CIM_ERR_ALREADY_EXISTS, CIM_ERR_INVALID_SUPERCLASS; CIM_ERR_INVALID_PARAMETER and CIM_ERR_FAILED for the
    //     rules of qualifiers, overriding, keys and references.
    void createClass(const CIMNamespaceName& nameSpace, const CIMConstClass& newClass);

    // Stores an instance with every property of its class: the omitted ones come first, with the class's defaults.
    // Returns: its path (class and keys).
    // Throws: CIM_ERR_INVALID_CLASS, CIM_ERR_ALREADY_EXISTS (message: the path), CIM_ERR_FAILED ("no such property: X",
    //     "type mismatch", "class has no keys: X"), CIM_ERR_NOT_SUPPORTED for an abstract class.
    CIMObjectPath createInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& newInstance);
    // Throws: CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND (message: the path).
    CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                            const InstanceOptions& options) const;
    // Replaces the values of properties of the instance at the path of `modified`: of all that it has, or of those
    // listed.
    // Throws: CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND; CIM_ERR_FAILED as createInstance; CIM_ERR_INVALID_PARAMETER
    //     when a key would change.
    void modifyInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& modified,
                        const CIMPropertyList& propertyList);
    // Throws: CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND.
    void deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path);
    // Passes the instances of the class and its subclasses, each with its path (class and keys), to the visitor.
    // Memory stays bounded: they are read in batches. An instance that is created or deleted meanwhile may appear or
    // be missed.
    // Throws: CIM_ERR_INVALID_CLASS; what the visitor throws.
    void enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className, const InstanceOptions& options,
                            const InstanceVisitor& visit) const;
    std::vector<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace,
                                                      const CIMName& className) const;

  private:
    class State;
    std::unique_ptr<State> fState;
};

} // namespace Pegasus::repository
