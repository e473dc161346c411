/// A thin layer over SQLite: connection, statement and transaction close themselves, and every
/// error is a Failure that names the file.
///
/// The file is in WAL mode: readers see the state as it was when their transaction first read,
/// whatever writers do meanwhile; writers take turns and wait for each other. A connection and
/// its statements belong to one thread, and must not be carried across fork().
#ifndef APPLIANCE_DATABASE_H
#define APPLIANCE_DATABASE_H

#include <sqlite3.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

namespace appliance {

class Database {
public:
    enum class Access { Read, Write, Create };

    /// Opens @p path. Access::Create makes the file when it is missing and puts it in WAL mode.
    /// @throws Failure StateUnusable
    Database(std::string path, Access access);

    /// Runs @p sql, which may hold several statements and gives no rows.
    void execute(const char* sql);

    /// Passes SQLITE_OK, SQLITE_ROW and SQLITE_DONE; any other @p code is thrown as StateBusy or
    /// StateUnusable.
    void check(int code) const;

    sqlite3* handle() const { return m_handle.get(); }

private:
    struct Close {
        void operator()(sqlite3* handle) const { sqlite3_close_v2(handle); }
    };
    std::string m_path;
    std::unique_ptr<sqlite3, Close> m_handle;
};

/// A prepared statement, to be run any number of times.
///
///     Statement find(database, "SELECT attributes FROM object WHERE host = ?");
///     find.bind(host);
///     while (find.step()) use(find.text(0));
class Statement {
public:
    Statement(Database& database, const std::string& sql);

    /// Gives the parameters these values: numbers, and texts, which must stay as they are until
    /// the next reset().
    template <typename... Values>
    void bind(const Values&... values) {
        int parameter = 0;
        (set(++parameter, values), ...);
    }

    /// Whether there is a further row. Behind the last one the statement is reset.
    bool step();
    void reset() { sqlite3_reset(m_handle.get()); }

    /// Columns of the row that step() found, numbered from 0.
    std::int64_t integer(int column) const;
    std::string text(int column) const;

private:
    void set(int parameter, std::int64_t value);
    void set(int parameter, std::string_view value);

    struct Finalize {
        void operator()(sqlite3_stmt* handle) const { sqlite3_finalize(handle); }
    };
    Database& m_database;
    std::unique_ptr<sqlite3_stmt, Finalize> m_handle;
};

/// Scope of one transaction; what was not committed when the scope ends is rolled back.
class Transaction {
public:
    /// A Read transaction is one consistent picture. A Write transaction excludes other writers
    /// from its start, so that what it reads cannot change before it writes.
    enum class Purpose { Read, Write };

    Transaction(Database& database, Purpose purpose);
    ~Transaction();
    Transaction(const Transaction&) = delete;
    Transaction& operator=(const Transaction&) = delete;

    void commit();

private:
    Database& m_database;
    bool m_open = true;
};

}  // namespace appliance

#endif
