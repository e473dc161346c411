#include "Database.h"

#include "Failure.h"

namespace appliance {

namespace {

/// Long enough for a generator that fills a large appliance while tools wait.
constexpr int kBusyMilliseconds = 60'000;

/// 64 MiB, for who fills a large state in one transaction.
constexpr const char* kLargeCache = "PRAGMA cache_size = -65536";

/// By Database::Access.
constexpr int kOpenFlags[] = {SQLITE_OPEN_READONLY, SQLITE_OPEN_READWRITE,
                              SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE};

}  // namespace

Database::Database(std::string path, Access access) : m_path(std::move(path)) {
    sqlite3* handle = nullptr;
    const int code = sqlite3_open_v2(m_path.c_str(), &handle,
                                     kOpenFlags[static_cast<std::size_t>(access)], nullptr);
    m_handle.reset(handle);
    check(code);
    sqlite3_extended_result_codes(handle, 1);
    sqlite3_busy_timeout(handle, kBusyMilliseconds);
    if (access == Access::Read) {
        return;
    }
    // The files beside the state stay when the last connection closes, so that users who may read
    // the folder but not write to it can open the state.
    int persist = 1;
    check(sqlite3_file_control(handle, "main", SQLITE_FCNTL_PERSIST_WAL, &persist));
    Statement(*this, "PRAGMA journal_size_limit = 0").step();
    if (access == Access::Write) {
        return;
    }
    Statement(*this, "PRAGMA journal_mode = WAL").step();
    execute(kLargeCache);
}

void Database::execute(const char* sql) {
    check(sqlite3_exec(m_handle.get(), sql, nullptr, nullptr, nullptr));
}

void Database::check(int code) const {
    if (code == SQLITE_OK || code == SQLITE_ROW || code == SQLITE_DONE) {
        return;
    }
    if ((code & 0xFF) == SQLITE_BUSY) {
        throw Failure(Fault::StateBusy, {m_path});
    }
    const char* reason = m_handle ? sqlite3_errmsg(m_handle.get()) : sqlite3_errstr(code);
    throw Failure(Fault::StateUnusable, {m_path, reason});
}

Statement::Statement(Database& database, const std::string& sql) : m_database(database) {
    sqlite3_stmt* handle = nullptr;
    const int code = sqlite3_prepare_v2(database.handle(), sql.c_str(), -1, &handle, nullptr);
    m_handle.reset(handle);
    database.check(code);
}

void Statement::set(int parameter, std::int64_t value) {
    m_database.check(sqlite3_bind_int64(m_handle.get(), parameter, value));
}

void Statement::set(int parameter, std::string_view value) {
    m_database.check(sqlite3_bind_text64(m_handle.get(), parameter, value.data(), value.size(),
                                         SQLITE_STATIC, SQLITE_UTF8));
}

bool Statement::step() {
    const int code = sqlite3_step(m_handle.get());
    if (code == SQLITE_ROW) {
        return true;
    }
    reset();
    m_database.check(code);
    return false;
}

std::int64_t Statement::integer(int column) const {
    return sqlite3_column_int64(m_handle.get(), column);
}

std::string Statement::text(int column) const {
    const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(m_handle.get(), column));
    const auto size = static_cast<std::size_t>(sqlite3_column_bytes(m_handle.get(), column));
    return text == nullptr ? std::string() : std::string(text, size);
}

Transaction::Transaction(Database& database, Purpose purpose) : m_database(database) {
    database.execute(purpose == Purpose::Write ? "BEGIN IMMEDIATE" : "BEGIN");
}

Transaction::~Transaction() {
    // Nothing can be done about a failing rollback: closing the connection rolls back as well.
    if (m_open) {
        sqlite3_exec(m_database.handle(), "ROLLBACK", nullptr, nullptr, nullptr);
    }
}

void Transaction::commit() {
    m_database.execute("COMMIT");
    m_open = false;
}

}  // namespace appliance
