// The grid model. The input is a format string up to its first newline,
// then operations, one per byte with its arguments taken from the bytes
// after it.

#include "FuzzSupport.h"

#include "platform/Error.h"
#include "platform/Grid.h"

using namespace dovrel;
using dovrel::fuzz::Bytes;
using dovrel::fuzz::Require;

namespace {

// A row or column number near the grid's size most of the time, anything
// at all now and then.
int32_t Index(Bytes& in, int32_t size) {
    uint8_t b = in.byte();
    if (b == 0xFF)
        return in.int32();
    return static_cast<int32_t>(b % 8) - 2 + (b & 0x80 ? size : 0);
}

void Operate(Grid& grid, uint8_t op, Bytes& in) {
    switch (op % 9) {
    case 0:
        grid.AddItem(in.text(in.byte() % 32));
        break;
    case 1:
        grid.AddItem(in.text(in.byte() % 32), Index(in, grid.Rows()));
        break;
    case 2:
        grid.setRows(Index(in, grid.Rows()));
        break;
    case 3: {
        int32_t row = Index(in, grid.Rows());
        grid.TextMatrix(row, Index(in, grid.Cols()));
        break;
    }
    case 4: {
        int32_t row = Index(in, grid.Rows());
        int32_t col = Index(in, grid.Cols());
        grid.setTextMatrix(row, col, in.text(in.byte() % 16));
        break;
    }
    case 5:
        grid.setFixedRows(Index(in, grid.Rows()));
        break;
    case 6:
        grid.setRow(Index(in, grid.Rows()));
        break;
    case 7:
        grid.setColAlignment(Index(in, grid.Cols()), static_cast<int32_t>(in.byte() % 12) - 1);
        break;
    default:
        grid.Clear();
        break;
    }
}

void CheckShape(const Grid& grid) {
    Require(grid.Rows() >= 0 && grid.Cols() >= 0, "sizes are not negative");
    Require(grid.FixedRows() <= grid.Rows(), "heading rows exist");
    Require(grid.Row() >= -1 && grid.Row() < grid.Rows(), "the current row exists");
    for (int32_t col = 0; col < grid.Cols(); ++col) {
        grid.ColAlignment(col);
        grid.ColWidthChars(col);
        if (grid.Rows() > 0)
            grid.TextMatrix(grid.Rows() - 1, col);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    std::string_view input(reinterpret_cast<const char*>(data), size);
    size_t newline = input.find('\n');
    Grid grid("DocLines");
    grid.setFormatString(input.substr(0, newline));
    Require(grid.FormatString() == input.substr(0, newline), "the format string is kept");
    std::string_view ops = newline == std::string_view::npos ? "" : input.substr(newline + 1);
    Bytes in(reinterpret_cast<const uint8_t*>(ops.data()), ops.size());
    for (int steps = 0; !in.rest().empty() && steps < 64; ++steps) {
        try {
            Operate(grid, in.byte(), in);
        } catch (const Error&) {
        }
        CheckShape(grid);
        if (steps % 8 == 7) {
            try {
                grid.setFormatString(in.text(in.byte() % 24));
            } catch (const Error&) {
            }
        }
    }
    return 0;
}
