#include <algorithm>
#include <atomic>
#include <numeric>
#include <random>
#include <thread>

#include "ProviderHarness.h"

namespace {

std::atomic<int> made{0};
std::atomic<int> alive{0};
std::atomic<int> cleaned{0};

class CountedProvider : public zemBaseProvider {
public:
    CountedProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, name) {
        ++made;
        ++alive;
    }
    ~CountedProvider() override { --alive; }
    CmpiStatus cleanup(CmpiContext&) override {
        ++cleaned;
        if (onCleanup) onCleanup();
        return CmpiStatus(CMPI_RC_OK);
    }
    int isUnloadable() const override { return unloadable; }
    const char* getMessageBundlePath() override { return ""; }

    static inline int unloadable = 1;
    static inline std::function<void()> onCleanup;
};

CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
    return new CountedProvider(mb, ctx, name);
}

// One record of any kind: getting it, and the way back.
struct Record {
    void* mi;
    std::function<CMPIrc(bool terminating)> cleanup;
};

template <class MI>
Record record(MI* mi, CMPIContext* ctx) {
    return {mi, [mi, ctx](bool terminating) { return mi->ft->cleanup(mi, ctx, terminating).rc; }};
}

class BaseProviderManager : public testing::Test {
protected:
    static constexpr int kKinds = 5;

    BaseProviderManager() {
        made = alive = cleaned = 0;
        CountedProvider::unloadable = 1;
        CountedProvider::onCleanup = nullptr;
        testing::internal::CaptureStdout();
    }
    ~BaseProviderManager() override {
        if (!m_outputTaken) output();
        EXPECT_EQ(0, alive);
        EXPECT_EQ(0U, server.staleUses());
    }

    Record get(int kind, const char* name = "P", createMI creator = create,
               CMPIContext* ctx = nullptr) {
        using M = zemBaseProviderManager;
        if (ctx == nullptr) ctx = scope.context();
        CMPIBroker* mb = server.broker();
        CMPIStatus status = {CMPI_RC_ERR_FAILED, nullptr};
        Record result = [&] {
            switch (kind) {
                case 0:
                    return record(M::getInstanceMI(mb, ctx, name, &status, creator), ctx);
                case 1:
                    return record(M::getAssociationMI(mb, ctx, name, &status, creator), ctx);
                case 2:
                    return record(M::getMethodMI(mb, ctx, name, &status, creator), ctx);
                case 3:
                    return record(M::getIndicationMI(mb, ctx, name, &status, creator), ctx);
                default:
                    return record(M::getPropertyMI(mb, ctx, name, &status, creator), ctx);
            }
        }();
        EXPECT_EQ(CMPI_RC_OK, status.rc);
        return result;
    }

    std::string output() {
        m_outputTaken = true;
        const std::string all = testing::internal::GetCapturedStdout();
        std::string lines;
        size_t start = 0;
        for (size_t end; (end = all.find('\n', start)) != std::string::npos; start = end + 1) {
            if (all.compare(start, 3, "zem") == 0) lines += all.substr(start, end - start + 1);
        }
        return lines;
    }

    cimom::Server server;
    cimom::RequestScope scope{server};

private:
    bool m_outputTaken = false;
};

TEST_F(BaseProviderManager, SharesOneObjectAmongTheKinds) {
    std::vector<Record> records;
    for (int kind = 0; kind < kKinds; ++kind) {
        records.push_back(get(kind));
        EXPECT_EQ(records[static_cast<size_t>(kind)].mi, get(kind).mi);  // the same record again
    }
    EXPECT_EQ(1, made);
    for (size_t i = 0; i + 1 < kKinds; ++i) EXPECT_EQ(CMPI_RC_OK, records[i].cleanup(false));
    EXPECT_EQ(0, cleaned);
    EXPECT_EQ(CMPI_RC_OK, records.back().cleanup(false));
    EXPECT_EQ(1, cleaned);
    EXPECT_EQ(0, alive);
    EXPECT_EQ(CMPI_RC_OK, get(0).cleanup(false));  // revived
    EXPECT_EQ(2, made);
}

