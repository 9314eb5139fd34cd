#pragma once

// What the masks mean that `ConstraintsManager` returns: bit i stands for the enumeration's value i. Optional: the
// manager does not need this header.

#include <cstddef>
#include <iterator>

/// Does a mask hold a value?
/// @param mask as a method of `ConstraintsManager` returns it; bit 31 makes it negative
/// @param value of the enumeration that the mask is for
/// @return whether its bit is set; false for values outside 0 to 31
template <typename Value>
[[nodiscard]] constexpr bool maskHolds(int mask, Value value) noexcept {
    const int bit = static_cast<int>(value);
    return bit >= 0 && bit < 32 && (static_cast<unsigned>(mask) >> bit & 1U) != 0;
}

/// The values that a mask holds, in ascending order, as a range for `for`:
/// `for (const OP_TYPE operation : MaskValues<OP_TYPE>(mask))`.
/// @tparam Value the enumeration that the mask is for, or an integer type
template <typename Value>
class MaskValues {
public:
    /// Goes over the values of a mask.
    class Iterator {
    public:
        using iterator_category = std::input_iterator_tag; ///< of the standard library
        using value_type = Value;                          ///< of the standard library
        using difference_type = std::ptrdiff_t;            ///< of the standard library
        using pointer = const Value*;                      ///< of the standard library
        using reference = Value;                           ///< of the standard library

        /// The end of every mask.
        constexpr Iterator() noexcept = default;

        /// @return the value, of an iterator that is not at the end
        [[nodiscard]] constexpr Value operator*() const noexcept {
            int bit = 0;
            while ((m_rest >> bit & 1U) == 0) {
                ++bit;
            }
            return static_cast<Value>(bit);
        }

        /// Goes to the next value.
        /// @return this iterator
        constexpr Iterator& operator++() noexcept {
            m_rest &= m_rest - 1; // clears the lowest bit
            return *this;
        }

        /// Goes to the next value.
        /// @return the iterator as it was
        constexpr Iterator operator++(int) noexcept {
            const Iterator former = *this;
            ++*this;
            return former;
        }

        /// @param other an iterator of the same mask
        /// @return whether both are at the same value
        [[nodiscard]] constexpr bool operator==(const Iterator& other) const noexcept {
            return m_rest == other.m_rest;
        }
        /// @param other an iterator of the same mask
        /// @return whether they are at different values
        [[nodiscard]] constexpr bool operator!=(const Iterator& other) const noexcept {
            return m_rest != other.m_rest;
        }

    private:
        friend class MaskValues;
        constexpr explicit Iterator(unsigned rest) noexcept : m_rest(rest) {}

        unsigned m_rest = 0; ///< the values from here on
    };

    /// @param mask as a method of `ConstraintsManager` returns it
    constexpr explicit MaskValues(int mask) noexcept : m_mask(static_cast<unsigned>(mask)) {}

    /// @return the lowest value
    [[nodiscard]] constexpr Iterator begin() const noexcept { return Iterator(m_mask); }
    /// @return the end
    [[nodiscard]] constexpr Iterator end() const noexcept { return Iterator(); }

    /// @return whether there are no values; not the same as `mask > 0`, since bit 31 makes a mask negative
    [[nodiscard]] constexpr bool empty() const noexcept { return m_mask == 0; }

private:
    unsigned m_mask;
};
