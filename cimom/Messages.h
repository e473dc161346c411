/// Translated message texts of providers.
///
/// A bundle is a set of files `<name>_<language>.json` in the message folder, each an object of
/// texts by message id; `<name>.json` serves when no language fits:
///
///     osbase_de.json:  {"Error.KeyNotFound": "Schlüssel {0} der Klasse {1} fehlt."}
///
/// The empty bundle name stands for the bundle "default". Of a bundle path with folders, the
/// path itself is tried first, then its last part in the message folder. In a text, $0 to $9 and
/// {0} to {9} stand for the inserts.
#ifndef CIMOM_MESSAGES_H
#define CIMOM_MESSAGES_H

#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>
#include <vector>

namespace cimom {

using MessageTexts = std::map<std::string, std::string>;

/// Languages of an Accept-Language value or a locale name, the most wanted first, each followed
/// by its more general form: "de-AT;q=0.5,fr" gives fr, de_AT, de.
std::vector<std::string> wantedLanguages(const std::string& acceptLanguage);

/// The text with its inserts in place; a marker without insert stays as it is.
std::string withInserts(const std::string& text, const std::vector<std::string>& inserts);

/// The bundles of a message folder. Files are read once. Thread-safe.
class MessageStore {
public:
    explicit MessageStore(std::string folder) : m_folder(std::move(folder)) {}

    using Handle = const MessageTexts*;
    /// Opens a bundle in the first language that it has; to be closed.
    /// @throws Failure CMPI_RC_ERR_NOT_FOUND when there is none
    Handle open(const std::string& bundle, const std::vector<std::string>& languages);
    /// @return false for a handle that is not open
    bool close(Handle handle);
    /// The text of the id in an open bundle; null when the bundle lacks it.
    /// @throws Failure CMPI_RC_ERR_INVALID_HANDLE for a handle that is not open
    const std::string* find(Handle handle, const std::string& id);

private:
    Handle read(const std::string& file);

    const std::string m_folder;
    std::mutex m_mutex;
    std::map<std::string, std::unique_ptr<const MessageTexts>> m_files;
    std::unordered_multiset<Handle> m_open;
};

}  // namespace cimom

#endif
