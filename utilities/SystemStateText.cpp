#include "SystemStateText.h"

#include <strings.h>

#include <cstddef>
#include <cstring>

namespace {

struct Word {
    int number;
    const char* text;
};

constexpr Word kHostStates[] = {
    {0, "Standby"},
    {1, "Operating"},
    {3, "Power Off"},
    {6, "Initializing"},
    {12, "Error"},
    {13, "Error - Dump in progress"},
    {14, "Error - Terminated"},
    {15, "QCAP Click to Accept"},
    {17, "Standby"},
    {32, "Power Off In Progress"},
    {33, "Service Processor Failover In Progress"},
    {240, "Failed Authentication"},
    {241, "Failed Authentication"},
    {242, "Pending Authentication - Password Updates Required"},
    {243, "Pending Authentication - Password Updates Required"},
    {250, "Version Mismatch"},
    {251, "Recovery"},
    {253, "Incomplete"},
    {254, "No Connection"},
};

constexpr Word kPartitionStates[] = {
    {0, "Not Activated"}, {1, "Starting"},        {2, "Running"},
    {3, "Shutting Down"}, {4, "Error"},           {8, "Open Firmware"},
    {9, "Suspended"},     {252, "Not Available"}, {255, "unknown"},
};

constexpr Word kBootModes[] = {{1, "norm"}, {2, "ds"}, {3, "sms"}, {4, "of"}, {5, "dd"}};

constexpr Word kEnvironments[] = {{1, "tmxlinux"},   {2, "tmxlinux"}, {3, "xbrgserver"},
                                  {4, "xbrgserver"}, {129, "osq00"},  {130, "osq00"}};

/// The tools' word, the number of the management library, and that of this library's objects.
constexpr struct {
    const char* text;
    int number;
    zemKeylock position;
} kKeylocks[] = {
    {"norm", 4, KEYLOCK_NORM},
    {"manual", 2, KEYLOCK_MANUAL},
};

/// A state that has several numbers stands in several rows; its text is that of the first.
constexpr struct {
    int number;
    const char* text;
    zemMigrationState state;
} kMigrationStates[] = {
    {9, "Not Migrating", MIGRATION_NOT_MIGRATING},
    {10, "Migration Starting", MIGRATION_STARTING},
    {12, "Migration Stopped", MIGRATION_STOPPED},
    {13, "Migration In Progress", MIGRATION_IN_PROGRESS},
    {14, "Migration In Progress", MIGRATION_IN_PROGRESS},
    {15, "Migration In Progress", MIGRATION_IN_PROGRESS},
    {255, "Lost Connection", MIGRATION_LOST_CONNECTION},
    {16, "Migration Complete", MIGRATION_COMPLETE},
};

template <std::size_t N>
const char* textOf(const Word (&words)[N], int number, const char* otherwise) {
    for (const Word& word : words) {
        if (word.number == number) {
            return word.text;
        }
    }
    return otherwise;
}

}  // namespace

const char* zemHostStateText(int state) { return textOf(kHostStates, state, ""); }

const char* zemPartitionStateText(int state) { return textOf(kPartitionStates, state, ""); }

const char* zemBootModeText(int bootMode) { return textOf(kBootModes, bootMode, "unknown"); }

const char* zemEnvironmentText(int definitionState) {
    return textOf(kEnvironments, definitionState, "");
}

zemKeylock zemKeylockOf(int number) {
    for (const auto& row : kKeylocks) {
        if (row.number == number) {
            return row.position;
        }
    }
    return KEYLOCK_UNKNOWN;
}

const char* zemKeylockText(int position) {
    for (const auto& row : kKeylocks) {
        if (row.position == position) {
            return row.text;
        }
    }
    return "";
}

zemMigrationState zemMigrationStateOf(int number) {
    for (const auto& row : kMigrationStates) {
        if (row.number == number) {
            return row.state;
        }
    }
    return MIGRATION_UNKNOWN;
}

zemMigrationState zemMigrationStateOf(const char* text) {
    for (const auto& row : kMigrationStates) {
        // The tools put more words around this one.
        const bool fits = row.state == MIGRATION_LOST_CONNECTION
                              ? strcasestr(text, row.text) != nullptr
                              : strcasecmp(text, row.text) == 0;
        if (fits) {
            return row.state;
        }
    }
    return MIGRATION_UNKNOWN;
}

const char* zemMigrationStateText(zemMigrationState state) {
    for (const auto& row : kMigrationStates) {
        if (row.state == state) {
            return row.text;
        }
    }
    return "";
}
