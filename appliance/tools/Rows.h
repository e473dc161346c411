/// The records that resources cover.
#ifndef APPLIANCE_ROWS_H
#define APPLIANCE_ROWS_H

#include <algorithm>

#include "Resource.h"

namespace appliance {

/// Leaves those of @p rows for which @p holds.
template <typename Condition>
void keep(std::vector<Row>& rows, Condition holds) {
    const auto isOther = [&](const Row& row) { return !holds(row); };
    rows.erase(std::remove_if(rows.begin(), rows.end(), isOther), rows.end());
}

std::vector<Row> eachHost(const Hosts& hosts, const Request& request);

/// All objects of the kinds, host by host, by partition and number.
template <Kind... kinds>
std::vector<Row> each(const Hosts& hosts, const Request&) {
    std::vector<Row> rows;
    for (const auto& view : hosts) {
        const auto begin = static_cast<std::ptrdiff_t>(rows.size());
        for (Kind kind : {kinds...}) {
            for (const Object& object : view->all(kind)) {
                rows.push_back(rowOf(*view, object));
            }
        }
        if (sizeof...(kinds) == 1) {
            continue;
        }
        std::stable_sort(rows.begin() + begin, rows.end(), [](const Row& a, const Row& b) {
            return a.self->place() < b.self->place();
        });
    }
    return rows;
}

/// Those that a partition has.
template <Kind kind>
std::vector<Row> eachUsed(const Hosts& hosts, const Request& request) {
    std::vector<Row> rows = each<kind>(hosts, request);
    keep(rows, [](const Row& row) { return row.lpar != nullptr; });
    return rows;
}

/// Hosts, with the numbers that --maxmem and --procunits ask about.
std::vector<Row> hostCapacity(const Hosts& hosts, const Request& request);

/// Partitions of the environment that starts from tagged slots.
std::vector<Row> taggedLpars(const Hosts& hosts, const Request& request);

/// Utilisation samples of the time asked for: newest first, and within one moment by partition.
/// Nothing is recorded: what a sample of some past moment says is worked out from the state of
/// today, and is the same whenever that moment is asked for.
std::vector<Row> hostSamples(const Hosts& hosts, const Request& request);
std::vector<Row> lparSamples(const Hosts& hosts, const Request& request);

/// What is the same for every host of the appliance, so its first host.
std::vector<Row> theAppliance(const Hosts& hosts, const Request& request);

/// An appliance that manages one host only lives on that host, in its first I/O server.
/// @throws Failure NoSingleHostManager
std::vector<Row> singleHostManager(const Hosts& hosts, const Request& request);

/// Partitions; -dlpar, the one thing to ask about them, must have been given.
std::vector<Row> dynamicLpars(const Hosts& hosts, const Request& request);

/// The I/O server that -m and --id name, and what it serves to others. Only one that runs answers.
/// @throws Failure LparIdNotFound, NotIoServer, LparNotRunning
std::vector<Row> ioServer(const Hosts& hosts, const Request& request);
std::vector<Row> ioServerMappings(const Hosts& hosts, const Request& request);

}  // namespace appliance

#endif
