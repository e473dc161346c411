/// Work on several threads at once.
#pragma once

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
