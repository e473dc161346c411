// How long from a change of the appliance until a callback, and a subscribed client, hear of it?
//
// A name is changed, as the tools commit it; what the clock sees besides the commit is the look at
// the journal that is due, its line on its way through the program that follows it and through
// Java, and the call of the library ("EventDelay") or, through provider and broker, of a client
// that has subscribed ("IndicationDelay"). All of them listen to the same changes. The plain side
// is one who reads what the program prints ("JournalDelay"), and one who has to ask all the time
// and runs a tool ("AskATool").

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <algorithm>
#include <condition_variable>
#include <csignal>
#include <cstdlib>
#include <mutex>
#include <random>
#include <stdexcept>
#include <thread>
#include <vector>

#include "ClassRepository.h"
#include "GeneratedAppliance.h"
#include "Server.h"
#include "SpawnReadWait.h"
#include "Store.h"
#include "WrtEventHelper.h"

namespace {

constexpr const char* kLine =
    R"({"tool":"edplat","time":1700000000,"objects":[{"event":"modify","kind":"lpar",)"
    R"("host":"1111-AAA*0000001","lpar":3,"number":0,"old":{"name":"web"},"new":{"name":"www"}}]})";

/// Counts what one listener hears.
class Heard {
public:
    void hear() {
        const std::lock_guard<std::mutex> hold(m_mutex);
        ++m_count;
        m_heard.notify_all();
    }
    /// Until @p count have come.
    void wait(int count) {
        std::unique_lock<std::mutex> hold(m_mutex);
        m_heard.wait(hold, [&] { return m_count >= count; });
    }

private:
    std::mutex m_mutex;
    std::condition_variable m_heard;
    int m_count = 0;
};

class CallBack : public zemWrtEventCallBack, public Heard {
    zemEventData* eventOccured(const zemWRTEvent& event) override {
        benchmark::DoNotOptimize(event.getRClientObjectProperty(
            event.getNewRClientObject(), zemWrtConstants::getUSER_DEFINED_NAME()));
        hear();
        return nullptr;
    }
};

/// Reads the journal with nothing in between.
class PlainReader : public Heard {
public:
    PlainReader() {
        waitForLine();  // what there was before
        m_thread = std::thread([this] {
            while (waitForLine()) {
                hear();
            }
        });
    }
    ~PlainReader() {
        kill(m_child.pid, SIGTERM);
        m_thread.join();
        waitpid(m_child.pid, nullptr, 0);
        close(m_child.output);
    }

private:
    bool waitForLine() {
        char c = 0;
        while (read(m_child.output, &c, 1) == 1) {
            if (c == '\n') {
                return true;
            }
        }
        return false;
    }

    const Spawned m_child = [] {
        const char* const argv[] = {"appliance", "journal", "--json", "--follow", nullptr};
        return spawn(argv);
    }();
    std::thread m_thread;
};

/// An appliance with its listeners until the process ends, and its one VM.
struct Listening {
    Listening() : server(options()) {
        setenv("CLASSPATH", ZEM_EVENT_CLASSES, 1);
        zemWrtEventManager::getWrtEventManager().registerSubscription(
            java.getJvmHelper(), "user", zemEventSubscription::getEVENT_MODIFY_OBJECT(),
            zemWrtConstants::getLPAR_CIM_CLASS(), &callBack);
        server.loadRegistration(ZEM_REGISTRATION);
        cimom::Server::SubscriptionId id = 0;
        const cimom::Reply reply = server.subscribe(
            {}, "SELECT * FROM ORXC_PartitionStateChange", "WQL",
            [this](const cimom::Indication&) { client.hear(); }, id);
        if (!reply.ok()) {
            throw std::runtime_error("nobody tells of changes: " + reply.message);
        }
    }
    ~Listening() {
        zemWrtEventManager::getWrtEventManager().unregisterSubscription(
            java.getJvmHelper(), "user", zemEventSubscription::getEVENT_MODIFY_OBJECT(),
            zemWrtConstants::getLPAR_CIM_CLASS(), &callBack, true);
    }
    static cimom::Options options() {
        cimom::Options withClasses;
        withClasses.classes = cimom::ClassRepository::load(ZEM_SCHEMA);
        return withClasses;
    }
    GeneratedAppliance appliance{10};
    zemJvmHelperRef java;
    CallBack callBack;
    Heard client;
    PlainReader reader;
    cimom::Server server;
    int sent = 0;
};

Listening& listening() {
    static Listening all;
    return all;
}

void delay(benchmark::State& state, Heard& listener) {
    constexpr unsigned kLongestPause = 20'000;
    std::minstd_rand random;
    std::vector<double> delays;
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    for (auto _ : state) {
        usleep(static_cast<useconds_t>(random() % kLongestPause));  // changes come at any time
        delays.push_back(seconds([&] {
            appliance::Transaction change = store.write();
            store.append(kLine);
            change.commit();
            listener.wait(++listening().sent);
        }));
        state.SetIterationTime(delays.back());
    }
    std::nth_element(delays.begin(), delays.begin() + static_cast<long>(delays.size() / 2),
                     delays.end());
    state.counters["median_ms"] = delays[delays.size() / 2] * 1000;
}

void EventDelay(benchmark::State& state) { delay(state, listening().callBack); }
void IndicationDelay(benchmark::State& state) { delay(state, listening().client); }
void JournalDelay(benchmark::State& state) { delay(state, listening().reader); }

void AskATool(benchmark::State& state) {
    listening();
    const char* const argv[] = {"qyplat", "-r", "lpar", "-F", "lpar_id,name", nullptr};
    for (auto _ : state) {
        benchmark::DoNotOptimize(spawnReadWait(argv));
    }
}

BENCHMARK(EventDelay)->Iterations(30)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(IndicationDelay)->Iterations(30)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(JournalDelay)->Iterations(30)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(AskATool)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
