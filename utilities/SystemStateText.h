/// The words for the numbers by which the management library tells states, and back.
///
/// One table a kind. Who reads it says what a number that it does not list gives, by the function
/// or by the argument @p otherwise; text that is shown to a user differs from that of a field where
/// a table has two columns.
///
/// Plain functions of their arguments; any thread may call them. Results are literals, or
/// @p otherwise.
#ifndef SYSTEM_STATE_TEXT_H
#define SYSTEM_STATE_TEXT_H

/// State of a host or a partition, as "Operating" or "Not Activated"; "" for an unknown number.
const char* zemHostStateText(int state);
const char* zemPartitionStateText(int state);

/// State of a partition for a user: "unknown" also for numbers that tell that there is no state.
const char* zemPartitionStateShown(int state);

/// Boot mode, as "norm", and the number of such a word; -1 for an unknown word.
const char* zemBootModeText(int bootMode, const char* otherwise = "unknown");
int zemBootModeOf(const char* text);

/// Processor generation with which a partition is compatible, as "CORAL7+", and for a user, as
/// "C7+"; "unknown" for an unknown number.
const char* zemCompatModeText(int mode);
const char* zemCompatModeShown(int mode);

/// What runs in a partition that is defined so, as "osq00"; "" for an unknown number.
const char* zemEnvironmentText(int definitionState);

/// Positions of a partition's keylock as this library numbers them.
enum zemKeylock { KEYLOCK_UNKNOWN = -1, KEYLOCK_NORM = 0, KEYLOCK_MANUAL = 1 };

/// The position for the management library's number, and the tools' word for that number.
zemKeylock zemKeylockOf(int number);
const char* zemKeylockWord(int number, const char* otherwise);

/// The tools' word for a position; "" if it is unknown.
const char* zemKeylockText(int position);

/// States of a partition's migration as this library numbers them.
enum zemMigrationState {
    MIGRATION_UNKNOWN = 0,
    MIGRATION_NOT_MIGRATING = 1,
    MIGRATION_STARTING = 2,
    MIGRATION_STOPPED = 3,
    MIGRATION_IN_PROGRESS = 4,
    MIGRATION_LOST_CONNECTION = 5,
    MIGRATION_COMPLETE = 6
};

/// The state for the management library's number, and for a tool's text in any case of letters.
zemMigrationState zemMigrationStateOf(int number);
zemMigrationState zemMigrationStateOf(const char* text);

/// The tools' text for a state; "" if it is unknown.
const char* zemMigrationStateText(zemMigrationState state);

#endif
