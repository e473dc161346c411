/// Appliances to start from. Each is written into a store that is empty and in a transaction.
#ifndef APPLIANCE_APPLIANCES_H
#define APPLIANCE_APPLIANCES_H

#include <cstdint>
#include <functional>

#include "Store.h"

namespace appliance {

/// Four hosts in four states with fourteen partitions of all environments: small enough to know
/// by heart, and with a case of everything that is hard to read.
void fillDemo(Store& store);

struct Size {
    std::int64_t hosts;
    std::int64_t lpars;  ///< of each host
    std::uint64_t seed;
    std::int64_t pools = 1;  ///< shared processor pools of each host
};

/// Any number of hosts and partitions; the same for the same Size on every machine.
/// @param progress  called from time to time with how many hosts are done
void fillGenerated(Store& store, const Size& size,
                   const std::function<void(std::int64_t)>& progress);

}  // namespace appliance

#endif
