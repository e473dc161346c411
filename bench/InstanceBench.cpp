// What does an instance cost on its way through broker, binding and frame, and does that stay the
// same as the number of instances grows?
//
// A get of each instance, and an enumeration of all, over a provider that makes instances of six
// properties, beside a plain loop that makes the same instances as the broker's own values.
// "per_instance" must stay flat.

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <string>

#include "ProviderInBench.h"

namespace {

constexpr const char* kClass = "Bench_Part";
/// How many instances there are; they are named by number.
long instancesServed = 1;

class PartProvider : public BenchProvider {
public:
    PartProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), BenchProvider(mb, ctx, name) {}
    static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
        return new PartProvider(mb, ctx, name);
    }
    CMPIBoolean isValidInstanceClass(const char* name) override {
        return compareClassNames(name, kClass);
    }
    CmpiInstance performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                    const char**) override {
        const long number = std::atol(path.getKey("Name").getString().charPtr());
        if (number >= instancesServed) {
            throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND);
        }
        return part(path, number);
    }
    void performEnumInstances(const CmpiContext&, CmpiResult& result, const CmpiObjectPath& path,
                              const char**) override {
        for (long i = 0; i < instancesServed; ++i) {
            result.returnData(part(path, i));
        }
    }

private:
    CmpiInstance part(const CmpiObjectPath& near, long number) {
        CmpiObjectPath path = createObjectPath(near);
        path.setKey("Name", CmpiData(std::to_string(number).c_str()));
        CmpiInstance instance(path);
        instance.setProperty("Name", CmpiData(std::to_string(number).c_str()));
        for (const char* property : {"A", "B", "C", "D"}) {
            instance.setProperty(property, CmpiData("some text"));
        }
        CmpiData state;
        state.setUint16(2);
        instance.setProperty("State", state);
        return instance;
    }
};

CMPIInstanceMI* makePartProvider(const CMPIBroker* broker, const CMPIContext* context,
                                 CMPIStatus* status) {
    return zemBaseProviderManager::getInstanceMI(const_cast<CMPIBroker*>(broker),
                                                 const_cast<CMPIContext*>(context), "Part", status,
                                                 PartProvider::create);
}

cimom::ObjectPath partPath(long number) {
    return {"root/cimv2", kClass, {{"Name", std::to_string(number)}}};
}

struct Broker {
    Broker() {
        cimom::Factories factories;
        factories.instance = makePartProvider;
        server.registerProvider("Part", {kClass}, factories);
    }
    OutputTo quiet{"/dev/null"};
    cimom::Server server;
    cimom::Request request;
};

void perInstance(benchmark::State& state, long count) {
    state.counters["per_instance"] = benchmark::Counter(
        static_cast<double>(count),
        benchmark::Counter::kIsIterationInvariantRate | benchmark::Counter::kInvert);
}

void Broker_GetInstance(benchmark::State& state) {
    Broker broker;
    instancesServed = state.range(0);
    for (auto _ : state) {
        for (long i = 0; i < state.range(0); ++i) {
            const cimom::Reply reply = broker.server.getInstance(broker.request, partPath(i));
            if (!reply.ok()) {
                state.SkipWithError("wrong answer");
            }
            benchmark::DoNotOptimize(reply);
        }
    }
    perInstance(state, state.range(0));
}
BENCHMARK(Broker_GetInstance)->Arg(1)->Arg(100)->Arg(10000)->Unit(benchmark::kMicrosecond);

void Broker_EnumInstances(benchmark::State& state) {
    Broker broker;
    instancesServed = state.range(0);
    for (auto _ : state) {
        benchmark::DoNotOptimize(
            broker.server.enumInstances(broker.request, {"root/cimv2", kClass}));
    }
    perInstance(state, state.range(0));
}
BENCHMARK(Broker_EnumInstances)->Arg(1)->Arg(100)->Arg(10000)->Unit(benchmark::kMicrosecond);

void Plain_EnumInstances(benchmark::State& state) {
    for (auto _ : state) {
        cimom::Reply reply;
        for (long i = 0; i < state.range(0); ++i) {
            cimom::Instance part(partPath(i));
            part.properties.set("Name", std::to_string(i));
            for (const char* property : {"A", "B", "C", "D"}) {
                part.properties.set(property, "some text");
            }
            part.properties.set("State", static_cast<std::uint16_t>(2));
            reply.instances.push_back(std::move(part));
        }
        benchmark::DoNotOptimize(reply);
    }
    perInstance(state, state.range(0));
}
BENCHMARK(Plain_EnumInstances)->Arg(1)->Arg(100)->Arg(10000)->Unit(benchmark::kMicrosecond);

}  // namespace
