#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <chrono>

#include "AtomicType.h"
#include "OnThreads.h"
#include "Pipe.h"
#include "Thread.h"

namespace {

using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;

TEST(ThreadSynchronizerTest, IsRecursiveAndKeepsOthersOut) {
    zemSynchronizerContext context;
    zemAtomicType<int> counted(5);
    int plain = 0;
    onThreads(4, [&](int) {
        for (int i = 0; i < 5000; ++i) {
            ++counted;
            zemSynchronizer outer(context);
            zemSynchronizer inner(context);
            ++plain;
        }
    });
    EXPECT_EQ(plain, 20000);
    EXPECT_EQ(counted++, 20005);
    EXPECT_EQ(counted -= 6, 20000);
}

TEST(ThreadConditionTest, TimedWaitCrossesASecond) {
    timespec now{};
    do {
        clock_gettime(CLOCK_REALTIME, &now);
    } while (now.tv_nsec < 700000000L || now.tv_nsec > 800000000L);
    zemCondition condition;
    const auto start = Clock::now();
    condition.timedWait(400);
    condition.timedWait(-5);
    EXPECT_GE(Clock::now() - start, 390ms);
    EXPECT_LT(Clock::now() - start, 5s);
}

TEST(ThreadConditionTest, SignalWakesAllWaiters) {
    zemCondition condition;
    std::atomic<int> awake{0};
    const auto wait = [&](int) {
        condition.wait();
        ++awake;
    };
    onThreads(4, wait, [&] {
        usleep(100000);
        condition.signal();
        EXPECT_TRUE(within(20s, [&] { return awake > 1; })) << "a broadcast";
        while (awake < 4) {
            condition.signal();  // one that came late to its wait
        }
    });
}

struct Gate {
    std::atomic<bool> open{false};
    std::atomic<int> id{0};
    static void pass(void* gate) {
        auto* const self = static_cast<Gate*>(gate);
        self->id = zemThread::getCurrentThreadId();
        EXPECT_TRUE(within(20s, [self] { return self->open.load(); }));
    }
};

TEST(ThreadTest, RunsAndCanRunAgain) {
    zemThread thread;
    thread.waitThreadExit();
    EXPECT_EQ(thread.cancel(), 0);
    EXPECT_EQ(thread.resume(), ESRCH);
    for (int round = 0; round < 2; ++round) {
        Gate gate;
        ASSERT_EQ(thread.start(Gate::pass, &gate), 0);
        EXPECT_TRUE(within(20s, [&] { return gate.id == thread.getThreadId(); }));
        EXPECT_TRUE(thread.isStarted());
        EXPECT_EQ(thread.start(Gate::pass, &gate), EBUSY);
        gate.open = true;
        EXPECT_TRUE(within(20s, [&] { return !thread.isStarted(); }));
    }
    thread.waitThreadExit();
    EXPECT_EQ(thread.getThreadId(), 0) << "not to be joined again";
}

TEST(ThreadTest, IsNeverStartedWithoutItsHandle) {
    zemThread thread;
    for (int i = 0; i < 500; ++i) {
        const auto look = [](void* own) {
            const auto& self = *static_cast<zemThread*>(own);
            EXPECT_TRUE(self.isStarted());
            EXPECT_EQ(self.getThreadId(), zemThread::getCurrentThreadId());
        };
        ASSERT_EQ(thread.start(look, &thread), 0);
        thread.waitThreadExit();
    }
}

// Sets its flag when the stack is unwound.
struct Witness {
    explicit Witness(void* flag) : unwound(static_cast<std::atomic<bool>*>(flag)) {}
    ~Witness() { *unwound = true; }
    static void run(void (*method)()) { method(); }
    std::atomic<bool>* unwound;
};

zemCondition neverSignalled;

TEST(ThreadTest, EndsQuietlyHoweverTheMethodEnds) {
    const zemThread::StartMethod methods[] = {
        [](void* flag) { throw Witness(flag); },
        [](void* flag) { Witness(flag).run(zemThread::Exit); },
        [](void* flag) { Witness(flag).run([] { neverSignalled.wait(); }); },  // to be cancelled
        [](void* flag) {  // cancelled before destructors that wait and close
            pthread_cancel(pthread_self());
            {
                zemPipe pipe;
                zemThread inner;
                EXPECT_EQ(pipe.openPipe() + inner.start([](void*) { usleep(1000); }, nullptr), 0);
            }
            Witness(flag).run(pthread_testcancel);
        },
    };
    for (const auto method : methods) {
        std::atomic<bool> unwound{false};
        {
            zemThread thread;
            ASSERT_EQ(thread.start(method, &unwound), 0);
            EXPECT_TRUE(within(20s, [&] { return thread.isStarted() == (method == methods[2]); }));
            EXPECT_EQ(thread.cancel(), 0);
            EXPECT_FALSE(thread.isStarted());
        }
        EXPECT_TRUE(unwound);
    }
    neverSignalled.signal();  // blocks for good if the cancelled wait kept the mutex
}

TEST(ThreadQueueTest, DeliversInOrderAndNeverHangs) {
    zemControlledDataCommunication queue;
    int data[5000] = {};
    const auto produce = [&](int) {
        for (int i = 0; i < 5000; ++i) {
            data[i] = i;
            queue.putControlledData(&data[i], i + 1);
            usleep(i % 500 == 0 ? 2000 : 0);
        }
    };
    onThreads(1, produce, [&] {
        for (int i = 0; i < 5000; ++i) {
            int size = 0;
            const void* const got = queue.getControlledData(size);
            EXPECT_EQ(got, &data[i]);
            EXPECT_EQ(size, data[i] + 1);
        }
    });
    queue.putControlledData(data, 0);  // dropped, without a leak, at destruction
    queue.putControlledData(data, 1);
}

}  // namespace
