// What do the association families cost beside the rule that says which objects belong together?
//
// Joining two sides by key, beside asking the rule for every pair of objects: the join must win by
// far and grow with the objects, not with the pairs. The cross product is left out at 4000 objects,
// where it takes many seconds a run and tells nothing new. Navigation from one source, beside a
// plain loop over the same objects as the broker's own values. And one enumeration over pairs of
// classes that share classes, beside the family that knows nothing of that: "broker_calls" is what
// an enumeration asks of the server.

#include <benchmark/benchmark.h>

#include <string>
#include <typeinfo>
#include <vector>

#include "AssociationProvider.h"
#include "BaseZemMultiNtoNAssociationProvider.h"
#include "MultiNtoNAssociationProvider.h"
#include "NtoNAssociationProvider.h"
#include "ProviderInBench.h"

namespace {

constexpr const char* kMof = R"(
Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
Qualifier Association : boolean = false, Scope(association), Flavor(DisableOverride);
class Bench_Element { [Key] string Host; [Key] string Name; };
class Bench_Host : Bench_Element {};
class Bench_Guest : Bench_Element {};
class Bench_Node : Bench_Element {};
class Bench_Frame : Bench_Element {};
class Bench_Disk : Bench_Element {};
class Bench_Port : Bench_Element {};
class Bench_Fan : Bench_Element {};
class Bench_Card : Bench_Element {};
[Association] class Bench_Link {
    [Key] Bench_Element ref Left;
    [Key] Bench_Element ref Right;
};
)";

const std::vector<std::string> kLefts = {"Bench_Host", "Bench_Guest", "Bench_Node", "Bench_Frame"};
const std::vector<std::string> kRights = {"Bench_Disk", "Bench_Port", "Bench_Fan", "Bench_Card"};

/// Objects of each class, and how many in a row are on one host.
long objects = 0;
long perHost = 1;
/// How often objects were asked for.
long enumerations = 0;

std::string hostOf(long number) { return "host-" + std::to_string(number / perHost); }

zemString hostOf(const CmpiObjectPath& path) { return path.getKey("Host").getString().charPtr(); }

bool onOneHost(const CmpiObjectPath& a, const CmpiObjectPath& b) { return hostOf(a) == hostOf(b); }

/// Serves all classes of objects, to the server and as a handle.
class Elements : public zemBaseZemInstanceProvider {
public:
    Elements(const CmpiBroker& mb, const CmpiContext& ctx, const char* name = "Elements")
        : CmpiBaseMI(mb, ctx), zemBaseZemInstanceProvider(mb, ctx, name) {}
    using zemBaseZemInstanceProvider::enumInstanceNames;
    using zemBaseZemInstanceProvider::getInstance;

    CMPIBoolean isValidInstanceClass(const char*) override { return true; }
    const char* getMessageBundlePath() override { return ""; }
    int getInstance(const CmpiContext&, const CmpiObjectPath& cop, const char**,
                    CmpiInstance& out) override {
        for (const char* key : {"Host", "Name"}) {
            out.setProperty(key, cop.getKey(key));
        }
        return 0;
    }
    void enumInstanceNames(const CmpiContext&, const CmpiObjectPath& cop,
                           zemDynamicArray<CmpiObjectPath>& out, const CmpiObjectPath&) override {
        ++enumerations;
        for (long i = 0; i < objects; ++i) {
            CmpiObjectPath* const path = new CmpiObjectPath(createObjectPath(cop));
            out.addElement(path);
            path->setKey("Host", CmpiData(hostOf(i).c_str()));
            path->setKey("Name", CmpiData(std::to_string(i).c_str()));
        }
    }
};

/// One pair of classes, by handles.
template <class Base>
class ByHandle : public Base {
public:
    ByHandle(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), Base(mb, ctx, name, Base::OP_ALLOps), m_elements(mb, ctx) {
        this->m_associationDataSet.addNewAssoPair(new zemMultiNtoNAssociationPair(
            {&m_elements, kLefts[0].c_str(), "Left", ""},
            {&m_elements, kRights[0].c_str(), "Right", ""}, "Bench_Link", ""));
    }

private:
    Elements m_elements;
};

