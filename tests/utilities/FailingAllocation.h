/// Makes one allocation of this thread fail. To be included once in a program: it replaces the
/// allocation functions for all of it, the libraries too.
#pragma once

#include <cstdlib>
#include <new>

/// While it lives, the allocation after the next @p n throws std::bad_alloc; the others succeed.
class FailingAllocation {
public:
    explicit FailingAllocation(long n) { s_left = n; }
    ~FailingAllocation() { s_left = kNone; }

    bool happened() const { return s_left < 0; }

    static void* allocate(std::size_t size) {
        if (s_left != kNone && s_left-- == 0) throw std::bad_alloc();
        void* const memory = std::malloc(size != 0 ? size : 1);
        if (memory == nullptr) throw std::bad_alloc();
        return memory;
    }

private:
    static constexpr long kNone = 1L << 40;
    inline static thread_local long s_left = kNone;
};

void* operator new(std::size_t size) { return FailingAllocation::allocate(size); }
void* operator new[](std::size_t size) { return FailingAllocation::allocate(size); }
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t) noexcept { std::free(memory); }