TEST_F(BaseProviderManager, FillsTheTables) {
    CMPIInstanceMI* mi = static_cast<CMPIInstanceMI*>(get(0).mi);
    CMPIIndicationMI* indication = static_cast<CMPIIndicationMI*>(get(3).mi);
    EXPECT_EQ(200, mi->ft->ftVersion);
    EXPECT_EQ(200, mi->ft->miVersion);
    EXPECT_STREQ("P", mi->ft->miName);
    EXPECT_EQ(mi->hdl, indication->hdl);
    EXPECT_NE(nullptr, mi->ft->execQuery);
    EXPECT_NE(nullptr, indication->ft->disableIndications);
    EXPECT_EQ(
        CMPI_RC_ERR_NOT_SUPPORTED,
        mi->ft->execQuery(mi, scope.context(), nullptr, scope.wrap(Harness::diskPath()), "", "")
            .rc);
    get(0).cleanup(true);
    get(3).cleanup(true);
}

TEST_F(BaseProviderManager, ReportsWhatIsLeft) {
    const Record a0 = get(0, "A"), a1 = get(1, "A"), b = get(0, "B"), c = get(0, "C");
    b.cleanup(false);
    a0.cleanup(false);
    a1.cleanup(false);
    c.cleanup(false);
    EXPECT_EQ(
        "zemBaseProviderManager::cleanupMI:2\n"
        "zemBaseProviderManager::cleanupMI:A;count=2\n"
        "zemBaseProviderManager::cleanupMI:C;count=1\n"
        "zemBaseProviderManager::cleanupMI:1\n"
        "zemBaseProviderManager::cleanupMI:C;count=1\n"
        "zemBaseProviderManager::cleanupMI:0\n",
        output());
}

TEST_F(BaseProviderManager, KeepsProvidersThatMustStay) {
    const Record stays = get(0);
    CountedProvider::unloadable = 0;
    EXPECT_EQ(CMPI_RC_NEVER_UNLOAD, stays.cleanup(false));
    EXPECT_EQ(stays.mi, get(0).mi);
    EXPECT_EQ(1, alive);
    EXPECT_EQ(CMPI_RC_OK, stays.cleanup(true));
    EXPECT_EQ(1, cleaned);
}

TEST_F(BaseProviderManager, DestroysWhateverCleanupSays) {
    CountedProvider::onCleanup = [] { throw CmpiStatus(CMPI_RC_ERR_NOT_FOUND, "late"); };
    EXPECT_EQ(CMPI_RC_ERR_NOT_FOUND, get(2).cleanup(false));
    CountedProvider::onCleanup = [] { throw zemOperationFailedException("late"); };
    EXPECT_EQ(CMPI_RC_ERR_FAILED, get(2).cleanup(false));
    EXPECT_EQ(0, alive);
}

TEST_F(BaseProviderManager, AnswersNullWhenCreationFails) {
    const createMI failing[] = {
        [](const CmpiBroker&, const CmpiContext&, const char*) -> CmpiBaseMI* { return nullptr; },
        [](const CmpiBroker&, const CmpiContext&, const char*) -> CmpiBaseMI* {
            throw CmpiStatus(CMPI_RC_ERR_FAILED);
        }};
    for (createMI creator : failing) EXPECT_EQ(nullptr, get(0, "P", creator).mi);
    // A record of someone else's is none of the manager's.
    CMPIInstanceMI foreign = {nullptr, nullptr};
    EXPECT_EQ(CMPI_RC_OK,
              zemBaseProviderManager::cleanupInstanceMI(&foreign, scope.context(), false).rc);
}

TEST_F(BaseProviderManager, CountsExactlyInAnyOrderAndFromManyThreads) {
    std::vector<std::thread> threads;
    for (unsigned t = 0; t < 4; ++t) {
        threads.emplace_back([this, t] {
            cimom::RequestScope own(server);
            const std::string name = "T" + std::to_string(t);
            std::mt19937 random(t);
            for (int round = 0; round < 250; ++round) {
                std::vector<Record> records;
                for (int kind = 0; kind < kKinds; ++kind) {
                    records.push_back(get(kind, name.c_str(), create, own.context()));
                }
                std::shuffle(records.begin(), records.end(), random);
                for (const Record& r : records) EXPECT_EQ(CMPI_RC_OK, r.cleanup(round % 2 == 0));
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(1000, made);
    EXPECT_EQ(1000, cleaned);
}

}  // namespace
