/// Work on several threads at once, and waiting for what others do.
#pragma once

#include <chrono>
#include <functional>
#include <thread>
#include <vector>

/// Calls @p work with 0, 1 ... on a thread each and, once all run, @p meanwhile on this one;
/// returns when all have ended.
inline void onThreads(
    int count, const std::function<void(int)>& work,
    const std::function<void()>& meanwhile = [] {}) {
    std::vector<std::thread> threads;
    for (int i = 0; i < count; ++i) {
        threads.emplace_back(work, i);
    }
    meanwhile();
    for (std::thread& thread : threads) {
        thread.join();
    }
}

/// Whether @p happened comes true within @p time.
template <class F>
bool within(std::chrono::milliseconds time, F happened) {
    const auto until = std::chrono::steady_clock::now() + time;
    while (!happened() && std::chrono::steady_clock::now() < until) {
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    return happened();
}
