// How long from a change of the appliance until a callback hears of it?
//
// A name is changed, as the tools commit it; what the clock sees besides the commit is the look at
// the journal that is due, its line on its way through the program that follows it and through
// Java, and the call of the library. Asking instead, by one run of a tool, is the other side:
// events are for those who would have to ask all the time.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <algorithm>
#include <condition_variable>
#include <cstdlib>
#include <mutex>
#include <random>
#include <vector>

#include "GeneratedAppliance.h"
#include "SpawnReadWait.h"
#include "Store.h"
#include "WrtEventHelper.h"

namespace {

constexpr const char* kLine =
    R"({"tool":"edplat","time":1700000000,"objects":[{"event":"modify","kind":"lpar",)"
    R"("host":"1111-AAA*0000001","lpar":3,"number":0,"old":{"name":"web"},"new":{"name":"www"}}]})";

class Waiting : public zemWrtEventCallBack {
public:
    /// Until @p count events have come.
    void wait(int count) {
        std::unique_lock<std::mutex> hold(m_mutex);
        m_heard.wait(hold, [&] { return m_count >= count; });
    }

private:
    zemEventData* eventOccured(const zemWRTEvent& event) override {
        benchmark::DoNotOptimize(event.getRClientObjectProperty(
            event.getNewRClientObject(), zemWrtConstants::getUSER_DEFINED_NAME()));
        const std::lock_guard<std::mutex> hold(m_mutex);
        ++m_count;
        m_heard.notify_all();
        return nullptr;
    }

    std::mutex m_mutex;
    std::condition_variable m_heard;
    int m_count = 0;
};

/// An appliance that is listened to until the process ends, with its one VM.
struct Listening {
    Listening() {
        setenv("CLASSPATH", ZEM_EVENT_CLASSES, 1);
        zemWrtEventManager::getWrtEventManager().registerSubscription(
            java.getJvmHelper(), "user", zemEventSubscription::getEVENT_MODIFY_OBJECT(),
            zemWrtConstants::getLPAR_CIM_CLASS(), &callBack);
    }
    ~Listening() {
        zemWrtEventManager::getWrtEventManager().unregisterSubscription(
            java.getJvmHelper(), "user", zemEventSubscription::getEVENT_MODIFY_OBJECT(),
            zemWrtConstants::getLPAR_CIM_CLASS(), &callBack, true);
    }
    GeneratedAppliance appliance{10};
    zemJvmHelperRef java;
    Waiting callBack;
    int sent = 0;
};

Listening& listening() {
    static Listening all;
    return all;
}

void EventDelay(benchmark::State& state) {
    constexpr unsigned kLongestPause = 20'000;
    std::minstd_rand random;
    std::vector<double> delays;
    Listening& heard = listening();
    appliance::Store store = appliance::Store::open(appliance::Database::Access::Write);
    for (auto _ : state) {
        usleep(static_cast<useconds_t>(random() % kLongestPause));  // changes come at any time
        delays.push_back(seconds([&] {
            appliance::Transaction change = store.write();
            store.append(kLine);
            change.commit();
            heard.callBack.wait(++heard.sent);
        }));
        state.SetIterationTime(delays.back());
    }
    std::nth_element(delays.begin(), delays.begin() + static_cast<long>(delays.size() / 2),
                     delays.end());
    state.counters["median_ms"] = delays[delays.size() / 2] * 1000;
}

void AskATool(benchmark::State& state) {
    listening();
    const char* const argv[] = {"qyplat", "-r", "lpar", "-F", "lpar_id,name", nullptr};
    for (auto _ : state) {
        benchmark::DoNotOptimize(spawnReadWait(argv));
    }
}

BENCHMARK(EventDelay)->UseManualTime()->Unit(benchmark::kMillisecond);
BENCHMARK(AskATool)->UseRealTime()->Unit(benchmark::kMillisecond);

}  // namespace
