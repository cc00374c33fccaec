#include "fixfiles/DocumentView.h"

#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Variant.h"

#include <algorithm>

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

// A line's row of the grid: its eight cells joined by TAB. A text-only line
// shows only its number and description.
std::string RowText(const Document::Line& line) {
    const char tab = '\t';
    std::string number = std::to_string(line.lineNumber);
    if (line.textOnly)
        return number + tab + tab + line.description.logical + std::string(5, tab);
    return number + tab + line.itemKey.logical + tab + line.description.logical + tab +
           line.details.logical + tab + PlainNumber(line.quantity) + tab +
           FormatAmount(line.price) + tab + line.currencyName + tab + FormatAmount(line.total);
}

} // namespace

DocumentView::DocumentView() = default;

void DocumentView::InitDocLines() {
    InitLines(DocLines);
}

void DocumentView::InitLines(Grid& grid) {
    grid.setRows(2);
    grid.setFixedRows(1);
    grid.Clear();
    grid.setFormatString(DocLinesFormat());
    int32_t cols = grid.Cols();
    for (int32_t col = 0; col < cols; ++col)
        grid.setColAlignment(col, 7);
}

void DocumentView::FillLines(Grid& grid, const Document* document) {
    InitLines(grid);
    if (document == nullptr)
        return;
    int32_t row = 0;
    for (const Document::Line& line : document->lines)
        grid.AddItem(RowText(line), ++row);
}

std::vector<DocumentView::BoxText> DocumentView::HeaderTexts(const Document* document) {
    std::vector<BoxText> texts = {
        {&DocumentView::txtAccountKey, {}},   {&DocumentView::txtReference1, {}},
        {&DocumentView::txtCustomerName, {}}, {&DocumentView::txtDate, {}},
        {&DocumentView::txtAddress1, {}},     {&DocumentView::txtAddress2, {}},
        {&DocumentView::txtTotalVat, {}},     {&DocumentView::txtVatValue, {}},
        {&DocumentView::txtTotal1, {}}};
    if (document == nullptr)
        return texts;
    const Document& d = *document;
    std::string values[] = {d.accountKey.logical,
                            d.reference.logical,
                            d.customer.logical,
                            FormatDate(d.date),
                            d.address1.logical,
                            d.address2.logical,
                            FormatAmount(d.totals.beforeVat),
                            FormatAmount(d.totals.vat),
                            FormatAmount(d.totals.withVat)};
    for (size_t i = 0; i < texts.size(); ++i)
        texts[i].second = std::move(values[i]);
    return texts;
}

void DocumentView::showDocument(Document document) {
    // Everything is worked out before the first control changes.
    std::vector<BoxText> texts = HeaderTexts(&document);
    FillLines(DocLines, &document);
    for (auto& [box, text] : texts)
        (this->*box).setText(std::move(text));
    document_ = std::move(document);
}

void DocumentView::showNothing() {
    for (auto& [box, text] : HeaderTexts(nullptr))
        (this->*box).setText(std::move(text));
    InitDocLines();
    document_.reset();
}

void DocumentView::takeCategoryCodes(const CurrentDocument& current) {
    if (!document_)
        return;
    int count = std::clamp<int>(current.lineCount, 0, kMaxDocLines);
    for (Document::Line& line : document_->lines) {
        if (line.textOnly || line.itemKey.logical.empty())
            continue;
        for (int k = 1; k <= count; ++k)
            if (EqualsNoCase(TrimCopy(current.lines[static_cast<size_t>(k)].itemKey),
                             line.itemKey.logical)) {
                line.categoryCode = current.lines[static_cast<size_t>(k)].catCode;
                break;
            }
    }
}

} // namespace dovrel
