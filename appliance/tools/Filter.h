/// Filters of the query tools: "name=value,value,name=value".
///
/// An item may be quoted as a whole, and then holds one name; inside and outside a quoted item, a
/// value that begins with a quote is read up to its closing quote. Names of partitions may hold
/// commas, and callers write them into filters as they are: so the longest run of values that is,
/// with its commas, a name that exists counts as that one name.
#ifndef APPLIANCE_FILTER_H
#define APPLIANCE_FILTER_H

#include <string>
#include <vector>

#include "Resource.h"

namespace appliance {

/// Leaves those of @p rows to which the filter @p text applies.
/// @param names  the filters that there are, with commas between them
/// @throws Failure UnknownFilter, BadFilter; LparIdNotFound or LparNameNotFound when a value of
///         "lpar_ids" or "lpar_names" is no partition of @p hosts
void applyFilter(const std::string& text, const char* names, const Hosts& hosts,
                 std::vector<Row>& rows);

}  // namespace appliance

#endif
