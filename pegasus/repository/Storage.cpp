// SPDX-License-Identifier: MIT
#include "pegasus/repository/Storage.h"

namespace Pegasus::repository {

namespace {

// Sequence numbers keep the order of creation. NOCASE folds ASCII letters only, as CIM names do. A path is stored as
// its key (pathKey), in which names are folded already.
constexpr const char* kSchema =
    "BEGIN;"
    "CREATE TABLE IF NOT EXISTS namespaces(id INTEGER PRIMARY KEY, name TEXT NOT NULL COLLATE NOCASE UNIQUE);"
    "CREATE TABLE IF NOT EXISTS qualifiers(sequence INTEGER PRIMARY KEY, namespace INTEGER NOT NULL,"
    "  name TEXT NOT NULL COLLATE NOCASE, body TEXT NOT NULL, UNIQUE(namespace, name));"
    "CREATE TABLE IF NOT EXISTS classes(sequence INTEGER PRIMARY KEY, namespace INTEGER NOT NULL,"
    "  name TEXT NOT NULL COLLATE NOCASE, super TEXT NOT NULL COLLATE NOCASE, body TEXT NOT NULL,"
    "  UNIQUE(namespace, name));"
    "CREATE INDEX IF NOT EXISTS subclasses ON classes(namespace, super);"
    "CREATE TABLE IF NOT EXISTS instances(sequence INTEGER PRIMARY KEY, namespace INTEGER NOT NULL,"
    "  class TEXT NOT NULL COLLATE NOCASE, path TEXT NOT NULL, body TEXT NOT NULL, UNIQUE(namespace, path));"
    "CREATE INDEX IF NOT EXISTS instances_of ON instances(namespace, class);"
    "COMMIT;";

constexpr const char* kListDeepSubclasses =
    "WITH RECURSIVE below(name) AS (SELECT ?2 UNION SELECT c.name FROM classes c JOIN below b ON c.super = b.name"
    "  WHERE c.namespace = ?1)"
    " SELECT name FROM classes WHERE namespace = ?1 AND super IN (SELECT name FROM below) ORDER BY sequence";

// Recursive like the one above: an enumeration includes instances of all subclasses. Starting after a sequence number
// makes batches independent of each other.
constexpr const char* kListInstances =
    "WITH RECURSIVE below(name) AS (SELECT ?2 UNION SELECT c.name FROM classes c JOIN below b ON c.super = b.name"
    "  WHERE c.namespace = ?1)"
    " SELECT sequence, body FROM instances WHERE namespace = ?1 AND class IN (SELECT name FROM below)"
    "  AND sequence > ?3 ORDER BY sequence LIMIT ?4";

std::optional<std::string> firstText(Rows rows)
{
    if (!rows.next()) {
        return std::nullopt;
    }
    return std::string(rows.text(0));
}

std::vector<std::string> allTexts(Rows rows)
{
    std::vector<std::string> texts;
    while (rows.next()) {
        texts.emplace_back(rows.text(0));
    }
    return texts;
}

} // namespace

struct Storage::Statements
{
    explicit Statements(const Database& db)
        : listNamespaces(db, "SELECT id, name FROM namespaces ORDER BY id"),
          insertNamespace(db, "INSERT INTO namespaces(name) VALUES(?) RETURNING id"),
          findQualifier(db, "SELECT body FROM qualifiers WHERE namespace = ? AND name = ?"),
          listQualifiers(db, "SELECT body FROM qualifiers WHERE namespace = ? ORDER BY sequence"),
          putQualifier(db, "INSERT INTO qualifiers(namespace, name, body) VALUES(?, ?, ?)"
                           " ON CONFLICT(namespace, name) DO UPDATE SET body = excluded.body"),
          findClass(db, "SELECT body FROM classes WHERE namespace = ? AND name = ?"),
          findSuperClass(db, "SELECT super FROM classes WHERE namespace = ? AND name = ?"),
          listSubclasses(db, "SELECT name FROM classes WHERE namespace = ? AND super = ? ORDER BY sequence"),
          listDeepSubclasses(db, kListDeepSubclasses),
          insertClass(db, "INSERT INTO classes(namespace, name, super, body) VALUES(?, ?, ?, ?)"
                          " ON CONFLICT(namespace, name) DO NOTHING"),
          findInstance(db, "SELECT sequence, body FROM instances WHERE namespace = ? AND path = ?"),
          insertInstance(db, "INSERT INTO instances(namespace, class, path, body) VALUES(?, ?, ?, ?)"),
          replaceInstance(db, "UPDATE instances SET body = ?3 WHERE sequence = ?1 AND body = ?2 RETURNING sequence"),
          deleteInstance(db, "DELETE FROM instances WHERE sequence = ?"), listInstances(db, kListInstances)
    {
    }

