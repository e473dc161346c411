// One provider object under eight threads that mix all operations, as a busy server would.
//
// Runs for two seconds; ZEM_SOAK_SECONDS in the environment makes it longer.
#include <fcntl.h>

#include <algorithm>
#include <atomic>

#include "OnThreads.h"
#include "ProviderHarness.h"

namespace {

using namespace cimom;

constexpr const char* kClass = "Test_Busy";

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
    const ObjectPath all("root/cimv2", kClass), a = busy("a");
    const Reply missing = server.getInstance(request, busy("missing"));
    const Reply echo = server.invokeMethod(request, a, "Echo", {{"Reason", "w"}});
    const bool right[] = {
        server.getInstance(request, a).instances.size() == 1,
        missing.rc == CMPI_RC_ERR_NOT_FOUND &&
            missing.message.find("object missing of class Test_Disk") != std::string::npos,
        server.getInstance(request, all).rc == CMPI_RC_ERR_INVALID_PARAMETER,
        server.enumInstances(request, all).instances.size() == 2,
        server.enumInstanceNames(request, all).paths.size() == 1,
        server.modifyInstance(request, Instance(a, {{"Name", "a"}})).ok(),
        server.deleteInstance(request, a).rc == CMPI_RC_ERR_NOT_SUPPORTED,
        server.associators(request, a).rc == CMPI_RC_ERR_NOT_SUPPORTED,
        server.referenceNames(request, a).rc == CMPI_RC_ERR_NOT_SUPPORTED,
        echo.ok() && echo.out.find("Reason") != nullptr && echo.out.find("Reason")->text() == "w",
        server.invokeMethod(request, a, "Echo", {{"Other", "w"}}).rc == CMPI_RC_ERR_FAILED,
        server.getProperty(request, a, "Name").value() == Value("a"),
        server.setProperty(request, a, "Name", Value("b")).ok(),
    };
    return static_cast<int>(std::count(std::begin(right), std::end(right), false));
}

class Concurrency : public BothBrokers {};

TEST_P(Concurrency, AllOperationsOfOneProviderAtOnce) {
    const char* soak = std::getenv("ZEM_SOAK_SECONDS");
    const auto end = std::chrono::steady_clock::now() +
                     std::chrono::seconds(soak != nullptr ? std::atoi(soak) : 2);
    std::atomic<int> wrong{0}, rounds{0};
    std::size_t stale = 0, alive = 0;
    {
        const Quiet quiet;
        Server server(Options{GetParam(), "", {}, nullptr});
        server.registerProvider("Busy", {kClass}, FactoriesOf<WorkingProvider>::all());
        wrong += mixOperations(server);
        const std::size_t before = server.liveObjects();
        onThreads(8, [&](int) {
            for (; std::chrono::steady_clock::now() < end; ++rounds) {
                wrong += mixOperations(server);
            }
        });
        stale = server.staleUses();
        alive = server.liveObjects() - before;
    }
    EXPECT_GT(rounds.load(), 8);
    EXPECT_EQ(wrong.load(), 0);
    EXPECT_EQ(stale, 0u);
    EXPECT_EQ(alive, 0u);
}

ON_BOTH_BROKERS(Concurrency);

}  // namespace
