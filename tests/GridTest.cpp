#include "platform/Grid.h"

#include "TestCompany.h"
#include "platform/Error.h"

#include <gtest/gtest.h>

namespace dovrel {
namespace {

using test::W;

std::vector<std::string> RowTexts(const Grid& grid, int32_t row) {
    std::vector<std::string> texts;
    for (int32_t col = 0; col < grid.Cols(); ++col)
        texts.push_back(grid.TextMatrix(row, col));
    return texts;
}

TEST(GridTest, FormatStringMakesColumnsHeadingsAlignmentsAndWidths) {
    Grid grid("DocLines");
    std::string format = W("<שורה|<פריט    ") + "|^Mid|>Right  |Plain||<";
    grid.setFormatString(format);

    EXPECT_EQ(grid.FormatString(), format);
    ASSERT_EQ(grid.Cols(), 7);
    ASSERT_EQ(grid.Rows(), 1);
    EXPECT_EQ(RowTexts(grid, 0), (std::vector<std::string>{W("שורה"), W("פריט    "), "Mid",
                                                           "Right  ", "Plain", "", ""}));
    std::vector<int32_t> alignments, widths;
    for (int32_t col = 0; col < grid.Cols(); ++col) {
        alignments.push_back(grid.ColAlignment(col));
        widths.push_back(grid.ColWidthChars(col));
    }
    EXPECT_EQ(alignments, (std::vector<int32_t>{1, 1, 4, 7, 9, 9, 1}));
    EXPECT_EQ(widths, (std::vector<int32_t>{4, 8, 3, 7, 5, 0, 0}));
}

TEST(GridTest, TheLinesGridSetUpInItsCallingOrder) {
    Grid grid("DocLines");
    grid.setFormatString("<a|<b");
    grid.AddItem("old\tdata");
    grid.setRows(2);
    grid.setFixedRows(1);
    grid.Clear();
    EXPECT_EQ(RowTexts(grid, 0), (std::vector<std::string>{"", ""}));

    grid.setFormatString(W("<שורה|<פריט                    |<תאור"));
    for (int32_t col = 0; col < grid.Cols(); ++col)
        grid.setColAlignment(col, 7);

    EXPECT_EQ(grid.Rows(), 2);
    EXPECT_EQ(grid.FixedRows(), 1);
    EXPECT_EQ(grid.Cols(), 3);
    EXPECT_EQ(grid.TextMatrix(0, 1), W("פריט                    "));
    EXPECT_EQ(RowTexts(grid, 1), (std::vector<std::string>{"", "", ""}));
    EXPECT_EQ(grid.ColAlignment(2), 7);
    EXPECT_EQ(grid.ColWidthChars(1), 24);
}

TEST(GridTest, RowsGrowWithEmptyRowsAndShrinkFromTheEnd) {
    Grid grid("g");
    grid.setFormatString("a|b");
    grid.setRows(3);
    grid.setTextMatrix(1, 0, "one");
    grid.setTextMatrix(2, 1, "two");

    grid.setRows(2);
    EXPECT_EQ(grid.Rows(), 2);
    EXPECT_EQ(grid.TextMatrix(1, 0), "one");
    EXPECT_THROW(grid.TextMatrix(2, 1), Error);

    grid.setRows(4);
    EXPECT_EQ(RowTexts(grid, 2), (std::vector<std::string>{"", ""}));
    EXPECT_EQ(RowTexts(grid, 3), (std::vector<std::string>{"", ""}));

    grid.setRows(0);
    EXPECT_EQ(grid.Rows(), 0);
    EXPECT_THROW(grid.setRows(-1), Error);
    EXPECT_THROW(grid.setRows(2000000000), Error);
    EXPECT_EQ(grid.Rows(), 0);
}

TEST(GridTest, AddItemSplitsAtTabsAndInsertsAtAnIndex) {
    Grid grid("g");
    grid.setFormatString("a|b|c");
    grid.setFixedRows(1);

    grid.AddItem("1\t2\t3\t4\t5");
    grid.AddItem("x");
    grid.AddItem("\tmiddle\t");
    EXPECT_EQ(RowTexts(grid, 1), (std::vector<std::string>{"1", "2", "3"}));
    EXPECT_EQ(RowTexts(grid, 2), (std::vector<std::string>{"x", "", ""}));
    EXPECT_EQ(RowTexts(grid, 3), (std::vector<std::string>{"", "middle", ""}));

    grid.AddItem("first", 1);
    grid.AddItem("last", grid.Rows());
    grid.AddItem("top", 0);
    ASSERT_EQ(grid.Rows(), 7);
    EXPECT_EQ(grid.TextMatrix(0, 0), "top");
    EXPECT_EQ(grid.TextMatrix(1, 0), "a");
    EXPECT_EQ(grid.TextMatrix(2, 0), "first");
    EXPECT_EQ(grid.TextMatrix(3, 0), "1");
    EXPECT_EQ(grid.TextMatrix(6, 0), "last");

    EXPECT_THROW(grid.AddItem("bad", grid.Rows() + 1), Error);
    EXPECT_THROW(grid.AddItem("bad", -1), Error);
    EXPECT_EQ(grid.Rows(), 7);
}

TEST(GridTest, CellsOutsideTheGridAreErrors) {
    Grid grid("g");
    EXPECT_THROW(grid.TextMatrix(0, 0), Error);
    grid.setFormatString("a|b");
    grid.setRows(2);
    EXPECT_NO_THROW(grid.TextMatrix(1, 1));
    EXPECT_THROW(grid.TextMatrix(2, 0), Error);
    EXPECT_THROW(grid.TextMatrix(-1, 0), Error);
    EXPECT_THROW(grid.TextMatrix(0, 2), Error);
    EXPECT_THROW(grid.TextMatrix(0, -1), Error);
    EXPECT_THROW(grid.setTextMatrix(1, 2, "x"), Error);
    EXPECT_THROW(grid.ColAlignment(2), Error);
    EXPECT_THROW(grid.setColAlignment(-1, 7), Error);
    EXPECT_THROW(grid.setColAlignment(0, 10), Error);
    EXPECT_THROW(grid.ColWidthChars(2), Error);
}

TEST(GridTest, CurrentRowAndHeadingRows) {
    Grid grid("ItemPicLines");
    grid.setRows(1);
    grid.setFixedRows(1);
    grid.setFormatString("<From|<To");
    EXPECT_EQ(grid.Row(), -1);
    EXPECT_THROW(grid.setRow(1), Error);

    grid.AddItem("a\tb");
    grid.AddItem("c\td");
    grid.setRow(2);
    EXPECT_EQ(grid.Row(), 2);
    EXPECT_THROW(grid.setRow(3), Error);
    EXPECT_THROW(grid.setRow(-2), Error);

    grid.setRows(2);
    EXPECT_EQ(grid.Row(), 1);
    grid.setRows(1);
    EXPECT_EQ(grid.Row(), -1);

    grid.setFixedRows(3);
    EXPECT_EQ(grid.Rows(), 3);
    grid.setRows(2);
    EXPECT_EQ(grid.FixedRows(), 2);
    EXPECT_THROW(grid.setFixedRows(-1), Error);
}

TEST(GridTest, EveryChangeIsAnnounced) {
    Grid grid("g");
    int announced = 0;
    grid.changed.connect([&] { ++announced; });
    auto changes = [&](auto&& action) {
        int before = announced;
        action();
        return announced - before;
    };
    EXPECT_EQ(changes([&] { grid.setRows(2); }), 1);
    EXPECT_EQ(changes([&] { grid.setFixedRows(1); }), 1);
    EXPECT_EQ(changes([&] { grid.setFormatString("a|b"); }), 1);
    EXPECT_EQ(changes([&] { grid.setColAlignment(0, 7); }), 1);
    EXPECT_EQ(changes([&] { grid.AddItem("x"); }), 1);
    EXPECT_EQ(changes([&] { grid.AddItem("y", 1); }), 1);
    EXPECT_EQ(changes([&] { grid.setTextMatrix(1, 1, "z"); }), 1);
    EXPECT_EQ(changes([&] { grid.setTextMatrix(1, 1, "z"); }), 0);
    EXPECT_EQ(changes([&] { grid.setRow(1); }), 1);
    EXPECT_EQ(changes([&] { grid.Clear(); }), 1);
    EXPECT_EQ(changes([&] { EXPECT_THROW(grid.AddItem("bad", 99), Error); }), 0);
}

} // namespace
} // namespace dovrel