    Statement listNamespaces, insertNamespace;
    Statement findQualifier, listQualifiers, putQualifier;
    Statement findClass, findSuperClass, listSubclasses, listDeepSubclasses, insertClass;
    Statement findInstance, insertInstance, replaceInstance, deleteInstance, listInstances;
};

Storage::Storage(const std::string& path) : fDatabase(path)
{
    fDatabase.execute(kSchema);
    fStatements = std::make_unique<Statements>(fDatabase);
}

Storage::~Storage() = default;

std::vector<std::pair<NamespaceId, std::string>> Storage::namespaces()
{
    std::vector<std::pair<NamespaceId, std::string>> all;
    Rows rows = fStatements->listNamespaces.run();
    while (rows.next()) {
        all.emplace_back(rows.integer(0), rows.text(1));
    }
    return all;
}

NamespaceId Storage::insertNamespace(const std::string& name)
{
    Rows rows = fStatements->insertNamespace.run(std::string_view(name));
    rows.next();
    const NamespaceId id = rows.integer(0);
    rows.next(); // SQLite commits the row only when the statement has run to its end
    return id;
}

std::optional<std::string> Storage::findQualifier(NamespaceId id, const std::string& name)
{
    return firstText(fStatements->findQualifier.run(id, std::string_view(name)));
}

std::vector<std::string> Storage::listQualifiers(NamespaceId id)
{
    return allTexts(fStatements->listQualifiers.run(id));
}

void Storage::putQualifier(NamespaceId id, const std::string& name, const std::string& body)
{
    fStatements->putQualifier.execute(id, std::string_view(name), std::string_view(body));
}

std::optional<std::string> Storage::findClass(NamespaceId id, const std::string& name)
{
    return firstText(fStatements->findClass.run(id, std::string_view(name)));
}

std::optional<std::string> Storage::findSuperClass(NamespaceId id, const std::string& name)
{
    return firstText(fStatements->findSuperClass.run(id, std::string_view(name)));
}

std::vector<std::string> Storage::listSubclasses(NamespaceId id, const std::string& name, bool isDeep)
{
    Statement& statement = isDeep ? fStatements->listDeepSubclasses : fStatements->listSubclasses;
    return allTexts(statement.run(id, std::string_view(name)));
}

bool Storage::insertClass(NamespaceId id, const std::string& name, const std::string& superName,
                          const std::string& body)
{
    fStatements->insertClass.execute(id, std::string_view(name), std::string_view(superName), std::string_view(body));
    return fDatabase.changedRowCount() != 0;
}

std::optional<InstanceRow> Storage::findInstance(NamespaceId id, const std::string& path)
{
    Rows rows = fStatements->findInstance.run(id, std::string_view(path));
    if (!rows.next()) {
        return std::nullopt;
    }
    return InstanceRow{rows.integer(0), std::string(rows.text(1))};
}

void Storage::insertInstance(NamespaceId id, const std::string& className, const std::string& path,
                             const std::string& body)
{
    fStatements->insertInstance.execute(id, std::string_view(className), std::string_view(path),
                                        std::string_view(body));
}

bool Storage::replaceInstance(const InstanceRow& row, const std::string& body)
{
    Rows rows = fStatements->replaceInstance.run(row.sequence, std::string_view(row.body), std::string_view(body));
    const bool isReplaced = rows.next();
    while (rows.next()) { // the change is committed when the statement has run to its end
    }
    return isReplaced;
}

void Storage::deleteInstance(std::int64_t sequence)
{
    fStatements->deleteInstance.execute(sequence);
}

std::vector<InstanceRow> Storage::listInstances(NamespaceId id, const std::string& className, std::int64_t after,
                                                std::size_t limit, std::size_t maxBytes)
{
    std::vector<InstanceRow> found;
    Rows rows =
        fStatements->listInstances.run(id, std::string_view(className), after, static_cast<std::int64_t>(limit));
    std::size_t bytes = 0;
    while (bytes < maxBytes && rows.next()) {
        found.push_back(InstanceRow{rows.integer(0), std::string(rows.text(1))});
        bytes += found.back().body.size();
    }
    return found;
}

} // namespace Pegasus::repository