class CrossProduct : public ByHandle<zemBaseZemMultiNtoNAssociationProvider> {
public:
    CrossProduct(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), ByHandle(mb, ctx, name) {}
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2,
                               const zemMultiNtoNAssociationPair&) override {
        return onOneHost(cop1, cop2);
    }
};

class HashJoin : public ByHandle<zemEnhanceBaseZemMultiNtoNAssociationProvider> {
public:
    HashJoin(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), ByHandle(mb, ctx, name) {}
    zemString getObjectPathHashKeyString(const CmpiObjectPath& cop, bool) override {
        return hostOf(cop);
    }
};

/// One pair of classes, by the server.
class NtoN : public zemNtoNAssociationProvider {
public:
    NtoN(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          zemNtoNAssociationProvider(mb, ctx, name, "Bench_Link", kLefts[0].c_str(),
                                     kRights[0].c_str(), "Left", "Right", OP_ALLOps, "", "", "") {}
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2) override {
        return onOneHost(cop1, cop2);
    }
};

/// Every left class with every right one: a row each, and all in one list.
class Rows : public zemAssociationProvider {
public:
    Rows(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemAssociationProvider(mb, ctx, name, OP_ALLOps) {
        for (const std::string& left : kLefts) {
            for (const std::string& right : kRights) {
                addAssoData(new zemAssociationData("Bench_Link", "", left.c_str(), "Left", "",
                                                   right.c_str(), "Right", ""));
            }
        }
    }
    bool isValidateAssociation(const CmpiContext&, const zemAssociationData&,
                               const CmpiObjectPath& cop1, const CmpiObjectPath& cop2) override {
        return onOneHost(cop1, cop2);
    }
};

class MultiNtoN : public zemMultiNtoNAssociationProvider {
public:
    MultiNtoN(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx),
          zemMultiNtoNAssociationProvider(mb, ctx, name, "Bench_Link", allPairs().c_str(), "Left",
                                          "Right", OP_ALLOps, "", "", "") {}
    bool isValidateAssociation(const CmpiContext&, const CmpiObjectPath& cop1,
                               const CmpiObjectPath& cop2) override {
        return onOneHost(cop1, cop2);
    }

private:
    static std::string allPairs() {
        std::string block;
        for (const std::string& left : kLefts) {
            for (const std::string& right : kRights) {
                (block += left + '\0') += right + '\0';
            }
        }
        return block;
    }
};

template <class Provider>
struct FactoriesOf {
    static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
        return new Provider(mb, ctx, name);
    }
    static CMPIInstanceMI* instance(const CMPIBroker* mb, const CMPIContext* ctx, CMPIStatus* rc) {
        return zemBaseProviderManager::getInstanceMI(const_cast<CMPIBroker*>(mb),
                                                     const_cast<CMPIContext*>(ctx),
                                                     typeid(Provider).name(), rc, create);
    }
    static CMPIAssociationMI* association(const CMPIBroker* mb, const CMPIContext* ctx,
                                          CMPIStatus* rc) {
        return zemBaseProviderManager::getAssociationMI(const_cast<CMPIBroker*>(mb),
                                                        const_cast<CMPIContext*>(ctx),
                                                        typeid(Provider).name(), rc, create);
    }
};

/// A server with the objects and one family.
template <class Provider>
class Bench {
public:
    Bench(long count, long onHost) : server({cimom::Character::Full, "", {}, classes()}) {
        objects = count;
        perHost = onHost;
        std::vector<std::string> elements = kLefts;
        elements.insert(elements.end(), kRights.begin(), kRights.end());
        server.registerProvider("Elements", elements, {&FactoriesOf<Elements>::instance});
        server.registerProvider(
            "Links", {"Bench_Link"},
            {&FactoriesOf<Provider>::instance, &FactoriesOf<Provider>::association});
    }

