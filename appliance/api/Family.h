/// What the management library tells about an object of a kind: its keys, and what stands under
/// each.
///
/// Where the tools print words, the library gives codes: the tables of Family.cpp hold them. What
/// is a number or a name is taken from the attribute that the tools print.
#ifndef APPLIANCE_FAMILY_H
#define APPLIANCE_FAMILY_H

#include <cstddef>
#include <string>

#include "View.h"

namespace appliance {

struct Property {
    const char* key;
    int level;  ///< 1: in every result, 2: in full ones only
    std::string (*make)(const Row& row, const char* attribute);
    const char* attribute;
};

/// A group of operations that return the same kind of record.
struct Family {
    int classType;
    Kind kind;
    const Property* properties;
    std::size_t size;

    const Property* begin() const { return properties; }
    const Property* end() const { return properties + size; }
};

extern const Family kCecs, kLpars, kProfiles;
extern const Family kCecMemory, kCecMemoryPools, kCecProcessors, kCecProcessorPools;
extern const Family kLparMemory, kLparProcessors;
extern const Family kEthernets, kScsis, kSerials, kIoSlots;

}  // namespace appliance

#endif
