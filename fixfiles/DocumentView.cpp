#include "fixfiles/DocumentView.h"

#include "platform/Encoding.h"

namespace dovrel {
namespace {

// The eight headings of the lines grid, each left-aligned and followed by the
// spaces that give the column its initial width.
const std::string& DocLinesFormat() {
    static const std::string format =
        FromUtf8("<שורה|<פריט" + std::string(20, ' ') + "|<תאור" + std::string(70, ' ') +
                 "|<פרטים" + std::string(40, ' ') + "|<כמות" + std::string(10, ' ') + "|<מחיר" +
                 std::string(20, ' ') + "|<מטבע|<סהכ שח" + std::string(20, ' '));
    return format;
}

} // namespace

DocumentView::DocumentView() = default;

void DocumentView::InitDocLines() {
    DocLines.setRows(2);
    DocLines.setFixedRows(1);
    DocLines.Clear();
    DocLines.setFormatString(DocLinesFormat());
    int32_t cols = DocLines.Cols();
    for (int32_t col = 0; col < cols; ++col)
        DocLines.setColAlignment(col, 7);
}

} // namespace dovrel
