#pragma once

// The permission table: which rows (operations, options) are allowed in which mode through which output, in a
// block for each family or package.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

/// How far the tables reach. They are deliberately narrower than the vocabulary: no cell for the modes behind
/// SPI, nor for the outputs behind STAPL.
namespace extent {
inline constexpr int OPERATIONS = 32;
inline constexpr int OPTIONS = 24;
inline constexpr int MODES = 6;
inline constexpr int OUTPUTS = 5;
} // namespace extent

/// Cells that start out forbidden. All rows of a (block, mode, output) stand in one mask, so that a question
/// for all of them is one load. A cell that the table does not have is not written, and reads as forbidden.
class PermissionTable {
public:
    /// A table without a block: every answer is no.
    PermissionTable() = default;

    PermissionTable(std::size_t blocks, int rows, int modes, int outputs)
        : m_blocks(blocks), m_rows(std::min(rows, MOST_ROWS)), m_modes(modes), m_outputs(outputs),
          m_masks(blocks * static_cast<std::size_t>(modes) * static_cast<std::size_t>(outputs)) {}

    void allow(std::size_t block, int row, int mode, int output) {
        if (isCell(block, mode, output) && isRow(row)) {
            m_masks[position(block, mode, output)] |= bit(row);
        }
    }

    [[nodiscard]] bool allows(std::size_t block, int row, int mode, int output) const noexcept {
        return isRow(row) && (mask(block, mode, output) & bit(row)) != 0;
    }

    /// Bit i stands for row i.
    [[nodiscard]] std::uint32_t mask(std::size_t block, int mode, int output) const noexcept {
        return isCell(block, mode, output) ? m_masks[position(block, mode, output)] : 0;
    }

    [[nodiscard]] std::size_t blocks() const noexcept { return m_blocks; }

private:
    /// As many as a mask has bits.
    static constexpr int MOST_ROWS = 32;

    [[nodiscard]] static bool isWithin(int value, int bound) noexcept { return value >= 0 && value < bound; }

    /// Defined for any number, so that nobody has to prove that the row was tested.
    [[nodiscard]] static std::uint32_t bit(int row) noexcept {
        return std::uint32_t{1} << (static_cast<unsigned>(row) % unsigned{MOST_ROWS});
    }

    [[nodiscard]] bool isRow(int row) const noexcept { return isWithin(row, m_rows); }

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
