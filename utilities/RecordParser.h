/// Reads the output of the query tools: one record a line, fields separated by commas, no header.
///
/// A field, or any run inside it, may be wrapped in double quotes, which are dropped; within them
/// a comma is a character like any other and a double quote is written twice. A record is cut at
/// its newline before quotes are looked at, so no value holds a newline.
///
///     "a,1",b        two fields, "a,1" and "b"
///     x              the missing second field is empty
///
/// Records go to the caller's array, which owns them. Plain function; any thread may call it.
#ifndef RECORD_PARSER_H
#define RECORD_PARSER_H

#include <string_view>

#include "RecordSets.h"

/// Appends the records of @p output to @p results.
/// @param keys  key of each field from left to right; null: the position of the field
/// @param count  fields read of each record; fewer in the record are empty, more are passed over
/// @return false when a record ends inside a quoted run; the records before it are in @p results
bool zemParseRecords(std::string_view output, const int* keys, unsigned count,
                     zemRecordSetsType& results);

/// Appends all fields of @p record, which is one whatever it holds, to @p fields: at least one.
/// @return false when it ends inside a quoted run; the fields before that are in @p fields
bool zemParseFields(std::string_view record, zemDynamicArray<zemString>& fields);

#endif
