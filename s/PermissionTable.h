#pragma once

// The permission table: which rows (operations, options) are allowed in which mode through which output, in a
// block for each family or package.

#include <cstddef>
#include <cstdint>
#include <vector>

/// The sizes of the tables. They are deliberately smaller than the vocabulary: there is no cell for the modes after
/// SPI, nor for the outputs after STAPL.
namespace tableDimensions {
inline constexpr int OPERATIONS = 32;
inline constexpr int OPTIONS = 24;
inline constexpr int MODES = 6;
inline constexpr int OUTPUTS = 5;
} // namespace tableDimensions

/// Cells start as forbidden. All rows of a (block, mode, output) are in one mask, so that a question for all of them is
/// one load. A cell outside the table is not written, and reads as forbidden.
class PermissionTable {
public:
    /// A table without a block: every answer is no.
    PermissionTable() = default;

    /// @param rows 32 at most, as many as a mask has bits; those after them are outside the table
    PermissionTable(std::size_t blocks, int rows, int modes, int outputs)
        : m_blocks(blocks), m_rows(rows), m_modes(modes), m_outputs(outputs),
          m_masks(blocks * static_cast<std::size_t>(modes) * static_cast<std::size_t>(outputs)) {}

    void allow(std::size_t block, int row, int mode, int output) {
        if (isCell(block, mode, output)) {
            m_masks[position(block, mode, output)] |= bit(row);
        }
    }

    [[nodiscard]] bool allows(std::size_t block, int row, int mode, int output) const noexcept {
        return (mask(block, mode, output) & bit(row)) != 0;
    }

    /// Bit i is set when row i is allowed.
    [[nodiscard]] std::uint32_t mask(std::size_t block, int mode, int output) const noexcept {
        return isCell(block, mode, output) ? m_masks[position(block, mode, output)] : 0;
    }

    [[nodiscard]] std::size_t blocks() const noexcept { return m_blocks; }

private:
    static constexpr int MAX_ROWS = 32;

    [[nodiscard]] static bool isWithin(int value, int bound) noexcept { return value >= 0 && value < bound; }

    /// The bit of a row in a mask; none for a row outside the table.
    [[nodiscard]] std::uint32_t bit(int row) const noexcept {
        return isWithin(row, m_rows) && row < MAX_ROWS ? std::uint32_t{1} << row : 0;
    }

    [[nodiscard]] bool isCell(std::size_t block, int mode, int output) const noexcept {
        return block < m_blocks && isWithin(mode, m_modes) && isWithin(output, m_outputs);
    }

    [[nodiscard]] std::size_t position(std::size_t block, int mode, int output) const noexcept {
        const auto modes = static_cast<std::size_t>(m_modes);
        const auto outputs = static_cast<std::size_t>(m_outputs);
        return (block * modes + static_cast<std::size_t>(mode)) * outputs + static_cast<std::size_t>(output);
    }

    std::size_t m_blocks = 0;
    int m_rows = 0;
    int m_modes = 0;
    int m_outputs = 0;
    std::vector<std::uint32_t> m_masks;
};
