/// An appliance of a given size for the length of a benchmark, with the built tools on PATH.
#ifndef GENERATED_APPLIANCE_H
#define GENERATED_APPLIANCE_H

#include <chrono>
#include <stdexcept>
#include <string>

#include "TestAppliance.h"

/// How long @p call takes.
template <typename Call>
double seconds(Call call) {
    using Clock = std::chrono::steady_clock;
    const auto begin = Clock::now();
    call();
    return std::chrono::duration<double>(Clock::now() - begin).count();
}

constexpr std::int64_t kLparsPerHost = 1000;

/// Full hosts, or one host that is not full.
class GeneratedAppliance : public testing_support::TestAppliance {
public:
    explicit GeneratedAppliance(std::int64_t lpars, std::int64_t pools = 1)
        : TestAppliance(ZEM_PROGRAMS) {
        const std::int64_t hosts = lpars < kLparsPerHost ? 1 : lpars / kLparsPerHost;
        const auto outcome =
            run("appliance generate --hosts " + std::to_string(hosts) + " --lpars " +
                std::to_string(lpars / hosts) + " --pools " + std::to_string(pools));
        if (outcome.exit != 0) {
            throw std::runtime_error(outcome.err);
        }
    }
};

#endif
