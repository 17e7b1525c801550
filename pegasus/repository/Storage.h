#pragma once

#include "pegasus/repository/Database.h"

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace Pegasus::repository {

using NamespaceId = std::int64_t;

// A stored instance: its place in the order of creation, and its text.
struct InstanceRow
{
    std::int64_t sequence = 0;
    std::string body;
};

// The repository's tables: rows of names and encoded objects, no rules. Names ignore the case of ASCII letters.
//
// Throws: CIMException CIM_ERR_FAILED. Thread: one thread at a time.
class Storage
{
  public:
    explicit Storage(const std::string& path);
    ~Storage();

    std::vector<std::pair<NamespaceId, std::string>> namespaces();
    NamespaceId insertNamespace(const std::string& name);
    void deleteNamespace(NamespaceId id);
    bool isNamespaceEmpty(NamespaceId id);

    std::optional<std::string> findQualifier(NamespaceId id, const std::string& name);
    std::vector<std::string> listQualifiers(NamespaceId id);
    // Inserts or replaces.
    void putQualifier(NamespaceId id, const std::string& name, const std::string& body);
    // Returns false if there was none.
    bool deleteQualifier(NamespaceId id, const std::string& name);

    std::optional<std::string> findClass(NamespaceId id, const std::string& name);
    // Empty for a class without superclass.
    std::optional<std::string> findSuperClass(NamespaceId id, const std::string& name);
    // Names of the direct subclasses, or of all below; of root classes if name is empty.
    std::vector<std::string> listSubclasses(NamespaceId id, const std::string& name, bool isDeep);
    void putClass(NamespaceId id, const std::string& name, const std::string& superName, const std::string& body);
    void deleteClass(NamespaceId id, const std::string& name);
    bool hasInstances(NamespaceId id, const std::string& className);

    // path: as pathKey() forms it.
    std::optional<InstanceRow> findInstance(NamespaceId id, const std::string& path);
    void insertInstance(NamespaceId id, const std::string& className, const std::string& path, const std::string& body);
    void updateInstance(std::int64_t sequence, const std::string& body);
    void deleteInstance(std::int64_t sequence);
    // Instances of the class and of all below it that were created behind `after`: at most limit of them, and no
    // further one when maxBytes are reached.
    std::vector<InstanceRow> listInstances(NamespaceId id, const std::string& className, std::int64_t after,
                                           std::size_t limit, std::size_t maxBytes);

  private:
    struct Statements;
    Database fDatabase;
    std::unique_ptr<Statements> fStatements;
};

} // namespace Pegasus::repository
