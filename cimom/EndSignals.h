/// SIGINT and SIGTERM, for whatever runs until one of them comes.
#ifndef CIMOM_END_SIGNALS_H
#define CIMOM_END_SIGNALS_H

#include <chrono>

namespace cimom {

/// Takes the two signals from its construction on; there is one in a process.
///
/// By handlers and not by blocking them: the tools that providers start must be free of both. A
/// Java VM of the providers takes the handlers over, which is why waiting sets them again.
class EndSignals {
public:
    /// @throws Failure CMPI_RC_ERROR_SYSTEM
    EndSignals();

    /// Waits until a signal came, or wake() was called, and forgets it.
    /// @return false when the time was over first
    bool wait(std::chrono::milliseconds time);
    /// May be called from a handler, and on any thread.
    static void wake();
};

}  // namespace cimom

#endif
