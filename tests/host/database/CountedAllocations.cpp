#include "CountedAllocations.h"

#include <cstdlib>
#include <new>

// Replaces the allocation functions of the program that it is linked to. Apart from the tests, so that the
// compiler does not look into both an allocation and its counterpart.

namespace {

bool isArmed = false;
std::size_t requests = 0;
std::size_t failingRequest = 0; ///< counted from 1; 0 for none

} // namespace

void* operator new(std::size_t size) {
    if (isArmed && ++requests == failingRequest) {
        throw std::bad_alloc();
    }
    void* const memory = std::malloc(size == 0 ? 1 : size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    try {
        return operator new(size);
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

void* operator new[](std::size_t size) { return operator new(size); }
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t) noexcept { std::free(memory); }

bool runFailing(std::size_t failing, const std::function<void()>& action) {
    requests = 0;
    failingRequest = failing;
    isArmed = true;
    bool isDone = true;
    try {
        action();
    } catch (const std::bad_alloc&) {
        isDone = false;
    }
    isArmed = false;
    return isDone;
}

std::size_t countAllocations(const std::function<void()>& action) {
    constexpr std::size_t NONE = 0;
    static_cast<void>(runFailing(NONE, action));
    return requests;
}
