#include <algorithm>
#include <atomic>
#include <random>

#include "FailingAllocation.h"
#include "OnThreads.h"
#include "ProviderHarness.h"

namespace {

std::atomic<int> made{0}, alive{0}, cleaned{0};
int unloadable;
std::function<void()> onCleanup;

class CountedProvider : public PlainProvider {
public:
    CountedProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), PlainProvider(mb, ctx, name) {
        ++made;
        ++alive;
    }
    ~CountedProvider() override { --alive; }
    CmpiStatus cleanup(CmpiContext&) override {
        ++cleaned;
        if (onCleanup) {
            onCleanup();
        }
        return returnOK();
    }
    int isUnloadable() const override { return unloadable; }
};

/// One record of any kind, and the way back.
struct Record {
    void* mi;
    std::function<CMPIrc(bool terminating)> cleanup;
};

class BaseProviderManager : public testing::Test {
protected:
    using M = zemBaseProviderManager;
    static constexpr int kKinds = 5;

    BaseProviderManager() {
        made = alive = cleaned = 0;
        unloadable = 1;
        onCleanup = nullptr;
        testing::internal::CaptureStdout();
    }
    ~BaseProviderManager() override {
        testing::internal::GetCapturedStdout();
        EXPECT_EQ(0, alive);
        EXPECT_EQ(0U, server.staleUses());
    }

    template <class MI>
    Record take(MI* (*factory)(CMPIBroker*, CMPIContext*, const char*, CMPIStatus*, createMI),
                const char* name, CMPIContext* ctx, createMI create) {
        CMPIStatus status = {CMPI_RC_ERR_FAILED, nullptr};
        MI* mi = factory(server.broker(), ctx, name, &status, create);
        EXPECT_EQ(CMPI_RC_OK, status.rc);
        return {mi, [=](bool terminating) { return mi->ft->cleanup(mi, ctx, terminating).rc; }};
    }
    Record get(int kind, const char* name = "P", CMPIContext* context = nullptr,
               createMI create = FactoriesOf<CountedProvider>::create) {
        CMPIContext* ctx = context != nullptr ? context : scope.context();
        return kind == 0   ? take(M::getInstanceMI, name, ctx, create)
               : kind == 1 ? take(M::getAssociationMI, name, ctx, create)
               : kind == 2 ? take(M::getMethodMI, name, ctx, create)
               : kind == 3 ? take(M::getIndicationMI, name, ctx, create)
                           : take(M::getPropertyMI, name, ctx, create);
    }

    cimom::Server server;
    cimom::RequestScope scope{server};
};

TEST_F(BaseProviderManager, SharesOneObjectAmongTheKinds) {
    std::vector<Record> records;
    for (int kind = 0; kind < kKinds; ++kind) {
        records.push_back(get(kind));
        EXPECT_EQ(records.back().mi, get(kind).mi);  // the same record again
    }
    const auto* mi = static_cast<CMPIInstanceMI*>(records[0].mi);
    EXPECT_EQ(mi->hdl, static_cast<CMPIIndicationMI*>(records[3].mi)->hdl);
    EXPECT_EQ(200, mi->ft->ftVersion);
    EXPECT_EQ(200, mi->ft->miVersion);
    EXPECT_STREQ("P", mi->ft->miName);
    // What a server of a newer level looks for behind the entries of the headers at hand.
    EXPECT_EQ(nullptr, *reinterpret_cast<void* const*>(mi->ft + 1));
    for (const Record& record : records) {
        EXPECT_EQ(0, cleaned);
        EXPECT_EQ(CMPI_RC_OK, record.cleanup(false));
    }
    EXPECT_EQ(1, cleaned);
    EXPECT_EQ(CMPI_RC_OK, get(0).cleanup(false));  // revived
    EXPECT_EQ(2, made);
}

TEST_F(BaseProviderManager, ReportsWhatIsLeft) {
    const Record a0 = get(0, "A"), a1 = get(1, "A"), b = get(0, "B"), c = get(0, "C");
    testing::internal::GetCapturedStdout();
    testing::internal::CaptureStdout();
    b.cleanup(false);
    std::string output = testing::internal::GetCapturedStdout();
    testing::internal::CaptureStdout();
    EXPECT_EQ(
        "\nzemBaseProviderManager::cleanupMI:2\n"
        "zemBaseProviderManager::cleanupMI:A;count=2\n"
        "zemBaseProviderManager::cleanupMI:C;count=1\n",
        output.substr(output.find("\nzem")));
    for (const Record* record : {&a0, &a1, &c}) {
        record->cleanup(false);
    }
}

TEST_F(BaseProviderManager, KeepsProvidersThatMustStay) {
    const Record stays = get(0);
    unloadable = 0;
    EXPECT_EQ(CMPI_RC_NEVER_UNLOAD, stays.cleanup(false));
    EXPECT_EQ(stays.mi, get(0).mi);
    EXPECT_EQ(CMPI_RC_OK, stays.cleanup(true));
    EXPECT_EQ(1, cleaned);
}

TEST_F(BaseProviderManager, DestroysWhateverCleanupSays) {
    onCleanup = [] { throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND, "late"); };
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, get(2).cleanup(false));
    onCleanup = [] { throw zemOperationFailedException("late"); };
    EXPECT_EQ(CMPI_RC_ERR_FAILED, get(2).cleanup(false));
}

