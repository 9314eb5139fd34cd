#pragma once

#include <rapidcheck.h>

#include <cstddef>
#include <string>
#include <vector>

namespace reference {

using Words = std::vector<std::string>;

/// Makes choices from one stream of random numbers.
class RandomSource {
public:
    explicit RandomSource(const rc::Random& random) : m_random(random) {}

    /// From 0 to `count` - 1.
    [[nodiscard]] int below(int count) {
        return static_cast<int>(m_random.next() % static_cast<unsigned long>(count));
    }

    [[nodiscard]] bool chance(int percent) { return below(100) < percent; }

    template <typename Element>
    [[nodiscard]] const Element& from(const std::vector<Element>& elements) {
        return elements[static_cast<std::size_t>(below(static_cast<int>(elements.size())))];
    }

private:
    rc::Random m_random;
};

} // namespace reference
