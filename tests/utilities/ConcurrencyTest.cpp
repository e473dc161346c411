// One provider object under eight threads that mix all operations, as a busy server would.
//
// Runs for two seconds; ZEM_SOAK_SECONDS in the environment makes it longer.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <cstdlib>
#include <thread>
#include <vector>

#include "BaseProvider.h"
#include "BaseProviderManager.h"
#include "Server.h"

namespace {

using namespace cimom;

constexpr const char* kClass = "Test_Busy";

/// Serves everything, and fails where its object has the name "missing".
class BusyProvider : public zemBaseProvider {
public:
    BusyProvider(const CmpiBroker& mb, const CmpiContext& ctx, const char* name)
        : CmpiBaseMI(mb, ctx), zemBaseProvider(mb, ctx, name) {}
    static CmpiBaseMI* create(const CmpiBroker& mb, const CmpiContext& ctx, const char* name) {
        return new BusyProvider(mb, ctx, name);
    }

    CMPIBoolean isValidInstanceClass(const char*) override { return true; }
    CMPIBoolean isValidMethodClass(const char*) override { return true; }
    void populateEssentialKeys(const char*, CmpiArray& keys) override {
        keys[0] = CmpiData("Name");
    }
    void populateMethodArgs(const char*, zemDynamicArray<zemString>& args, const char*) override {
        args.addElement(new zemString("Word"));
    }
    const char* getMessageBundlePath() override { return ""; }

    CmpiInstance performGetInstance(const CmpiContext&, const CmpiObjectPath& path,
                                    const char**) override {
        const zemString name(getKeyBinding(path, "Name").getString().charPtr());
        if (name == "missing") throwObjectNotFoundExc("getInstance", kClass, name);
        CmpiInstance found(path);
        found.setProperty("Name", CmpiData(static_cast<const char*>(name)));
        return found;
    }
    void performEnumInstances(const CmpiContext& ctx, CmpiResult& result,
                              const CmpiObjectPath& path, const char** properties) override {
        for (const char* name : {"a", "b", "c"}) {
            CmpiObjectPath one = createObjectPath(path);
            one.setKey("Name", CmpiData(name));
            result.returnData(performGetInstance(ctx, one, properties));
        }
    }
    void performEnumInstanceNames(const CmpiContext&, CmpiResult& result,
                                  const CmpiObjectPath& path) override {
        result.returnData(path);
    }
    void performSetInstance(const CmpiContext&, CmpiResult&, const CmpiObjectPath&,
                            const CmpiInstance&, const char**) override {}
    void performCreateInstance(const CmpiContext&, CmpiResult& result, const CmpiObjectPath& path,
                               const CmpiInstance&) override {
        result.returnData(path);
    }
    void performInvokeMethod(const CmpiContext&, CmpiResult& result, const CmpiObjectPath&,
                             const char*, const CmpiArgs& in, CmpiArgs& out) override {
        out.setArg("Echo", getParmVal(in, "Word"));
        CmpiData done;
        done.setUint32(0);
        result.returnData(done);
    }
};

#define TEST_FACTORY(Kind)                                                                      \
    CMPI##Kind##MI* make##Kind(const CMPIBroker* mb, const CMPIContext* ctx, CMPIStatus* rc) {  \
        return zemBaseProviderManager::get##Kind##MI(const_cast<CMPIBroker*>(mb),               \
                                                     const_cast<CMPIContext*>(ctx), "Busy", rc, \
                                                     BusyProvider::create);                     \
    }
TEST_FACTORY(Instance)
TEST_FACTORY(Association)
TEST_FACTORY(Method)
TEST_FACTORY(Property)

/// Standard output goes nowhere meanwhile: the frame writes some lines an operation.
class Quiet {
public:
    Quiet() : m_saved(dup(STDOUT_FILENO)) {
        const int null = open("/dev/null", O_WRONLY);
        dup2(null, STDOUT_FILENO);
        close(null);
    }
    ~Quiet() {
        std::fflush(stdout);
        dup2(m_saved, STDOUT_FILENO);
        close(m_saved);
    }

private:
    int m_saved;
};

ObjectPath busy(const char* name) { return {"root/cimv2", kClass, {{"Name", name}}}; }

/// One of each operation; how many answered otherwise than they must.
int mixOperations(Server& server) {
    const Request request;
    const Instance instance(busy("a"), {{"Name", "a"}});
    int wrong = 0;
    const auto expect = [&](bool right) { wrong += right ? 0 : 1; };
    expect(server.getInstance(request, busy("a")).instances.size() == 1);
    const Reply missing = server.getInstance(request, busy("missing"));
    expect(missing.rc == CMPI_RC_ERR_NOT_FOUND &&
           missing.message.find("object missing of class Test_Busy") != std::string::npos);
    expect(server.getInstance(request, {"root/cimv2", kClass}).rc == CMPI_RC_ERR_INVALID_PARAMETER);
    expect(server.enumInstances(request, {"root/cimv2", kClass}).instances.size() == 3);
    expect(server.enumInstanceNames(request, {"root/cimv2", kClass}).paths.size() == 1);
    expect(server.modifyInstance(request, instance).ok());
    expect(server.deleteInstance(request, busy("a")).rc == CMPI_RC_ERR_NOT_SUPPORTED);
    expect(server.associators(request, busy("a")).rc == CMPI_RC_ERR_NOT_SUPPORTED);
    expect(server.referenceNames(request, busy("a")).rc == CMPI_RC_ERR_NOT_SUPPORTED);
    const Reply echo = server.invokeMethod(request, busy("a"), "Echo", {{"Word", "w"}});
    expect(echo.ok() && echo.out.find("Echo") != nullptr && echo.out.find("Echo")->text() == "w");
    expect(server.invokeMethod(request, busy("a"), "Echo", {{"Other", "w"}}).rc ==
           CMPI_RC_ERR_FAILED);
    expect(server.getProperty(request, busy("a"), "Name").value() == Value("a"));
    expect(server.setProperty(request, busy("a"), "Name", Value("b")).ok());
    return wrong;
}

class Concurrency : public ::testing::TestWithParam<Character> {};

TEST_P(Concurrency, AllOperationsOfOneProviderAtOnce) {
    const char* soak = std::getenv("ZEM_SOAK_SECONDS");
    const auto end = std::chrono::steady_clock::now() +
                     std::chrono::seconds(soak != nullptr ? std::atoi(soak) : 2);
    std::atomic<int> wrong{0}, rounds{0};
    std::size_t stale = 0, alive = 0;
    {
        const Quiet quiet;
        Server server(Options{GetParam(), "", {}, nullptr});
        server.registerProvider("Busy", {kClass},
                                {makeInstance, makeAssociation, makeMethod, nullptr, makeProperty});
        wrong += mixOperations(server);
        const std::size_t before = server.liveObjects();
        std::vector<std::thread> threads;
        for (int i = 0; i < 8; ++i)
            threads.emplace_back([&] {
                for (; std::chrono::steady_clock::now() < end; ++rounds)
                    wrong += mixOperations(server);
            });
        for (std::thread& thread : threads) thread.join();
        stale = server.staleUses();
        alive = server.liveObjects() - before;
    }
    EXPECT_GT(rounds.load(), 8);
    EXPECT_EQ(wrong.load(), 0);
    EXPECT_EQ(stale, 0u);
    EXPECT_EQ(alive, 0u);
}

INSTANTIATE_TEST_SUITE_P(Brokers, Concurrency, ::testing::Values(Character::Full, Character::Lean),
                         [](const auto& broker) {
                             return broker.param == Character::Full ? "full" : "lean";
                         });

}  // namespace
