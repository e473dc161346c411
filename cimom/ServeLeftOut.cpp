// Takes the place of Serve.cpp in a build without the libraries for HTTP and XML.

#include "Failure.h"
#include "Serve.h"

#ifndef CIMOM_SERVE_MISSES  // told by a build that leaves it out
#define CIMOM_SERVE_MISSES "its libraries"
#endif

namespace cimom {

Reply serve(Session&, const Arguments&) {
    throw Failure(CMPI_RC_ERR_NOT_SUPPORTED,
                  "serve was left out of this build, which found no " CIMOM_SERVE_MISSES);
}

}  // namespace cimom