    /// Times an operation after a first run, which makes the providers and must give so many paths.
    template <class Operation>
    void run(benchmark::State& state, std::size_t expected, Operation operation) {
        const cimom::Reply reply = operation();
        if (!reply.ok() || reply.paths.size() != expected) {
            state.SkipWithError("wrong answer");
            return;
        }
        enumerations = 0;
        for (auto _ : state) {
            benchmark::DoNotOptimize(operation());
        }
        state.counters["broker_calls"] = benchmark::Counter(static_cast<double>(enumerations),
                                                            benchmark::Counter::kAvgIterations);
    }
    void enumNames(benchmark::State& state, std::size_t expected) {
        run(state, expected, [this] {
            return server.enumInstanceNames({}, {"root/cimv2", "Bench_Link"});
        });
    }

private:
    static std::shared_ptr<const cimom::ClassRepository> classes() {
        return cimom::ClassRepository::load("bench.mof", [](const std::string&) { return kMof; });
    }
    OutputTo m_quiet{"/dev/null"};

public:
    cimom::Server server;
};

template <class Provider>
void enumNames(benchmark::State& state) {
    Bench<Provider> bench(state.range(0), 1);
    bench.enumNames(state, static_cast<std::size_t>(state.range(0)));
    state.counters.erase("broker_calls");  // handles need none
}
BENCHMARK_TEMPLATE(enumNames, HashJoin)
    ->Name("HashJoin_EnumNames")
    ->Arg(100)
    ->Arg(1000)
    ->Arg(4000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(enumNames, CrossProduct)
    ->Name("CrossProduct_EnumNames")
    ->Arg(100)
    ->Arg(1000)
    ->Unit(benchmark::kMillisecond);

// A tenth of the targets are on the source's host.
cimom::ObjectPath element(const std::string& className, long number) {
    return {"root/cimv2", className, {{"Host", hostOf(number)}, {"Name", std::to_string(number)}}};
}

template <class Provider>
void associatorNames(benchmark::State& state) {
    const long targets = state.range(0);
    Bench<Provider> bench(targets, targets / 10);
    bench.run(state, static_cast<std::size_t>(targets / 10), [&bench] {
        return bench.server.associatorNames({}, element(kLefts[0], 0), {"Bench_Link", "", "", ""});
    });
    state.counters.erase("broker_calls");
}

void plainLoop(benchmark::State& state) {
    objects = state.range(0);
    perHost = objects / 10;
    for (auto _ : state) {
        const cimom::ObjectPath source = element(kLefts[0], 0);
        const std::string host = source.keys.find("Host")->text();
        cimom::Reply reply;
        for (long i = 0; i < objects; ++i) {
            cimom::ObjectPath target = element(kRights[0], i);
            if (target.keys.find("Host")->text() == host) {
                reply.paths.push_back(std::move(target));
            }
        }
        benchmark::DoNotOptimize(reply);
    }
}
BENCHMARK_TEMPLATE(associatorNames, HashJoin)
    ->Name("HashJoin_AssociatorNames")
    ->Arg(1000)
    ->Arg(10000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(associatorNames, NtoN)
    ->Name("NtoN_AssociatorNames")
    ->Arg(1000)
    ->Arg(10000)
    ->Unit(benchmark::kMillisecond);
BENCHMARK(plainLoop)
    ->Name("Plain_AssociatorNames")
    ->Arg(1000)
    ->Arg(10000)
    ->Unit(benchmark::kMillisecond);

template <class Provider>
void enumPairs(benchmark::State& state) {
    constexpr long kObjects = 20;
    const std::size_t pairs = kLefts.size() * kRights.size();
    Bench<Provider> bench(kObjects, 1);
    bench.enumNames(state, pairs * kObjects);
    state.counters["pairs"] = static_cast<double>(pairs);
}
BENCHMARK_TEMPLATE(enumPairs, MultiNtoN)
    ->Name("MultiNtoN_EnumNames")
    ->Unit(benchmark::kMillisecond);
BENCHMARK_TEMPLATE(enumPairs, Rows)->Name("Rows_EnumNames")->Unit(benchmark::kMillisecond);

}  // namespace
