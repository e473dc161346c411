#include <algorithm>
#include <random>

#include "Appliances.h"
#include "Builder.h"
#include "Text.h"

namespace appliance {

namespace {

/// Numbers that are the same on every machine: the standard fixes the engine, but not the
/// distributions.
class Dice {
public:
    explicit Dice(std::uint64_t seed) : m_engine(seed) {}
    std::int64_t below(std::int64_t bound) {
        return static_cast<std::int64_t>(m_engine() % static_cast<std::uint64_t>(bound));
    }
    /// True @p percent times in a hundred.
    bool percent(std::int64_t percent) { return below(100) < percent; }

private:
    std::mt19937_64 m_engine;
};

/// A number with leading zeros, so that names sort as their numbers do.
std::string padded(std::int64_t value, std::size_t width) {
    std::string digits = std::to_string(value);
    return std::string(width - std::min(width, digits.size()), '0') + digits;
}

const char* hostState(Dice& dice) {
    const std::int64_t roll = dice.below(100);
    return roll < 80 ? "Operating" : roll < 90 ? "Standby" : roll < 97 ? "Power Off" : "Error";
}

LparPlan lparPlan(Dice& dice, std::int64_t id, std::int64_t servers, const char* hostState,
                  const std::string& prefix) {
    static constexpr const char* kStates[] = {"Running",       "Running",      "Running",
                                              "Running",       "Running",      "Running",
                                              "Not Activated", "Open Firmware"};
    LparPlan plan{id, prefix + padded(id, 4), "tmxlinux", "Not Activated"};
    const std::int64_t state = dice.below(8);
    if (std::string(hostState) == "Operating") {
        plan.state = kStates[state];
    }
    plan.mem = kMemRegion * (2 + dice.below(30));
    plan.procUnits = 10 + 5 * dice.below(40);
    plan.sharing = dice.percent(70) ? "uncap" : "cap";
    if (id <= servers) {
        plan.env = "xbrgserver";
        return plan;
    }
    plan.scsiServer = 1 + id % servers;
    if (!dice.percent(5)) {
        return plan;
    }
    plan.env = "osq00";
    plan.sharing = "share_idle_procs";
    plan.procUnits = 100 * (1 + dice.below(4));
    return plan;
}

void addHost(Store& store, Dice& dice, const Size& size, std::int64_t number) {
    static constexpr const char* kModels[] = {"1111-AAA", "1111-AAB", "1111-AAC"};
    const char* state = hostState(dice);
    const std::int64_t servers = size.lpars < 8 ? 1 : 2;
    HostPlan host{"host-" + padded(number, 3), kModels[dice.below(3)], padded(number, 7), state};
    host.mem = kFirmwareMem + 4 * kMemRegion;
    host.procUnits = 400;
    std::vector<LparPlan> lpars;
    std::vector<std::int64_t> pools(static_cast<std::size_t>(size.pools));  // units of each
    for (std::int64_t id = 1; id <= size.lpars; ++id) {
        lpars.push_back(lparPlan(dice, id, servers, state, host.name + "-lpar-"));
        LparPlan& plan = lpars.back();
        plan.procPool = id % size.pools;
        pools[static_cast<std::size_t>(plan.procPool)] += plan.procUnits;
        host.mem += plan.mem;
        host.procUnits += plan.procUnits;
    }
    host.procUnits = (host.procUnits + 99) / 100 * 100;

    HostBuilder builder(store, number, host);
    for (const LparPlan& lpar : lpars) {
        builder.add(lpar);
    }
    for (std::int64_t pool = 1; pool < size.pools; ++pool) {
        Object& object = builder.add(Kind::ProcPool, {number, 0, pool});
        object.set("name", "pool-" + padded(pool, 2));
        object.set("max_pool_proc_units", units(pools[static_cast<std::size_t>(pool)] + 100));
    }
    builder.host().set("max_lpars", std::to_string(std::max<std::int64_t>(1000, size.lpars)));
    builder.finish();
}

}  // namespace

void fillGenerated(Store& store, const Size& size,
                   const std::function<void(std::int64_t)>& progress) {
    Dice dice(size.seed);
    for (std::int64_t number = 1; number <= size.hosts; ++number) {
        addHost(store, dice, size, number);
        progress(number);
    }
}

}  // namespace appliance
