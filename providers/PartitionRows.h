/// The properties of ORXC_LPAR_CS, and its key.
#ifndef PARTITION_ROWS_H
#define PARTITION_ROWS_H

#include <string>
#include <vector>

#include "PropertyRows.h"

constexpr const char kPartitionClass[] = "ORXC_LPAR_CS";

/// Added to attributes of a profile, to tell them from those of a partition.
constexpr int kOfProfile = 1000;

const std::vector<PropertyRow>& partitionRows();

/// The parts of the key <lparId>*<Name of the host>.
struct PartitionName {
    std::string id;
    std::string host;
};

/// @return false when @p name is no such key
bool splitPartitionName(const std::string& name, PartitionName& key);

#endif
