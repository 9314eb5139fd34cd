#include "measure/Allocations.h"

#include <cstdlib>
#include <new>

// Replaces the allocation functions of the program that it is linked to, so that requests are counted and not
// guessed. Apart from the measures, so that the compiler does not look into both an allocation and its counterpart.

namespace {

std::size_t requests = 0;

} // namespace

std::size_t bench::allocationsSoFar() noexcept { return requests; }

void* operator new(std::size_t size) {
    ++requests;
    void* const memory = std::malloc(size == 0 ? 1 : size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

void* operator new[](std::size_t size) { return operator new(size); }
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t) noexcept { std::free(memory); }
