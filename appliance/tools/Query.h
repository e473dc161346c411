/// A run of a query tool: from its command line to the text of its answer.
#ifndef APPLIANCE_QUERY_H
#define APPLIANCE_QUERY_H

#include <string>

#include "Failure.h"
#include "Request.h"

namespace appliance {

/// The tool that a program name stands for.
/// @throws Failure UnknownTool
Tool toolNamed(const std::string& name);

/// The whole answer of @p tool: its help, one line for each record, or the sentence that there is
/// none.
/// @param arguments  null-terminated, without the program's name
/// @throws Failure whatever is wrong with the request or the state
std::string answer(Tool tool, const char* const* arguments, Language language);

}  // namespace appliance

#endif
