#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

struct sqlite3;
struct sqlite3_stmt;

namespace Pegasus::repository {

// One SQLite file, held open by this process alone. A statement that has returned survives the death of the process,
// not a power cut: nothing waits for the disk.
//
// Throws: CIMException CIM_ERR_FAILED from everything that fails. Thread: one thread at a time.
class Database
{
  public:
    explicit Database(const std::string& path);
    ~Database();
    Database(const Database&) = delete;
    Database& operator=(const Database&) = delete;

    void execute(const char* sql);
    sqlite3* handle() const noexcept { return fHandle; }
    [[noreturn]] void fail(const char* operation) const;

  private:
    sqlite3* fHandle = nullptr;
};

// The rows of one run of a statement. Texts are valid until the next row.
class Rows
{
  public:
    Rows(const Database& database, sqlite3_stmt* statement) : fDatabase(database), fStatement(statement) {}
    ~Rows();
    Rows(const Rows&) = delete;
    Rows& operator=(const Rows&) = delete;

    // Goes to the next row, the first one at first. Returns false behind the last.
    bool next();
    std::int64_t integer(int column) const;
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

    // Binds the arguments (integers and texts, which must outlive the rows) to the parameters in order.
    template <class... Arguments> Rows run(const Arguments&... arguments)
    {
        int parameter = 0;
        (bind(++parameter, arguments), ...);
        return Rows(fDatabase, fStatement);
    }
    // Runs a statement that gives no rows.
    template <class... Arguments> void execute(const Arguments&... arguments) { run(arguments...).next(); }

  private:
    void bind(int parameter, std::int64_t value);
    void bind(int parameter, std::string_view value);

    const Database& fDatabase;
    sqlite3_stmt* fStatement = nullptr;
};

} // namespace Pegasus::repository
