#pragma once

#include "fixfiles/Document.h"
#include "platform/Controls.h"
#include "platform/Grid.h"
#include "platform/Signal.h"
#include "platform/Variant.h"

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace dovrel {

// The part of the control that the document reader fills and moves: the
// record position and search, the header boxes, the search boxes it reads,
// the lines grid and the progress bar. The control is made of this and more.
class DocumentView {
public:
    DocumentView();
    virtual ~DocumentView() = default;
    DocumentView(const DocumentView&) = delete;
    DocumentView& operator=(const DocumentView&) = delete;

    // Resets the lines grid: the heading row and one empty row, eight
    // columns, every column right-aligned.
    void InitDocLines();

    // Shows a document the reader accepted: its lines in the grid, its header
    // and totals in the boxes. It is kept as the document shown.
    void showDocument(Document document);
    // Shows that nothing was found: empty boxes and grid, no document.
    void showNothing();
    // Told after every document shown and every walk that found nothing, so
    // a host can say what the last step did from document().
    Signal<> documentShown;

    // 0, the default: the boxes, the grid and the searches use the texts as
    // the control converts them (LogicalText). 1: they use the reading-order
    // texts, so what is shown reads as typed and can be searched for as
    // shown. Keys matched against other files keep LogicalText either way.
    // Anything but 0 or 1 is an Error; a change shows the document again.
    int16_t ReadingOrder() const { return readingOrder_; }
    void setReadingOrder(int16_t value);
    // The text of a field as the boxes and the grid show it.
    const std::string& shownText(const DocumentText& text) const {
        return readingOrder_ != 0 ? text.reading : text.logical;
    }
    // The last document shown; none before the first and after a walk that
    // found nothing.
    const std::optional<Document>& document() const { return document_; }
    // Gives the lines of the document shown the category codes that the
    // items file put into the current document, by item key.
    void takeCategoryCodes(const CurrentDocument& current);

    using BoxText = std::pair<TextBox DocumentView::*, std::string>;
    // The header boxes with the texts a document (or none) puts into them,
    // in reading order when asked.
    static std::vector<BoxText> HeaderTexts(const Document* document, bool reading = false);
    // Fills a lines grid as the control shows a document (or none).
    static void FillLines(Grid& grid, const Document* document, bool reading = false);

    int32_t PubACTLocation = 2;
    int32_t PubPrevLocation = 0;
    std::string PubSearchBy;
    Variant PubSearchValue = Variant(std::string());

    TextBox txtAccountKey{"txtAccountKey"};
    TextBox txtReference1{"txtReference1"};
    TextBox txtCustomerName{"txtCustomerName"};
    TextBox txtDate{"txtDate"};
    TextBox txtAddress1{"txtAddress1"};
    TextBox txtAddress2{"txtAddress2"};
    TextBox txtTotalVat{"txtTotalVat"};
    TextBox txtVatValue{"txtVatValue"};
    TextBox txtTotal1{"txtTotal1"};

    TextBox txtItemKey{"txtItemKey"};
    TextBox txtDetails{"txtDetails"};
    TextBox txtFromDate{"txtFromDate", "01/01/1980"};

    Grid DocLines{"DocLines"};
    Shape ProgressFrame{"ProgressFrame", 3720, 4680, 3015, 495};
    Shape ProgressFill{"ProgressFill", 3720, 4680, 0, 495};

private:
    static void InitLines(Grid& grid);

    void present(const Document& document);

    std::optional<Document> document_;
    int16_t readingOrder_ = 0;
};

} // namespace dovrel
