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

// Which parts of a class an answer holds (DSP0200, GetClass). The defaults are those of the operation.
struct ClassOptions
{
    bool localOnly = true;         // leave out inherited qualifiers, properties and methods; overriding ones stay
    bool includeQualifiers = true; // qualifiers of the class and of every element
    bool includeClassOrigin = false;
    CIMPropertyList propertyList = CIMPropertyList(); // null: all; names that the class lacks are ignored
};

// Which parts of a stored instance an answer holds. Stored instances carry no qualifiers.
struct InstanceOptions
{
    bool deepInheritance = true; // false: subclass instances are cut down to the named class's properties
    bool includeClassOrigin = false;
    CIMPropertyList propertyList = CIMPropertyList();
};

// Sizes that bound what one repository keeps; each violation throws CIM_ERR_SERVER_LIMITS_EXCEEDED and names the
// limit.
struct Limits
{
    std::size_t objectBytes = 8u << 20; // encoded size of one class, instance or qualifier declaration
    std::size_t inheritanceDepth = 64;  // classes from a root class to the new one
    std::size_t namespaceCount = 1024;
    std::size_t cachedClassCount = 1024; // resolved classes held in memory; more are resolved again on demand
};

// Receives enumerated objects one by one, outside of any lock of the repository.
// Returns false to end the enumeration early.
using InstanceSink = std::function<bool(const CIMInstance&)>;

// The private server's store of namespaces, qualifier declarations, classes and instances.
//
// Classes are stored as they were created; what they inherit is resolved on reading. A write is acknowledged when
// the call returns, and survives the death of the process from then on (not a power cut). A failed write changes
// nothing.
//
// Names compare without regard to case and are given back in the spelling of their creation. Enumerations run in
// order of creation.
//
// Throws: every operation throws CIMException. Its message is the bare cause (the name, in the simple cases), without
// the symbolic code in front. CIM_ERR_INVALID_NAMESPACE (message: the namespace) when the namespace does not exist;
// CIM_ERR_FAILED when the storage fails.
//
// Thread: all operations may be called from any thread at any time; they run one after the other.
// Ownership: classes that are given back share their parts with the cache; clone() gives one to change.
// Blocks: for single file accesses only.
class Repository
{
  public:
    // Opens the store in directory, which is created with its parents if missing; root exists from the start.
    // The directory may be deleted while the repository is open: operations go on, nothing stays on disk.
    // Requires: no other process has it open.
    explicit Repository(const std::string& directory, const Limits& limits = {});
    ~Repository();
    Repository(const Repository&) = delete;
    Repository& operator=(const Repository&) = delete;

    // Parents need not exist. Throws CIM_ERR_ALREADY_EXISTS.
    void createNamespace(const CIMNamespaceName& nameSpace);
    // Throws CIM_ERR_NAMESPACE_NOT_EMPTY unless it holds neither class, instance nor qualifier declaration.
    void deleteNamespace(const CIMNamespaceName& nameSpace);
    bool hasNamespace(const CIMNamespaceName& nameSpace) const;
    std::vector<CIMNamespaceName> namespaces() const;

    // Throws CIM_ERR_NOT_FOUND.
    CIMQualifierDecl getQualifier(const CIMNamespaceName& nameSpace, const CIMName& name) const;
    std::vector<CIMQualifierDecl> enumerateQualifiers(const CIMNamespaceName& nameSpace) const;
    // Creates the declaration. An existing one is replaced, except that one with another type or array form is kept
    // silently (as OpenPegasus does).
    void setQualifier(const CIMNamespaceName& nameSpace, const CIMConstQualifierDecl& declaration);
    // Throws CIM_ERR_NOT_FOUND.
    void deleteQualifier(const CIMNamespaceName& nameSpace, const CIMName& name);

    // Throws CIM_ERR_NOT_FOUND.
    CIMConstClass getClass(const CIMNamespaceName& nameSpace, const CIMName& className,
                           const ClassOptions& options) const;
    // The same as a CLASS element (DSP0201): what clients ask for again and again is encoded once.
    std::shared_ptr<const std::string> getClassText(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                    const ClassOptions& options) const;
    bool hasClass(const CIMNamespaceName& nameSpace, const CIMName& className) const;
    // The null name if the class has none. Throws CIM_ERR_NOT_FOUND.
    CIMName superClass(const CIMNamespaceName& nameSpace, const CIMName& className) const;
    // Subclasses of className (of nothing, i.e. root classes, if null): direct ones, or all below when deep.
    // Throws CIM_ERR_INVALID_CLASS.
    std::vector<CIMName> enumerateClassNames(const CIMNamespaceName& nameSpace, const CIMName& className,
                                             bool deepInheritance) const;
    std::vector<CIMConstClass> enumerateClasses(const CIMNamespaceName& nameSpace, const CIMName& className,
                                                bool deepInheritance, const ClassOptions& options) const;
    // Checks and stores a class. Qualifiers take the flavors of their declarations; a use may narrow them.
    // Throws CIM_ERR_ALREADY_EXISTS, CIM_ERR_INVALID_SUPERCLASS, CIM_ERR_INVALID_PARAMETER and CIM_ERR_FAILED (rules
    // of qualifiers, overriding, keys and references).
    void createClass(const CIMNamespaceName& nameSpace, const CIMConstClass& newClass);
    // Replaces a class that has neither subclasses nor instances, under the rules of createClass.
    // Throws CIM_ERR_NOT_FOUND, CIM_ERR_CLASS_HAS_CHILDREN, CIM_ERR_CLASS_HAS_INSTANCES and createClass's codes.
    void modifyClass(const CIMNamespaceName& nameSpace, const CIMConstClass& modifiedClass);
    // Throws CIM_ERR_NOT_FOUND, CIM_ERR_CLASS_HAS_CHILDREN, CIM_ERR_CLASS_HAS_INSTANCES.
    void deleteClass(const CIMNamespaceName& nameSpace, const CIMName& className);

    // Stores an instance with every property of its class: those not given come first, with the class's defaults.
    // Returns: its path, without host and namespace.
    // Throws CIM_ERR_INVALID_CLASS, CIM_ERR_ALREADY_EXISTS (message: the path), CIM_ERR_FAILED ("no such property: X",
    // "type mismatch", "class has no keys: X"), CIM_ERR_NOT_SUPPORTED for an abstract class.
    CIMObjectPath createInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& newInstance);
    // Throws CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND (message: the path).
    CIMInstance getInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path,
                            const InstanceOptions& options) const;
    // Replaces the values of the given properties (all of modified, or those that the list names).
    // Throws CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND, CIM_ERR_FAILED as createInstance.
    void modifyInstance(const CIMNamespaceName& nameSpace, const CIMConstInstance& modified,
                        const CIMPropertyList& propertyList);
    // Throws CIM_ERR_INVALID_CLASS, CIM_ERR_NOT_FOUND.
    void deleteInstance(const CIMNamespaceName& nameSpace, const CIMObjectPath& path);
    // Instances of the class and its subclasses, each with its path set (no host, no namespace), in bounded memory.
    // Throws CIM_ERR_INVALID_CLASS.
    void enumerateInstances(const CIMNamespaceName& nameSpace, const CIMName& className, const InstanceOptions& options,
                            const InstanceSink& sink) const;
    std::vector<CIMObjectPath> enumerateInstanceNames(const CIMNamespaceName& nameSpace,
                                                      const CIMName& className) const;

  private:
    class State;
    std::unique_ptr<State> fState;
};

} // namespace Pegasus::repository
