/// Makes one allocation of this thread fail. To be included once in a program: it replaces the
/// allocation functions for all of it, the libraries too.
#pragma once

#include <malloc.h>

#include <atomic>
#include <cstdint>
#include <cstdlib>
#include <new>

/// While it lives, the allocation after the next @p n throws std::bad_alloc; the others succeed.
class FailingAllocation {
public:
    explicit FailingAllocation(long n) { s_left = n; }
    ~FailingAllocation() { s_left = kNone; }

    bool happened() const { return s_left < 0; }

    /// How many allocations of the program have not been given back.
    static long live() { return s_live; }
    /// What this thread has taken and not given back, in bytes.
    static long bytes() { return s_bytes; }

    /// The size beyond which allocations of this thread fail.
    inline static thread_local std::size_t s_most = SIZE_MAX;

    static void* allocate(std::size_t size) {
        if (size > s_most || (s_left != kNone && s_left-- == 0)) {
            throw std::bad_alloc();
        }
        void* const memory = std::malloc(size != 0 ? size : 1);
        if (memory == nullptr) {
            throw std::bad_alloc();
        }
        ++s_live;
        s_bytes += static_cast<long>(malloc_usable_size(memory));
        return memory;
    }
    static void release(void* memory) {
        if (memory != nullptr) {
            --s_live;
            s_bytes -= static_cast<long>(malloc_usable_size(memory));
        }
        std::free(memory);
    }

private:
    static constexpr long kNone = 1L << 40;
    inline static thread_local long s_left = kNone;
    inline static thread_local long s_bytes = 0;
    inline static std::atomic<long> s_live{0};
};

void* operator new(std::size_t size) { return FailingAllocation::allocate(size); }
void* operator new[](std::size_t size) { return FailingAllocation::allocate(size); }
void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    try {
        return FailingAllocation::allocate(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}
void operator delete(void* memory) noexcept { FailingAllocation::release(memory); }
void operator delete[](void* memory) noexcept { FailingAllocation::release(memory); }
void operator delete(void* memory, std::size_t) noexcept { FailingAllocation::release(memory); }
void operator delete[](void* memory, std::size_t) noexcept { FailingAllocation::release(memory); }
