// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace Pegasus::repository {

// One SQLite file, held open by this process alone. What a statement wrote survives the death of the process once the
// statement has returned; a power cut may lose it, because a statement may return before the disk has the data.
//
// Throws: CIMException CIM_ERR_FAILED "cannot <operation> the repository: <SQLite's message>" from every member.
// Thread: one thread at a time.
class Database
{
  public:
    explicit Database(const std::string& path);
    ~Database();
    Database(const Database&) = delete;
    Database& operator=(const Database&) = delete;

    // Runs statements without parameters and rows.
    void execute(const char* sql);
    // Returns: how many rows the last statement inserted, changed or deleted.
    int changedRowCount() const noexcept;
    sqlite3* handle() const noexcept { return fHandle; }
    [[noreturn]] void fail(const char* operation) const;

  private:
    sqlite3* fHandle = nullptr;
};

// The rows of one run of a statement. The run ends with this object.
// Requires: one object per statement at a time; it ends before the statement.
class Rows
{
  public:
    Rows(const Database& database, sqlite3_stmt* statement) : fDatabase(database), fStatement(statement) {}
    ~Rows();
    Rows(const Rows&) = delete;
    Rows& operator=(const Rows&) = delete;

    // Goes to the first or next row.
    // Returns: false after the last row.
    bool next();
    std::int64_t integer(int column) const;
    // Ownership: the statement's, until the next row.
    std::string_view text(int column) const;

  private:
    const Database& fDatabase;
    sqlite3_stmt* fStatement;
};

// A statement prepared once and run many times.
class Statement
{
  public:
    Statement(const Database& database, const char* sql);
    ~Statement();
    Statement(const Statement&) = delete;
    Statement& operator=(const Statement&) = delete;

    // Binds the arguments (integers and texts) to the parameters in order.
    // Requires: texts outlive the rows.
    template <typename... Arguments> Rows run(const Arguments&... arguments)
    {
        int parameter = 0;
        (bind(++parameter, arguments), ...);
        return Rows(fDatabase, fStatement);
    }
    // Runs a statement that returns no rows.
    template <typename... Arguments> void execute(const Arguments&... arguments) { run(arguments...).next(); }

  private:
    void bind(int parameter, std::int64_t value);
    void bind(int parameter, std::string_view value);

    const Database& fDatabase;
    sqlite3_stmt* fStatement = nullptr;
};

} // namespace Pegasus::repository
