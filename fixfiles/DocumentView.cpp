#include "fixfiles/DocumentView.h"

#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/Variant.h"

#include <algorithm>

namespace dovrel {
namespace {

// The eight headings of the lines grid, each left-aligned and followed by the
// spaces that give the column its initial width.
const std::string& DocLinesFormat() {
    static const std::string format =
        FromUtf8(Utf8("<שורה|<פריט" + std::string(20, ' ') + "|<תאור" + std::string(70, ' ') +
                      "|<פרטים" + std::string(40, ' ') + "|<כמות" + std::string(10, ' ') +
                      "|<מחיר" + std::string(20, ' ') + "|<מטבע|<סהכ שח" + std::string(20, ' ')));
    return format;
}

// A line's row of the grid: its eight cells joined by TAB. A text-only line
// shows only its number and description.
std::string RowText(const Document::Line& line, bool reading) {
    auto text = [reading](const DocumentText& t) { return reading ? t.reading : t.logical; };
    const char tab = '\t';
    std::string number = std::to_string(line.lineNumber);
    if (line.textOnly)
        return number + tab + tab + text(line.description) + std::string(5, tab);
    return number + tab + text(line.itemKey) + tab + text(line.description) + tab +
           text(line.details) + tab + PlainNumber(line.quantity) + tab + FormatAmount(line.price) +
           tab + line.currencyName + tab + FormatAmount(line.total);
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

void DocumentView::FillLines(Grid& grid, const Document* document, bool reading) {
    InitLines(grid);
    if (document == nullptr)
        return;
    int32_t row = 0;
    for (const Document::Line& line : document->lines)
        grid.AddItem(RowText(line, reading), ++row);
}

std::vector<DocumentView::BoxText> DocumentView::HeaderTexts(const Document* document,
                                                             bool reading) {
    std::vector<BoxText> texts = {
        {&DocumentView::txtAccountKey, {}},   {&DocumentView::txtReference1, {}},
        {&DocumentView::txtCustomerName, {}}, {&DocumentView::txtDate, {}},
        {&DocumentView::txtAddress1, {}},     {&DocumentView::txtAddress2, {}},
        {&DocumentView::txtTotalVat, {}},     {&DocumentView::txtVatValue, {}},
        {&DocumentView::txtTotal1, {}}};
    if (document == nullptr)
        return texts;
    const Document& d = *document;
    auto text = [reading](const DocumentText& t) { return reading ? t.reading : t.logical; };
    std::string values[] = {text(d.accountKey),
                            text(d.reference),
                            text(d.customer),
                            FormatDate(d.date),
                            text(d.address1),
                            text(d.address2),
                            FormatAmount(d.totals.beforeVat),
                            FormatAmount(d.totals.vat),
                            FormatAmount(d.totals.withVat)};
    for (size_t i = 0; i < texts.size(); ++i)
        texts[i].second = std::move(values[i]);
    return texts;
}

void DocumentView::showDocument(Document document) {
    present(document);
    document_ = std::move(document);
    documentShown();
}

void DocumentView::present(const Document& document) {
    // Everything is worked out before the first control changes.
    std::vector<BoxText> texts = HeaderTexts(&document, readingOrder_ != 0);
    FillLines(DocLines, &document, readingOrder_ != 0);
    for (auto& [box, text] : texts)
        (this->*box).setText(std::move(text));
}

void DocumentView::showNothing() {
    for (auto& [box, text] : HeaderTexts(nullptr))
        (this->*box).setText(std::move(text));
    InitDocLines();
    document_.reset();
    documentShown();
}

void DocumentView::setReadingOrder(int16_t value) {
    if (value != 0 && value != 1)
        throw Error("ReadingOrder takes 0 or 1, not " + std::to_string(value));
    if (value == readingOrder_)
        return;
    readingOrder_ = value;
    if (document_)
        present(*document_);
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