TEST_F(BaseProviderManager, AnswersNullWhenCreationFails) {
    const createMI failing[] = {
        [](const CmpiBroker&, const CmpiContext&, const char*) -> CmpiBaseMI* { return nullptr; },
        [](const CmpiBroker&, const CmpiContext&, const char*) -> CmpiBaseMI* { throw 1; }};
    for (createMI create : failing) {
        EXPECT_EQ(nullptr, get(0, "P", nullptr, create).mi);
    }
    CMPIInstanceMI foreign = {nullptr, nullptr};  // a record that is none of the manager's
    EXPECT_EQ(CMPI_RC_OK, M::cleanupInstanceMI(&foreign, scope.context(), false).rc);
    // One that has made its own name's object meanwhile: that one stays, the second goes.
    const Record record = get(0, "P", nullptr, [](auto& mb, auto& ctx, auto name) -> CmpiBaseMI* {
        const auto create = FactoriesOf<CountedProvider>::create;
        M::getMethodMI(mb.getEnc(), ctx.getEnc(), name, nullptr, create);
        return create(mb, ctx, name);
    });
    EXPECT_EQ(1, alive);
    for (const Record& last : {record, get(2)}) {
        last.cleanup(true);
    }
}

TEST_F(BaseProviderManager, CountsExactlyInAnyOrderAndFromManyThreads) {
    onThreads(4, [this](int number) {
        cimom::RequestScope own(server);
        const std::string name = "T" + std::to_string(number);
        std::mt19937 random(static_cast<unsigned>(number));
        CMPIObjectPath* path = own.wrap(cimom::ObjectPath("root/cimv2", "Test_Disk"));
        for (int round = 0; round < 250; ++round) {
            std::vector<Record> records;
            for (int kind = 0; kind < kKinds; ++kind) {
                records.push_back(get(kind, name.c_str(), own.context()));
            }
            auto* mi = static_cast<CMPIInstanceMI*>(records[0].mi);
            EXPECT_EQ(CMPI_RC_ERR_NOT_SUPPORTED,
                      mi->ft->enumerateInstanceNames(mi, own.context(), nullptr, path).rc);
            std::shuffle(records.begin(), records.end(), random);
            for (const Record& r : records) {
                EXPECT_EQ(CMPI_RC_OK, r.cleanup(round % 2 == 0));
            }
        }
    });
    EXPECT_EQ(1000, made);
    EXPECT_EQ(1000, cleaned);
}

// Each allocation in turn fails: of each operation, then of the factory and of the last cleanup.
// The server gets an answer and goes on, and nothing is left behind.
TEST(OutOfMemory, EachAllocationMayFail) {
#ifdef ZEM_SYSTEM_BINDING
    GTEST_SKIP() << "the system's binding lets this failure pass into the server";
#endif
    struct Parts {
        CMPIContext* ctx;
        CMPIResult* result;
        CMPIObjectPath *path, *all;
        CMPIInstance* disk;
        CMPIArgs* args;
        CMPIData caption;
    };
#define CALL(mi, entry, ...)                                        \
    [](const Harness& h, const Parts& p) {                          \
        return h.mi->ft->entry(h.mi, p.ctx, p.result, __VA_ARGS__); \
    }
    constexpr auto no = nullptr;
    CMPIStatus (*const operations[])(const Harness&, const Parts&) = {
        CALL(instance, enumerateInstanceNames, p.all),
        CALL(instance, enumerateInstances, p.all, no),
        CALL(instance, getInstance, p.path, no),
        CALL(instance, createInstance, p.all, p.disk),
        CALL(instance, modifyInstance, p.path, p.disk, no),
        CALL(instance, deleteInstance, p.path),
        CALL(association, associators, p.path, no, no, no, no, no),
        CALL(method, invokeMethod, p.path, "Force", p.args, p.args),
        CALL(property, getProperty, p.path, "Name"),
        CALL(property, setProperty, p.path, "Caption", p.caption)};
#undef CALL
    // Whether there were so many allocations that the one after n failed; none does for -1.
    const auto during = [](long n, const std::function<void()>& work) {
        const FailingAllocation failing(n >= 0 ? n : 1L << 30);
        work();
        return failing.happened();
    };
    testing::internal::CaptureStdout();
    int failures = 0;
    for (const auto& operation : operations) {
        long before = 0;
        bool failed = true;
        for (long n = -1; failed; ++n) {  // the first run, in which none fails, makes what stays
            {
                const Harness h(cimom::Character::Full, FactoriesOf<WorkingProvider>::create);
                cimom::Reply reply;
                CMPIData caption = {CMPI_chars, CMPI_goodValue, {}};
                caption.value.chars = const_cast<char*>("c");
                const Parts parts = {h.ctx(),  h.scope.result(reply),     h.path(), h.classPath(),
                                     h.disk(), h.args({{"Reason", "r"}}), caption};
                CMPIStatus status = {CMPI_RC_OK, nullptr};
                failed = during(n, [&] { status = operation(h, parts); }) || n < 0;
                failures += n >= 0 && status.rc == CMPI_RC_ERR_FAILED ? 1 : 0;
            }
            EXPECT_TRUE(n < 0 || before == FailingAllocation::live()) << n;
            before = FailingAllocation::live();
        }
    }

    cimom::Server server;
    cimom::RequestScope scope(server);
    CMPIInstanceMI* mi = nullptr;
    const auto get = [&] {
        mi = zemBaseProviderManager::getInstanceMI(server.broker(), scope.context(), "Rare",
                                                   nullptr, FactoriesOf<PlainProvider>::create);
    };
    const auto drop = [&] { mi->ft->cleanup(mi, scope.context(), false); };
    get();
    drop();
    const long before = FailingAllocation::live();
    for (long n = 0; during(n, get); ++n) {
        if (mi != nullptr) {
            drop();
        }
    }
    for (long n = 0; during(n, drop); ++n) {
        get();
    }
    EXPECT_EQ(before, FailingAllocation::live());
    testing::internal::GetCapturedStdout();
    EXPECT_LT(100, failures);
}

}  // namespace
