// SPDX-License-Identifier: MIT
#include "pegasus/repository/Database.h"

#include <Pegasus/Common/Exception.h>

#include <sqlite3.h>

namespace Pegasus::repository {

namespace {

// EXCLUSIVE keeps the index of the write-ahead log in this process's memory: it saves a file, and a file lock per
// statement. synchronous=OFF leaves writing to the disk to the kernel, which outlives the process.
constexpr const char* kPragmas = "PRAGMA locking_mode=EXCLUSIVE;"
                                 "PRAGMA synchronous=OFF;"
                                 "PRAGMA journal_mode=WAL;"
                                 "PRAGMA temp_store=MEMORY;";

} // namespace

Database::Database(const std::string& path)
{
    constexpr int kFlags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX;
    try {
        if (sqlite3_open_v2(path.c_str(), &fHandle, kFlags, nullptr) != SQLITE_OK) {
            fail("open");
        }
        execute(kPragmas);
    } catch (...) {
        sqlite3_close(fHandle);
        throw;
    }
}

Database::~Database()
{
    sqlite3_close(fHandle);
}

void Database::execute(const char* sql)
{
    if (sqlite3_exec(fHandle, sql, nullptr, nullptr, nullptr) != SQLITE_OK) {
        fail("set up");
    }
}

int Database::changedRowCount() const noexcept
{
    return sqlite3_changes(fHandle);
}

void Database::fail(const char* operation) const
{
    const std::string text = std::string("cannot ") + operation +
                             " the repository: " + (fHandle ? sqlite3_errmsg(fHandle) : "out of memory");
    throw CIMException(CIM_ERR_FAILED, String(text.c_str()));
}

Rows::~Rows()
{
    sqlite3_reset(fStatement);
    sqlite3_clear_bindings(fStatement);
}

bool Rows::next()
{
    const int result = sqlite3_step(fStatement);
    if (result != SQLITE_ROW && result != SQLITE_DONE) {
        fDatabase.fail(sqlite3_stmt_readonly(fStatement) ? "read" : "write");
    }
    return result == SQLITE_ROW;
}

std::int64_t Rows::integer(int column) const
{
    return sqlite3_column_int64(fStatement, column);
}

std::string_view Rows::text(int column) const
{
    const void* data = sqlite3_column_blob(fStatement, column);
    const auto size = static_cast<std::size_t>(sqlite3_column_bytes(fStatement, column));
    return data ? std::string_view(static_cast<const char*>(data), size) : std::string_view();
}

Statement::Statement(const Database& database, const char* sql) : fDatabase(database)
{
    if (sqlite3_prepare_v3(database.handle(), sql, -1, SQLITE_PREPARE_PERSISTENT, &fStatement, nullptr) != SQLITE_OK) {
        database.fail("prepare a statement of");
    }
}

Statement::~Statement()
{
    sqlite3_finalize(fStatement);
}

void Statement::bind(int parameter, std::int64_t value)
{
    if (sqlite3_bind_int64(fStatement, parameter, value) != SQLITE_OK) {
        fDatabase.fail("bind a number for");
    }
}

void Statement::bind(int parameter, std::string_view value)
{
    // SQLite binds NULL for a null pointer; an empty view is an empty text.
    const char* data = value.data() ? value.data() : "";
    if (sqlite3_bind_text64(fStatement, parameter, data, value.size(), SQLITE_STATIC, SQLITE_UTF8) != SQLITE_OK) {
        fDatabase.fail("bind a text for");
    }
}

} // namespace Pegasus::repository
