/// The verb that serves CIM-XML over HTTP until it is told to end.
#ifndef CIMOM_SERVE_H
#define CIMOM_SERVE_H

#include "Commands.h"

namespace cimom {

/// Prints where it serves, then with --log a line for each request; returns when SIGTERM or SIGINT
/// came and what was running has been answered.
/// @throws Failure for options that do not fit together, std::runtime_error for files and
///         addresses that cannot be used
Reply serve(Session& session, const Arguments& arguments);

}  // namespace cimom

#endif
