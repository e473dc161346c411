#include "Store.h"

#include <cstdlib>
#include <filesystem>

#include "Failure.h"

namespace appliance {

namespace {

/// Stands in the file's user_version; 0 there is a file in which nothing was made yet. Goes up
/// with every change of the schema or of what stored attributes mean.
constexpr std::int64_t kVersion = 2;

// The attributes of an object are one text, because an object is always read whole: a table with a
// row for each attribute would have tens of millions of rows on a large appliance.
constexpr const char* kSchema = R"(
    DROP TABLE IF EXISTS object;
    CREATE TABLE object(
        kind TEXT NOT NULL,
        host INTEGER NOT NULL,
        lpar INTEGER NOT NULL,
        number INTEGER NOT NULL,
        attributes TEXT NOT NULL,
        UNIQUE(kind, host, lpar, number)
    );
    CREATE TABLE IF NOT EXISTS journal(
        number INTEGER PRIMARY KEY AUTOINCREMENT,
        line TEXT NOT NULL
    );
)";

std::filesystem::path home() {
    const char* folder = std::getenv("APPLIANCE_HOME");
    if (folder == nullptr || *folder == '\0') {
        throw Failure(Fault::NoHome);
    }
    return folder;
}

/// Whether there is a state, in a file that can be opened: with a pipe or a device in its place,
/// opening would wait for ever.
/// @throws Failure StateUnusable
bool isThere(const std::filesystem::path& file) {
    std::error_code error;
    const auto type = std::filesystem::status(file, error).type();
    if (type == std::filesystem::file_type::not_found) {
        return false;
    }
    if (type == std::filesystem::file_type::regular) {
        return true;
    }
    throw Failure(Fault::StateUnusable,
                  {file.string(), error ? error.message() : "it is no regular file"});
}

/// The objects of @p kind for which @p condition holds, whose parameters are @p values.
template <typename... Values>
std::vector<Object> select(Database& database, Kind kind, const char* condition,
                           const Values&... values) {
    const std::string columns = "SELECT host, lpar, number, attributes FROM object WHERE kind = ? ";
    Statement query(database, columns + condition + " ORDER BY host, lpar, number");
    query.bind(kindName(kind), values...);
    std::vector<Object> objects;
    while (query.step()) {
        objects.emplace_back(kind, Place{query.integer(0), query.integer(1), query.integer(2)},
                             query.text(3));
    }
    return objects;
}

}  // namespace

Store::Store(std::unique_ptr<Database> database) : m_database(std::move(database)) {}

std::int64_t Store::version() {
    Statement query(*m_database, "PRAGMA user_version");
    query.step();
    return query.integer(0);
}

Store Store::open(Database::Access access) {
    const auto file = home() / "appliance.db";
    if (!isThere(file)) {
        throw Failure(Fault::NoState, {home().string()});
    }
    Store store(std::make_unique<Database>(file.string(), access));
    const std::int64_t version = store.version();
    if (version == 0) {
        throw Failure(Fault::NoState, {home().string()});
    }
    if (version != kVersion) {
        throw Failure(Fault::StateVersion, {std::to_string(version), std::to_string(kVersion)});
    }
    return store;
}

Store Store::create() {
    const auto file = home() / "appliance.db";
    std::error_code error;
    std::filesystem::create_directories(home(), error);
    if (error) {
        throw Failure(Fault::StateUnusable, {home().string(), error.message()});
    }
    isThere(file);
    return Store(std::make_unique<Database>(file.string(), Database::Access::Create));
}

void Store::clear(bool force) {
    if (!force && version() != 0) {
        throw Failure(Fault::StateExists, {home().string()});
    }
    m_put.reset();
    m_database->execute(kSchema);
    m_database->execute(("PRAGMA user_version = " + std::to_string(kVersion)).c_str());
}

void Store::put(const Object& object) {
    if (!m_put) {
        m_put = std::make_unique<Statement>(
            *m_database,
            "INSERT INTO object(kind, host, lpar, number, attributes) VALUES(?, ?, ?, ?, ?) "
            "ON CONFLICT(kind, host, lpar, number) DO UPDATE SET attributes = excluded.attributes");
    }
    const Place& place = object.place();
    m_put->bind(kindName(object.kind()), place.host, place.lpar, place.number, object.stored());
    m_put->step();
}

void Store::remove(Kind kind, const Place& place) {
    Statement query(*m_database,
                    "DELETE FROM object WHERE kind = ? AND host = ? AND lpar = ? AND number = ?");
    query.bind(kindName(kind), place.host, place.lpar, place.number);
    query.step();
}

std::optional<Object> Store::find(Kind kind, const Place& place) {
    std::vector<Object> found =
        select(*m_database, kind, "AND host = ? AND lpar = ? AND number = ?", place.host,
               place.lpar, place.number);
    if (found.empty()) {
        return std::nullopt;
    }
    return std::move(found.front());
}

void Store::append(const std::string& line) {
    Statement insert(*m_database, "INSERT INTO journal(line) VALUES(?)");
    insert.bind(line);
    insert.step();
}

std::vector<std::pair<std::int64_t, std::string>> Store::journal(std::int64_t after,
                                                                 std::int64_t most) {
    Statement query(*m_database,
                    "SELECT number, line FROM journal WHERE number > ? ORDER BY number LIMIT ?");
    query.bind(after, most);
    std::vector<std::pair<std::int64_t, std::string>> lines;
    while (query.step()) {
        lines.emplace_back(query.integer(0), query.text(1));
    }
    return lines;
}

std::int64_t Store::journalEnd() {
    Statement query(*m_database, "SELECT ifnull(max(number), 0) FROM journal");
    return query.step() ? query.integer(0) : 0;
}

std::vector<Object> Store::all(Kind kind) { return select(*m_database, kind, ""); }

std::vector<Object> Store::all(Kind kind, std::int64_t host) {
    return select(*m_database, kind, "AND host = ?", host);
}

}  // namespace appliance
