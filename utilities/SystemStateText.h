/// The words for the numbers by which the management library tells states, and back.
///
/// Plain functions of their arguments; any thread may call them. Results are literals.
#ifndef SYSTEM_STATE_TEXT_H
#define SYSTEM_STATE_TEXT_H

/// State of a host or a partition, as "Operating" or "Not Activated"; "" for an unknown number.
const char* zemHostStateText(int state);
const char* zemPartitionStateText(int state);

/// Boot mode, as "norm"; "unknown" for an unknown number.
const char* zemBootModeText(int bootMode);

/// What runs in a partition that is defined so, as "osq00"; "" for an unknown number.
const char* zemEnvironmentText(int definitionState);

/// Positions of a partition's keylock as this library numbers them.
enum zemKeylock { KEYLOCK_UNKNOWN = -1, KEYLOCK_NORM = 0, KEYLOCK_MANUAL = 1 };

/// The position for the management library's number.
zemKeylock zemKeylockOf(int number);

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
