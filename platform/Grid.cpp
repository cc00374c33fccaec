#include "platform/Grid.h"

#include "platform/Error.h"

#include <algorithm>

namespace dovrel {

namespace {

constexpr int32_t kAlignLeftCentre = 1;
constexpr int32_t kAlignCentreCentre = 4;
constexpr int32_t kAlignRightCentre = 7;
constexpr int32_t kAlignGeneral = 9;

// Far beyond any document or range list; keeps a bad row count from
// exhausting memory.
constexpr int32_t kMaxRows = 1000000;
// The same for the cells: a format string of many columns would otherwise let
// the row limit alone take gigabytes. Eight columns, as in the lines grid,
// still reach the row limit.
constexpr int64_t kMaxCells = int64_t{kMaxRows} * 8;

void CheckCells(const std::string& grid, int64_t rows, int64_t cols) {
    if (rows * cols > kMaxCells)
        throw Error("Grid " + grid + ": " + std::to_string(rows) + " rows of " +
                    std::to_string(cols) + " columns are too many cells");
}

// Splits text at every separator; n separators give n + 1 parts.
std::vector<std::string_view> Split(std::string_view text, char separator) {
    std::vector<std::string_view> parts;
    size_t start = 0;
    for (;;) {
        size_t end = text.find(separator, start);
        if (end == std::string_view::npos) {
            parts.push_back(text.substr(start));
            return parts;
        }
        parts.push_back(text.substr(start, end - start));
        start = end + 1;
    }
}

int32_t AlignmentOfPrefix(char c) {
    switch (c) {
    case '<':
        return kAlignLeftCentre;
    case '^':
        return kAlignCentreCentre;
    case '>':
        return kAlignRightCentre;
    default:
        return kAlignGeneral;
    }
}

} // namespace

int32_t Grid::Rows() const {
    return static_cast<int32_t>(cells_.size());
}

void Grid::setRows(int32_t rows) {
    if (rows < 0 || rows > kMaxRows)
        throw Error("Grid " + name() + ": invalid row count " + std::to_string(rows));
    CheckCells(name(), rows, cols_);
    cells_.resize(static_cast<size_t>(rows), std::vector<std::string>(static_cast<size_t>(cols_)));
    fixedRows_ = std::min(fixedRows_, rows);
    if (row_ >= rows)
        row_ = rows - 1 >= fixedRows_ ? rows - 1 : -1;
    changed();
}

void Grid::setFormatString(std::string_view format) {
    std::vector<std::string_view> parts;
    if (!format.empty())
        parts = Split(format, '|');
    CheckCells(name(), std::max<int64_t>(Rows(), 1), static_cast<int64_t>(parts.size()));
    format_ = std::string(format);
    alignment_.clear();
    widthChars_.clear();
    std::vector<std::string> headings;
    for (std::string_view part : parts) {
        int32_t alignment = part.empty() ? kAlignGeneral : AlignmentOfPrefix(part.front());
        if (alignment != kAlignGeneral)
            part.remove_prefix(1);
        alignment_.push_back(alignment);
        widthChars_.push_back(static_cast<int32_t>(part.size()));
        headings.emplace_back(part);
    }
    cols_ = static_cast<int32_t>(headings.size());
    for (auto& row : cells_)
        row.resize(headings.size());
    if (cells_.empty() && cols_ > 0)
        cells_.emplace_back(headings.size());
    for (size_t col = 0; col < headings.size(); ++col)
        cells_[0][col] = std::move(headings[col]);
    changed();
}

void Grid::setFixedRows(int32_t rows) {
    if (rows < 0 || rows > kMaxRows)
        throw Error("Grid " + name() + ": invalid heading row count " + std::to_string(rows));
    CheckCells(name(), std::max(rows, Rows()), cols_);
    if (rows > Rows())
        cells_.resize(static_cast<size_t>(rows),
                      std::vector<std::string>(static_cast<size_t>(cols_)));
    fixedRows_ = rows;
    changed();
}

void Grid::setRow(int32_t row) {
    if (row < -1 || row >= Rows())
        throw Error("Grid " + name() + ": row " + std::to_string(row) + " does not exist");
    if (row == row_)
        return;
    row_ = row;
    changed();
}

int32_t Grid::ColAlignment(int32_t col) const {
    checkCol(col);
    return alignment_[static_cast<size_t>(col)];
}

void Grid::setColAlignment(int32_t col, int32_t alignment) {
    checkCol(col);
    if (alignment < 0 || alignment > kAlignGeneral)
        throw Error("Grid " + name() + ": invalid column alignment " + std::to_string(alignment));
    alignment_[static_cast<size_t>(col)] = alignment;
    changed();
}

int32_t Grid::ColWidthChars(int32_t col) const {
    checkCol(col);
    return widthChars_[static_cast<size_t>(col)];
}

void Grid::AddItem(std::string_view text) {
    AddItem(text, Rows());
}

void Grid::AddItem(std::string_view text, int32_t index) {
    if (index < 0 || index > Rows())
        throw Error("Grid " + name() + ": cannot add a row at " + std::to_string(index) + " of " +
                    std::to_string(Rows()));
    if (Rows() >= kMaxRows)
        throw Error("Grid " + name() + ": too many rows");
    CheckCells(name(), int64_t{Rows()} + 1, cols_);
    std::vector<std::string> row(static_cast<size_t>(cols_));
    std::vector<std::string_view> parts = Split(text, '\t');
    for (size_t col = 0; col < row.size() && col < parts.size(); ++col)
        row[col] = std::string(parts[col]);
    cells_.insert(cells_.begin() + index, std::move(row));
    changed();
}

const std::string& Grid::TextMatrix(int32_t row, int32_t col) const {
    checkCell(row, col);
    return cells_[static_cast<size_t>(row)][static_cast<size_t>(col)];
}

void Grid::setTextMatrix(int32_t row, int32_t col, std::string text) {
    checkCell(row, col);
    std::string& cell = cells_[static_cast<size_t>(row)][static_cast<size_t>(col)];
    if (cell == text)
        return;
    cell = std::move(text);
    changed();
}

void Grid::Clear() {
    for (auto& row : cells_)
        for (auto& cell : row)
            cell.clear();
    changed();
}

void Grid::checkCell(int32_t row, int32_t col) const {
    if (row < 0 || row >= Rows() || col < 0 || col >= cols_)
        throw Error("Grid " + name() + ": cell (" + std::to_string(row) + ", " +
                    std::to_string(col) + ") is outside " + std::to_string(Rows()) + " rows and " +
                    std::to_string(cols_) + " columns");
}

void Grid::checkCol(int32_t col) const {
    if (col < 0 || col >= cols_)
        throw Error("Grid " + name() + ": column " + std::to_string(col) + " is outside " +
                    std::to_string(cols_) + " columns");
}

} // namespace dovrel
