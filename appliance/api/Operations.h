/// All operations of the management library that return records, with the family of their records:
/// each row stands for a definition, and for a name by which failures are planned.
///
///     #define NAME(OPERATION, FAMILY) #OPERATION,
///     const char* const names[] = {API_OPERATIONS(NAME, NAME, NAME, NAME)};
#ifndef APPLIANCE_OPERATIONS_H
#define APPLIANCE_OPERATIONS_H

/// @param ALL  for rows that read all hosts
/// @param OF_HOST  for those that read one host
/// @param OF_LPAR  for those that read one partition
/// @param NAMED  for those that read one object of a partition by its name
// clang-format off
#define API_OPERATIONS(ALL, OF_HOST, OF_LPAR, NAMED)      \
    ALL(getAllCecs, kCecs)                                \
    ALL(getAllLpars, kLpars)                              \
    ALL(getAllLparProfiles, kProfiles)                    \
    ALL(getAllLparVirtualSerial, kSerials)                \
    ALL(getAllLparVirtualScsi, kScsis)                    \
    ALL(getAllLparVirtualEthernet, kEthernets)            \
    ALL(getAllIoSlots, kIoSlots)                          \
    ALL(getAllCecMemoryCfg, kCecMemory)                   \
    ALL(getAllCecProcessorCfg, kCecProcessors)            \
    ALL(getAllCecMemoryPoolCfgs, kCecMemoryPools)         \
    ALL(getAllCecProcessorPoolCfg, kCecProcessorPools)    \
    ALL(getAllLparMemoryCfgs, kLparMemory)                \
    ALL(getAllLparProcessorCfgs, kLparProcessors)         \
                                                          \
    OF_HOST(getCecObj, kCecs)                             \
    OF_HOST(getAllLparsFromCec, kLpars)                   \
    OF_HOST(getAllLparProfilesFromCec, kProfiles)         \
    OF_HOST(getVirtualSerial, kSerials)                   \
    OF_HOST(getVirtualScsi, kScsis)                       \
    OF_HOST(getVirtualEthernet, kEthernets)               \
    OF_HOST(getIoSlots, kIoSlots)                         \
    OF_HOST(getCecMemoryCfg, kCecMemory)                  \
    OF_HOST(getCecProcessorCfg, kCecProcessors)           \
    OF_HOST(getCecMemoryPoolCfg, kCecMemoryPools)         \
    OF_HOST(getCecProcessorPoolCfg, kCecProcessorPools)   \
    OF_HOST(getAllLparMemoryCfg, kLparMemory)             \
    OF_HOST(getAllLparProcessorCfg, kLparProcessors)      \
                                                          \
    OF_LPAR(getLparObj, kLpars)                           \
    OF_LPAR(getAllLparProfilesFromLpar, kProfiles)        \
    OF_LPAR(getLparVirtualSerial, kSerials)               \
    OF_LPAR(getLparVirtualScsi, kScsis)                   \
    OF_LPAR(getLparVirtualEthernet, kEthernets)           \
    OF_LPAR(getLparIoSlots, kIoSlots)                     \
    OF_LPAR(getLparMemoryCfg, kLparMemory)                \
    OF_LPAR(getLparProcessorCfg, kLparProcessors)         \
                                                          \
    NAMED(getLparProfile, kProfiles)
// clang-format on

#endif
