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

/// The last column: whether a user is shown the text.
constexpr struct {
    int number;
    const char* text;
    bool isShown;
} kPartitionStates[] = {
    {0, "Not Activated", true}, {1, "Starting", true},
    {2, "Running", true},       {3, "Shutting Down", true},
    {4, "Error", true},         {8, "Open Firmware", true},
    {9, "Suspended", true},     {252, "Not Available", false},
    {255, "unknown", false},
};

constexpr Word kBootModes[] = {{1, "norm"}, {2, "ds"}, {3, "sms"}, {4, "of"}, {5, "dd"}};

constexpr Word kEnvironments[] = {{1, "tmxlinux"},   {2, "tmxlinux"}, {3, "xbrgserver"},
                                  {4, "xbrgserver"}, {129, "osq00"},  {130, "osq00"}};

/// The number, the text of fields, and that for a user.
constexpr struct {
    int number;
    const char* text;
    const char* shown;
} kCompatModes[] = {
    {0, "CORAL5", "C5"},
    {1, "CORAL6_enhanced", "C6 enhanced"},
    {2, "CORAL6", "C6"},
    {3, "CORAL6+", "C6+"},
    {4, "CORAL7", "C7"},
    {5, "CORAL6+_enhanced", "C6+ enhanced"},
    {6, "CORAL7_enhanced", "C7 enhanced"},
    {7, "CORAL7+", "C7+"},
    {8, "CORAL7+_enhanced", "C7+ enhanced"},
    {9, "CORAL8", "C8"},
    {10, "CORAL8_enhanced", "C8 enhanced"},
    {63, "default", "Default"},
};

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

/// The row of a number; null if the table does not list it.
template <class Row, std::size_t N>
const Row* rowOf(const Row (&rows)[N], int number) {
    for (const Row& row : rows) {
        if (row.number == number) {
            return &row;
        }
    }
    return nullptr;
}

template <class Row, std::size_t N>
const char* textOf(const Row (&rows)[N], int number, const char* otherwise) {
    const Row* const row = rowOf(rows, number);
    return row == nullptr ? otherwise : row->text;
}

}  // namespace

const char* zemHostStateText(int state) { return textOf(kHostStates, state, ""); }

const char* zemPartitionStateText(int state) { return textOf(kPartitionStates, state, ""); }

const char* zemPartitionStateShown(int state) {
    const auto* const row = rowOf(kPartitionStates, state);
    return row == nullptr || !row->isShown ? "unknown" : row->text;
}

const char* zemBootModeText(int bootMode, const char* otherwise) {
    return textOf(kBootModes, bootMode, otherwise);
}

int zemBootModeOf(const char* text) {
    for (const Word& word : kBootModes) {
        if (std::strcmp(word.text, text) == 0) {
            return word.number;
        }
    }
    return -1;
}

const char* zemCompatModeText(int mode) { return textOf(kCompatModes, mode, "unknown"); }

const char* zemCompatModeShown(int mode) {
    const auto* const row = rowOf(kCompatModes, mode);
    return row == nullptr ? "unknown" : row->shown;
}

const char* zemEnvironmentText(int definitionState) {
    return textOf(kEnvironments, definitionState, "");
}

zemKeylock zemKeylockOf(int number) {
    const auto* const row = rowOf(kKeylocks, number);
    return row == nullptr ? KEYLOCK_UNKNOWN : row->position;
}

const char* zemKeylockWord(int number, const char* otherwise) {
    return textOf(kKeylocks, number, otherwise);
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
    const auto* const row = rowOf(kMigrationStates, number);
    return row == nullptr ? MIGRATION_UNKNOWN : row->state;
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
