/// What the object manager serves to clients by itself, in root/interop: itself, its namespaces,
/// and their indication subscriptions.
///
/// Thread-safety: that of Subscriptions.
#ifndef CIMOM_INTEROP_H
#define CIMOM_INTEROP_H

#include <memory>
#include <string>

#include "Server.h"
#include "Subscriptions.h"

namespace cimom {

/// Registers at the server who serves the classes; the subscriptions live as long as it does.
/// @param version  of this program
void serveInterop(Server& server, const std::string& version,
                  std::shared_ptr<Subscriptions> subscriptions);

}  // namespace cimom

#endif
