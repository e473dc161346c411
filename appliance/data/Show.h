/// What the appliance holds, for people and as JSON.
#ifndef APPLIANCE_SHOW_H
#define APPLIANCE_SHOW_H

#include <string>

#include "Store.h"

namespace appliance {

/// Hosts with what is free on them, and their partitions as a table.
std::string showText(Store& store);

/// Every object with the attributes that it was given: {"host": [{...}, ...], "lpar": [...], ...}.
std::string showJson(Store& store);

/// A line of the journal with its number as a JSON object; what it holds is told by Change.h.
std::string journalJson(std::int64_t number, const std::string& line);

/// The same for people: when, what tool, and each object with what became of it. A line that has
/// another form stands as it is.
std::string journalText(std::int64_t number, const std::string& line);

}  // namespace appliance

#endif
