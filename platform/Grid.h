#pragma once

#include "platform/Controls.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

// The lines grid and the picture ranges grid: a plain table model with
// exactly the grid members the control uses. Row 0 is the heading row once
// FixedRows is 1. Cell texts are code page 1255.
class Grid : public Control {
public:
    explicit Grid(std::string name) : Control(std::move(name), ControlKind::Grid) {}

    // Number of rows, heading row included. Setting a smaller number removes
    // every row beyond it; a larger one appends empty rows.
    int32_t Rows() const;
    void setRows(int32_t rows);

    // Number of columns, as made by the format string.
    int32_t Cols() const { return cols_; }

    // Heading texts separated by "|", one column each. A leading "<", "^" or
    // ">" sets the column's alignment (left, centre, right) and is not part of
    // the heading; the heading keeps its trailing spaces, which set the
    // column's initial width in characters. Setting it makes that many
    // columns and writes the headings into row 0 (making row 0 when missing).
    void setFormatString(std::string_view format);
    const std::string& FormatString() const { return format_; }

    int32_t FixedRows() const { return fixedRows_; }
    void setFixedRows(int32_t rows);

    // The current row (for the picture ranges grid), -1 when there is none.
    int32_t Row() const { return row_; }
    void setRow(int32_t row);

    // Alignment of a column, in the grid's own numbering
    // (7 = right, vertically centred).
    int32_t ColAlignment(int32_t col) const;
    void setColAlignment(int32_t col, int32_t alignment);
    // Initial width of a column in characters, from its heading.
    int32_t ColWidthChars(int32_t col) const;

    // Adds one row whose cells are the TAB-separated parts of the text; parts
    // beyond the last column are dropped, missing ones are empty. With an
    // index the row is inserted there (0 to Rows) and later rows move down.
    void AddItem(std::string_view text);
    void AddItem(std::string_view text, int32_t index);

    const std::string& TextMatrix(int32_t row, int32_t col) const;
    void setTextMatrix(int32_t row, int32_t col, std::string text);

    // Empties every cell; rows and columns stay.
    void Clear();

    // Announced after every change of rows, columns or cell texts.
    Signal<> changed;

private:
    void checkCell(int32_t row, int32_t col) const;
    void checkCol(int32_t col) const;

    std::vector<std::vector<std::string>> cells_;
    std::vector<int32_t> alignment_;
    std::vector<int32_t> widthChars_;
    std::string format_;
    int32_t cols_ = 0;
    int32_t fixedRows_ = 0;
    int32_t row_ = -1;
};

} // namespace dovrel
