/// What has to outlast the object manager of its clients' subscriptions, in a file of SQLite.
///
/// One process uses a file at a time, and nobody but its owner may read it.
/// Thread-safety: one thread at a time.
#ifndef CIMOM_SUBSCRIPTION_FILE_H
#define CIMOM_SUBSCRIPTION_FILE_H

#include <memory>
#include <string>
#include <vector>

struct sqlite3;

namespace cimom {

class SubscriptionFile {
public:
    struct Row {
        std::string id;
        std::string owner;     ///< who made it; empty for nobody in particular
        std::string instance;  ///< as printValue prints it
    };

    /// @param path  a folder, in which the file is subscriptions.db, or a file; made where there is
    ///              none. Empty for nothing that lasts.
    /// @throws std::runtime_error when it is not to be used, is somebody else's, or in use
    explicit SubscriptionFile(const std::string& path);

    /// In the order in which they were put in first.
    /// @throws std::runtime_error
    std::vector<Row> rows();
    /// Keeps a row, in place of the one of its id.
    /// @throws Failure CMPI_RC_ERR_FAILED, and nothing is changed then
    void put(const Row& row);
    /// @throws Failure CMPI_RC_ERR_FAILED, and nothing is changed then
    void erase(const std::string& id);

private:
    struct Close {
        void operator()(sqlite3* handle) const;
    };
    void run(const char* sql, const std::vector<std::string>& values,
             std::vector<Row>* found = nullptr);
    void change(const char* sql, const std::vector<std::string>& values);

    std::string m_path;
    std::unique_ptr<sqlite3, Close> m_handle;  // null where nothing lasts
};

}  // namespace cimom

#endif
