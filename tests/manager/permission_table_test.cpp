#include "Members.h"

#include <climits>
#include <cstdint>

// The permission table by itself: one cell at a time, and nothing outside its extents.

using testing::ElementsAre;
using testing::IsEmpty;

namespace {

constexpr std::size_t HUGE_BLOCK = static_cast<std::size_t>(-1);

TEST(PermissionTable, StartsWithNothingAllowed) {
    const PermissionTable table(3, 32, 6, 5);
    EXPECT_EQ(table.blocks(), 3U);
    EXPECT_THAT(allowedCells(table, 32, 6, 5), IsEmpty());
}

TEST(PermissionTable, EachCellStandsForItself) {
    for (std::size_t block = 0; block < 2; ++block) {
        for (int row = 0; row < 32; ++row) {
            for (int mode = 0; mode < 6; ++mode) {
                for (int output = 0; output < 5; ++output) {
                    PermissionTable table(2, 32, 6, 5);
                    table.allow(block, row, mode, output);
                    EXPECT_THAT(allowedCells(table, 32, 6, 5), ElementsAre(Cell{block, row, mode, output}));
                }
            }
        }
    }
}

TEST(PermissionTable, AllowingTwiceChangesNothing) {
    PermissionTable table(1, 32, 6, 5);
    table.allow(0, 3, 2, 1);
    table.allow(0, 3, 2, 1);
    EXPECT_THAT(allowedCells(table, 32, 6, 5), ElementsAre(Cell{0, 3, 2, 1}));
}

TEST(PermissionTable, MaskHasABitForEachAllowedRow) {
    PermissionTable table(2, 32, 6, 5);
    table.allow(1, 0, 5, 4);
    table.allow(1, 5, 5, 4);
    table.allow(1, 31, 5, 4);
    EXPECT_EQ(table.mask(1, 5, 4), 0x80000021U);
    EXPECT_EQ(table.mask(0, 5, 4), 0U);
    EXPECT_EQ(table.mask(1, 4, 4), 0U);
    EXPECT_EQ(table.mask(1, 5, 3), 0U);
}

TEST(PermissionTable, MaskOfAFullColumnHasNoBitAboveTheRows) {
    PermissionTable table(1, 24, 6, 5);
    for (int row = -40; row < 80; ++row) {
        table.allow(0, row, 0, 0);
    }
    EXPECT_EQ(table.mask(0, 0, 0), 0x00FFFFFFU);
}

TEST(PermissionTable, HasNoMoreRowsThanAMaskHasBits) {
    PermissionTable table(1, 40, 1, 1);
    for (int row = 1; row < 40; ++row) {
        table.allow(0, row, 0, 0);
    }
    EXPECT_EQ(table.mask(0, 0, 0), 0xFFFFFFFEU);
    EXPECT_FALSE(table.allows(0, 32, 0, 0));
}

TEST(PermissionTable, CellsOutsideTheExtentsAreDropped) {
    PermissionTable table(2, 32, 6, 5);
    for (const std::size_t block : {std::size_t{0}, std::size_t{1}, std::size_t{2}, HUGE_BLOCK}) {
        for (const int row : {INT_MIN, -1, 0, 31, 32, 33, 64, INT_MAX}) {
            for (const int mode : {INT_MIN, -1, 0, 5, 6, 7, INT_MAX}) {
                for (const int output : {INT_MIN, -1, 0, 4, 5, 6, 30, INT_MAX}) {
                    const bool inside = block < 2 && row >= 0 && row < 32 && mode >= 0 && mode < 6 &&
                                        output >= 0 && output < 5;
                    if (!inside) {
                        table.allow(block, row, mode, output);
                        EXPECT_FALSE(table.allows(block, row, mode, output));
                    }
                }
            }
        }
    }
    EXPECT_THAT(allowedCells(table, 32, 6, 5), IsEmpty());
}

TEST(PermissionTable, NothingIsAllowedOutsideTheExtents) {
    PermissionTable table(1, 32, 6, 5);
    for (int row = 0; row < 32; ++row) {
        for (int mode = 0; mode < 6; ++mode) {
            for (int output = 0; output < 5; ++output) {
                table.allow(0, row, mode, output);
            }
        }
    }
    for (const int beyond : {INT_MIN, -1, 32, INT_MAX}) {
        EXPECT_FALSE(table.allows(0, beyond, 0, 0));
        EXPECT_FALSE(table.allows(0, 0, beyond, 0));
        EXPECT_FALSE(table.allows(0, 0, 0, beyond));
        EXPECT_EQ(table.mask(0, beyond, 0), 0U);
        EXPECT_EQ(table.mask(0, 0, beyond), 0U);
    }
    for (const std::size_t block : {std::size_t{1}, HUGE_BLOCK}) {
        EXPECT_FALSE(table.allows(block, 0, 0, 0));
        EXPECT_EQ(table.mask(block, 0, 0), 0U);
    }
    EXPECT_EQ(table.mask(0, 5, 4), 0xFFFFFFFFU);
}

TEST(PermissionTable, WithoutBlocksHoldsNothing) {
    PermissionTable table(0, 32, 6, 5);
    EXPECT_EQ(table.blocks(), 0U);
    table.allow(0, 0, 0, 0);
    table.allow(HUGE_BLOCK, 0, 0, 0);
    EXPECT_FALSE(table.allows(0, 0, 0, 0));
    EXPECT_EQ(table.mask(0, 0, 0), 0U);
    EXPECT_EQ(table.mask(HUGE_BLOCK, 0, 0), 0U);
}

TEST(PermissionTable, OfOneModeHasNoOther) {
    PermissionTable table(2, 32, 1, 5);
    table.allow(0, 4, 1, 0);
    table.allow(0, 4, -1, 0);
    EXPECT_THAT(allowedCells(table, 32, 1, 5), IsEmpty());
    table.allow(1, 31, 0, 4);
    EXPECT_THAT(allowedCells(table, 32, 1, 5), ElementsAre(Cell{1, 31, 0, 4}));
    EXPECT_EQ(table.mask(1, 0, 4), 0x80000000U);
}

} // namespace
