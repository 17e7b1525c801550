// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/repository/Database.h"

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace Pegasus::repository {

using NamespaceId = std::int64_t;
using Lock = std::lock_guard<std::mutex>;

// A stored instance: its place in the order of creation, and its text.
struct InstanceRow
{
    std::int64_t sequence = 0;
    std::string body;
};

// The repository's tables: rows of names and encoded objects. Rules are one level up, in the stores. Names match
// in any case of ASCII letters; lists are in order of creation.
//
// Throws: CIMException CIM_ERR_FAILED when the database fails.
// Thread: one thread at a time.
class Storage
{
  public:
    // Opens or creates the database file `path` and its tables.
    explicit Storage(const std::string& path);
    ~Storage();

    std::vector<std::pair<NamespaceId, std::string>> namespaces();
    NamespaceId insertNamespace(const std::string& name);

    std::optional<std::string> findQualifier(NamespaceId id, const std::string& name);
    std::vector<std::string> listQualifiers(NamespaceId id);
    // Inserts or replaces.
    void putQualifier(NamespaceId id, const std::string& name, const std::string& body);

    std::optional<std::string> findClass(NamespaceId id, const std::string& name);
    // Returns: the superclass's name, empty for a root class; nullopt when the class is absent.
    std::optional<std::string> findSuperClass(NamespaceId id, const std::string& name);
    // Returns: the names of the direct subclasses, or of all below when deep; of root classes when `name` is empty.
    std::vector<std::string> listSubclasses(NamespaceId id, const std::string& name, bool isDeep);
    // Returns: false when there is a class of that name, which stays as it is.
    bool insertClass(NamespaceId id, const std::string& name, const std::string& superName, const std::string& body);

    // `path`: as pathKey() forms it.
    std::optional<InstanceRow> findInstance(NamespaceId id, const std::string& path);
    void insertInstance(NamespaceId id, const std::string& className, const std::string& path, const std::string& body);
    // Replaces the body of a row. Returns: false when the row is gone or has another body than `row`.
    bool replaceInstance(const InstanceRow& row, const std::string& body);
    void deleteInstance(std::int64_t sequence);
    // Returns: instances of the class and of all below it with a sequence beyond `after`: at most `limit` of them, and
    //     the one that reaches `maxBytes` is the last.
    std::vector<InstanceRow> listInstances(NamespaceId id, const std::string& className, std::int64_t after,
                                           std::size_t limit, std::size_t maxBytes);

  private:
    struct Statements;
    Database fDatabase;
    std::unique_ptr<Statements> fStatements; // prepared once; end before the database closes
};

} // namespace Pegasus::repository
