#include "platform/Grid.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

namespace dovrel {
namespace {

using test::W;
using Texts = std::vector<std::string>;

// Each row's cell texts joined with "|".
Texts AllRows(const Grid& grid) {
    Texts rows(static_cast<size_t>(grid.Rows()));
    for (int32_t row = 0; row < grid.Rows(); ++row)
        for (int32_t col = 0; col < grid.Cols(); ++col)
            rows[static_cast<size_t>(row)] += (col > 0 ? "|" : "") + grid.TextMatrix(row, col);
    return rows;
}

TEST(GridTest, FormatStringMakesColumnsHeadingsAlignmentsAndWidths) {
    Grid grid("DocLines");
    grid.setFormatString(W("<שורה|<פריט    ") + "|^Mid|>Right  |Plain||<");
    ASSERT_EQ(grid.Cols(), 7);
    EXPECT_EQ(AllRows(grid), (Texts{W("שורה|פריט    |Mid|Right  |Plain||")}));
    std::vector<std::pair<int32_t, int32_t>> columns;
    for (int32_t col = 0; col < 7; ++col)
        columns.emplace_back(grid.ColAlignment(col), grid.ColWidthChars(col));
    EXPECT_EQ(columns, (std::vector<std::pair<int32_t, int32_t>>{
                           {1, 4}, {1, 8}, {4, 3}, {7, 7}, {9, 5}, {9, 0}, {1, 0}}));
}

TEST(GridTest, RowsGrowAndShrinkFromTheEndAndCellsOutsideAreErrors) {
    Grid grid("g");
    EXPECT_THROW(grid.TextMatrix(0, 0), Error);
    grid.setFormatString("a|b");
    grid.setRows(3);
    grid.setTextMatrix(1, 0, "one");
    grid.setTextMatrix(2, 1, "two");
    grid.setRows(2);
    EXPECT_EQ(AllRows(grid), (Texts{"a|b", "one|"}));
    for (auto [row, col] : {std::pair{2, 0}, {-1, 0}, {0, 2}, {0, -1}}) {
        EXPECT_THROW(grid.TextMatrix(row, col), Error) << row << "," << col;
        EXPECT_THROW(grid.setTextMatrix(row, col, "x"), Error) << row << "," << col;
    }
    EXPECT_THROW(grid.ColAlignment(2), Error);
    EXPECT_THROW(grid.setColAlignment(-1, 7), Error);
    EXPECT_THROW(grid.setColAlignment(0, 10), Error);
    EXPECT_THROW(grid.ColWidthChars(2), Error);
    grid.setRows(4);
    EXPECT_EQ(AllRows(grid), (Texts{"a|b", "one|", "|", "|"}));
    // Clear empties the cells; a new format string keeps the rows and rewrites row 0.
    grid.Clear();
    grid.setFormatString("<x|y|z");
    EXPECT_EQ(AllRows(grid), (Texts{"x|y|z", "||", "||", "||"}));
    EXPECT_THROW(grid.setRows(-1), Error);
    EXPECT_THROW(grid.setRows(2000000000), Error);
    EXPECT_EQ(grid.Rows(), 4);
}

TEST(GridTest, AddItemSplitsAtTabsAndInsertsAtAnIndex) {
    Grid grid("g");
    grid.setFormatString("a|b|c");
    for (const char* item : {"1\t2\t3\t4\t5", "x", "\tmiddle\t"})
        grid.AddItem(item);
    grid.AddItem("first", 1);
    grid.AddItem("last", grid.Rows());
    grid.AddItem("top", 0);
    EXPECT_EQ(AllRows(grid),
              (Texts{"top||", "a|b|c", "first||", "1|2|3", "x||", "|middle|", "last||"}));
    EXPECT_THROW(grid.AddItem("bad", grid.Rows() + 1), Error);
    EXPECT_THROW(grid.AddItem("bad", -1), Error);
    EXPECT_EQ(grid.Rows(), 7);
}

// Many columns must not let the row limit alone take gigabytes: the cell
// count is limited too, and a refused change leaves the grid as it was.
TEST(GridTest, TooManyCellsAreAnErrorThatChangesNothing) {
    Grid wide("wide");
    wide.setFormatString(std::string(99, '|'));
    ASSERT_EQ(wide.Cols(), 100);
    EXPECT_THROW(wide.setRows(100000), Error);
    EXPECT_THROW(wide.setFixedRows(100000), Error);
    EXPECT_EQ(std::pair(wide.Rows(), wide.FixedRows()), std::pair(1, 0));

    Grid tall("tall");
    tall.setRows(1000000);
    EXPECT_THROW(tall.setFormatString("1|2|3|4|5|6|7|8|9"), Error);
    EXPECT_EQ(std::pair(tall.Cols(), tall.FormatString()), std::pair(0, std::string()));
    tall.setRows(10);
    tall.setFormatString("1|2|3|4|5|6|7|8|9");
    EXPECT_EQ(tall.TextMatrix(0, 8), "9");
}

TEST(GridTest, CurrentRowAndHeadingRows) {
    Grid grid("ItemPicLines");
    grid.setFixedRows(1);
    grid.setFormatString("<From|<To");
    EXPECT_EQ(grid.Row(), -1);
    EXPECT_THROW(grid.setRow(1), Error);
    grid.AddItem("a\tb");
    grid.AddItem("c\td");
    grid.setRow(2);
    EXPECT_EQ(grid.Row(), 2);
    for (int32_t row : {3, -2})
        EXPECT_THROW(grid.setRow(row), Error) << row;
    // Removing the current row moves it to the last one left, or to none.
    for (auto [rows, current] : {std::pair{2, 1}, {1, -1}}) {
        grid.setRows(rows);
        EXPECT_EQ(grid.Row(), current) << rows;
    }
    // More heading rows than rows add rows; fewer rows hold the heading rows to them.
    grid.setFixedRows(3);
    EXPECT_EQ(grid.Rows(), 3);
    grid.setRows(2);
    EXPECT_EQ(grid.FixedRows(), 2);
    EXPECT_THROW(grid.setFixedRows(-1), Error);
}

TEST(GridTest, EveryChangeIsAnnouncedOnce) {
    Grid grid("g");
    int announced = 0;
    Connection watching = grid.changed.connect([&] { ++announced; });
    auto changes = [&](auto&& action) {
        int before = announced;
        action();
        return announced - before;
    };
    EXPECT_EQ(changes([&] { grid.setRows(2); }), 1);
    EXPECT_EQ(changes([&] { grid.setFormatString("a|b"); }), 1);
    EXPECT_EQ(changes([&] { grid.AddItem("y", 1); }), 1);
    EXPECT_EQ(changes([&] { grid.setTextMatrix(1, 1, "z"); }), 1);
    EXPECT_EQ(changes([&] { grid.setTextMatrix(1, 1, "z"); }), 0);
    EXPECT_EQ(changes([&] { grid.setRow(1); }), 1);
    EXPECT_EQ(changes([&] { grid.Clear(); }), 1);
    EXPECT_EQ(changes([&] { EXPECT_THROW(grid.AddItem("bad", 99), Error); }), 0);
}

} // namespace
} // namespace dovrel
