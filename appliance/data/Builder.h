/// Makes a host with everything on it out of a short plan: the demo and the generator say what is
/// particular, the builder adds what follows.
///
///     HostBuilder host(store, 1, {"alpha", "1111-AAA", "0000001", "Operating"});
///     host.add({1, "xbrg1", "xbrgserver", "Running"});
///     host.finish();
#ifndef APPLIANCE_BUILDER_H
#define APPLIANCE_BUILDER_H

#include <map>
#include <string>
#include <vector>

#include "Store.h"

namespace appliance {

struct LparPlan {
    std::int64_t id;
    std::string name;
    std::string env;
    std::string state;
    std::int64_t mem = 1024;      ///< megabytes
    std::int64_t procUnits = 50;  ///< hundredths
    std::string sharing = "cap";  ///< cap, uncap: shared processors; other modes: dedicated
    std::int64_t scsiServer = 0;  ///< partition that serves its virtual disks; 0: none
    std::string profile = "normal";
    std::int64_t procPool = 0;  ///< shared processor pool, for shared processors
};

struct HostPlan {
    std::string name;
    std::string typeModel;
    std::string serial;
    std::string state;
    std::int64_t mem = 65536;       ///< installed megabytes
    std::int64_t procUnits = 1600;  ///< installed hundredths
    std::int64_t memPool = 0;       ///< megabytes; 0: no pool
};

/// Memory that a builder's host keeps for itself, in megabytes.
constexpr std::int64_t kFirmwareMem = 2048;
constexpr std::int64_t kMemRegion = 256;

/// Sets the attributes of a text "name=value;name=value".
void set(Object& object, const std::string& settings);

class HostBuilder {
public:
    /// @param number  from 1, and one more than that of the host before
    HostBuilder(Store& store, std::int64_t number, const HostPlan& plan);

    /// I/O servers come before the partitions that they serve.
    void add(const LparPlan& plan);
    /// A further profile of a partition that was added, with less of everything.
    void addProfile(std::int64_t lpar, const std::string& name);
    /// Objects that were added, to be changed before finish(): the host, and the first of @p kind
    /// that a partition has, or the host where @p lpar is 0.
    Object& host() { return m_host; }
    Object& first(Kind kind, std::int64_t lpar);
    /// A further object of the host or of one of its partitions, to be filled.
    Object& add(Kind kind, const Place& place);

    /// Writes the host and all that belongs to it.
    void finish();

private:
    void addAdapters(const LparPlan& plan);
    void addScsi(const LparPlan& plan);
    void addSlots(const LparPlan& plan);
    /// @param description  null: the slot is empty
    /// @return its DRC index
    std::string addSlot(std::int64_t lpar, const char* description);
    void addLinks(const HostPlan& plan);
    void writeLists(std::vector<Object>& objects);

    Store& m_store;
    std::int64_t m_number;
    Object m_host;
    std::map<std::int64_t, std::vector<Object>> m_objects;     ///< by partition; 0: the host's own
    std::map<std::int64_t, std::vector<std::string>> m_slots;  ///< elements of its slot list
    std::int64_t m_slotCount = 0;
};

}  // namespace appliance

#endif
