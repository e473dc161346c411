/// What the management library tells about an object of a kind: its keys, and what stands under
/// each.
///
/// Where the tools print words, the library gives codes: the tables of Family.cpp hold them. What
/// is a number or a name is taken from the attribute that the tools print.
#ifndef APPLIANCE_FAMILY_H
#define APPLIANCE_FAMILY_H

#include <string>
#include <vector>

#include "View.h"

namespace appliance {

using Make = std::string (*)(const Row& row, const std::string& attribute);

struct Property {
    std::string key;
    int level;  ///< 1: in every result, 2: in full ones only
    Make make;
    std::string attribute;
};

/// A group of operations that return the same kind of record.
struct Family {
    int classType;
    Kind kind;
    std::vector<Property> properties;
};

extern const Family kCecs, kLpars, kProfiles;
extern const Family kCecMemory, kCecMemoryPools, kCecProcessors, kCecProcessorPools;
extern const Family kLparMemory, kLparProcessors;
extern const Family kEthernets, kScsis, kSerials, kIoSlots;

}  // namespace appliance

#endif
