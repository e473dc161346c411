#include "SubscriptionFile.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <stdexcept>

#include "Failure.h"

namespace cimom {

namespace {

constexpr const char* kFileName = "/subscriptions.db";
constexpr const char* kForm = "1";

/// Makes the file where there is none, for nobody but its owner, and looks whether it is that.
void prepare(const std::string& file) {
    const int descriptor =
        open(file.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC, 0600);
    struct stat status = {};
    const bool known = descriptor >= 0 && fstat(descriptor, &status) == 0;
    const int error = errno;
    if (descriptor >= 0) {
        close(descriptor);
    }
    if (!known) {
        throw std::runtime_error(file + ": " + std::strerror(error));
    }
    if (!S_ISREG(status.st_mode) || status.st_uid != geteuid() ||
        (status.st_mode & (S_IRWXG | S_IRWXO)) != 0) {
        throw std::runtime_error(file + ": others may read or change it; make it mode 600");
    }
}

std::string fileAt(const std::string& path) {
    struct stat status = {};
    const bool folder = stat(path.c_str(), &status) == 0 && S_ISDIR(status.st_mode);
    return folder ? path + kFileName : path;
}

}  // namespace

void SubscriptionFile::Close::operator()(sqlite3* handle) const { sqlite3_close(handle); }

SubscriptionFile::SubscriptionFile(const std::string& path) {
    if (path.empty()) {
        return;
    }
    m_path = fileAt(path);
    prepare(m_path);
    sqlite3* handle = nullptr;
    const int opened = sqlite3_open_v2(m_path.c_str(), &handle, SQLITE_OPEN_READWRITE, nullptr);
    m_handle.reset(handle);
    if (opened != SQLITE_OK) {
        throw std::runtime_error(m_path + ": " + sqlite3_errstr(opened));
    }
    std::vector<Row> form;
    run("PRAGMA locking_mode = EXCLUSIVE", {});
    run("BEGIN EXCLUSIVE", {});  // which is how a second process finds out
    run("SELECT user_version, '', '' FROM pragma_user_version", {}, &form);
    if (form.at(0).id == "0") {
        run("CREATE TABLE instance (number INTEGER PRIMARY KEY, id TEXT UNIQUE NOT NULL, "
            "owner TEXT NOT NULL, text TEXT NOT NULL)",
            {});
        run("PRAGMA user_version = 1", {});
    } else if (form.at(0).id != kForm) {
        throw std::runtime_error(m_path + ": made by a later version");
    }
    run("COMMIT", {});
}

std::vector<SubscriptionFile::Row> SubscriptionFile::rows() {
    std::vector<Row> found;
    if (m_handle) {
        run("SELECT id, owner, text FROM instance ORDER BY number", {}, &found);
    }
    return found;
}

void SubscriptionFile::put(const Row& row) {
    change(
        "INSERT INTO instance (id, owner, text) VALUES (?, ?, ?) ON CONFLICT (id) DO UPDATE "
        "SET owner = excluded.owner, text = excluded.text",
        {row.id, row.owner, row.instance});
}
void SubscriptionFile::erase(const std::string& id) {
    change("DELETE FROM instance WHERE id = ?", {id});
}

void SubscriptionFile::change(const char* sql, const std::vector<std::string>& values) {
    if (!m_handle) {
        return;
    }
    try {
        run(sql, values);
    } catch (const std::runtime_error& error) {
        throw Failure(CMPI_RC_ERR_FAILED, error.what());
    }
}

void SubscriptionFile::run(const char* sql, const std::vector<std::string>& values,
                           std::vector<Row>* found) {
    sqlite3_stmt* made = nullptr;
    int code = sqlite3_prepare_v2(m_handle.get(), sql, -1, &made, nullptr);
    const std::unique_ptr<sqlite3_stmt, int (*)(sqlite3_stmt*)> statement(made, sqlite3_finalize);
    for (std::size_t i = 0; i < values.size() && code == SQLITE_OK; ++i) {
        code = sqlite3_bind_text(made, static_cast<int>(i) + 1, values[i].data(),
                                 static_cast<int>(values[i].size()), SQLITE_STATIC);
    }
    const auto column = [&](int number) {
        const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(made, number));
        return std::string(text ? text : "",
                           static_cast<std::size_t>(sqlite3_column_bytes(made, number)));
    };
    if (code == SQLITE_OK) {
        while ((code = sqlite3_step(made)) == SQLITE_ROW) {
            if (found) {
                found->push_back({column(0), column(1), column(2)});
            }
        }
    }
    if (code == SQLITE_BUSY) {
        throw std::runtime_error(m_path + ": in use by another process");
    }
    if (code != SQLITE_DONE) {
        throw std::runtime_error(m_path + ": " + sqlite3_errmsg(m_handle.get()));
    }
}

}  // namespace cimom
