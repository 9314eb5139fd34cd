#pragma once

// Allocations that fail on demand. Linking its source replaces the global allocation functions.

#include <cstddef>

/// Lets allocations fail from its construction to its end.
class FailingAllocations {
public:
    /// All allocations of `size` bytes.
    [[nodiscard]] static FailingAllocations ofSize(std::size_t size) { return {size, 0}; }

    /// The one allocation number `number`, counted from 1.
    [[nodiscard]] static FailingAllocations atNumber(long number) { return {0, number}; }

    ~FailingAllocations();
    FailingAllocations(const FailingAllocations&) = delete;
    FailingAllocations& operator=(const FailingAllocations&) = delete;

    /// Has any failed since?
    [[nodiscard]] bool happened() const;

private:
    FailingAllocations(std::size_t size, long number);
};
