#include "FailingAllocations.h"

#include <cstdlib>
#include <new>

// The global allocation functions, on top of malloc. A file of its own: where the compiler sees them beside
// their callers it takes one half of a pair for the other's mismatch.

namespace {

std::size_t g_failingSize = 0; ///< 0: no size fails
long g_countdown = 0;          ///< the allocation with which this reaches 0 fails
bool g_happened = false;

bool fails(std::size_t size) noexcept {
    const bool countedOut = g_countdown > 0 && --g_countdown == 0;
    const bool failing = countedOut || (g_failingSize != 0 && size == g_failingSize);
    g_happened = g_happened || failing;
    return failing;
}

} // namespace

FailingAllocations::FailingAllocations(std::size_t size, long number) {
    g_happened = false;
    g_failingSize = size;
    g_countdown = number;
}

FailingAllocations::~FailingAllocations() {
    g_failingSize = 0;
    g_countdown = 0;
}

bool FailingAllocations::happened() const { return g_happened; }

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return fails(size) ? nullptr : std::malloc(size == 0 ? 1 : size);
}
void* operator new(std::size_t size) {
    void* const memory = operator new(size, std::nothrow);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}
void* operator new[](std::size_t size) { return operator new(size); }
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept {
    return operator new(size, std::nothrow);
}

void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete(void* memory, const std::nothrow_t&) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, const std::nothrow_t&) noexcept { std::free(memory); }
