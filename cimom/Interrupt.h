/// Verbs that wait, until a signal asks them to end. One waits in a process.
#ifndef CIMOM_INTERRUPT_H
#define CIMOM_INTERRUPT_H

namespace cimom {

/// From here on SIGINT and SIGTERM wake. May be called again, as a Java VM of the providers takes
/// the signals over.
/// @throws Failure when there is no pipe
void wakeAtSignals();

/// Wakes; from any thread, and from handlers of signals.
void wake();

/// Waits until woken, or for so long; a negative number is no limit. What woke is forgotten.
/// @return whether something woke
bool waitForWake(int milliseconds);

}  // namespace cimom

#endif
