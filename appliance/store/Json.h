/// What the appliance writes as JSON, and reads of it: the one place that knows a library for that.
///
/// A line of the journal is an object with the tool, the time, notes, and each object that a change
/// made another:
///
///     {"tool":"edplat","time":1700000000,"objects":[{"event":"modify","kind":"lpar",
///      "host":"1111-AAA*0000001","lpar":3,"number":0,"old":{"name":"web"},"new":{"name":"www"}}]}
///
/// "old" and "new" have the attributes that differ; an "add" has no "old", a "delete" no "new".
/// Bytes that are no UTF-8, which the stored state keeps as they are, are replaced.
#ifndef APPLIANCE_JSON_H
#define APPLIANCE_JSON_H

#include <ctime>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "Store.h"

namespace appliance {

/// An object before and after a change; one of them may be missing.
struct ChangedObject {
    std::string host;  ///< type and serial number
    std::optional<Object> before, after;
};

/// Objects with values by name, which stand beside those of the journal's line.
using JournalNotes = std::map<std::string, std::vector<std::pair<const char*, std::string>>>;

/// Empty when no object differs.
std::string journalLine(const char* tool, std::time_t time, const JournalNotes& notes,
                        const std::vector<ChangedObject>& objects);

/// A line with its number as a JSON object.
std::string journalJson(std::int64_t number, const std::string& line);

/// The same for people: when, what tool, and each object with what became of it. A line that has
/// another form stands as it is.
std::string journalText(std::int64_t number, const std::string& line);

/// Every object with the attributes that it was given: {"host": [{...}, ...], "lpar": [...], ...}.
std::string showJson(Store& store);

}  // namespace appliance

#endif
