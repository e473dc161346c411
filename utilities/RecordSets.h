/// What a query of a tool yields: records, each keyed by attribute index.
///
/// A record owns its values, and the array its records. Queries return the array by value, which
/// hands the records over without copying them.
///
///     zemString value = (*records.getElementAt(0))[ATTR_NAME];  // throws the integer 3 if absent
///
/// Thread-safety: none; a result belongs to the operation that asked.
#ifndef RECORD_SETS_H
#define RECORD_SETS_H

#include "DynamicArray.h"
#include "HashTable.h"
#include "StringUtils.h"

/// One output record of a tool.
typedef zemHashTable<int, zemString, hashFunc> zemRecordType;

/// The records of one query in the tool's order.
typedef zemDynamicArray<zemRecordType> zemRecordSetsType;

#endif
