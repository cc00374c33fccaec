#include "fixfiles/Document.h"

#include "fixfiles/TextDecoding.h"

namespace dovrel {

void StoreLine(CurrentDocument& current, size_t k, const Document::Line& line) {
    DocumentLine& entry = current.lines.at(k);
    if (!line.description.stored.empty())
        entry.descriptionVisual = VisualText(line.description.stored);
    if (line.textOnly || line.itemKey.logical.empty())
        return;
    entry.itemKey = line.itemKey.logical;
    entry.itemKey.resize(12, ' ');
    current.amounts.at(static_cast<size_t>(line.lineNumber)) = {line.price, line.currency,
                                                                line.quantity, line.discount};
}

void StoreHeader(DocumentHeader& header, const Document& document) {
    header.type = document.type;
    header.totalBeforeDiscount = document.totals.beforeDiscount;
    header.foreignTotal = document.totals.foreign;
    header.discountPercent = document.discountPercent;
    for (size_t i = 0; i < document.remarks.size(); ++i) {
        header.remarksLogical[i] = document.remarks[i].logical;
        header.remarksVisual[i] = VisualText(document.remarks[i].stored);
    }
    header.customerVisual = VisualText(document.customer.stored);
    header.address1Visual = VisualText(document.address1.stored);
    header.address2Visual = VisualText(document.address2.stored);
    header.warehouse = document.warehouse;
}

CurrentDocument ToCurrentDocument(const Document& document) {
    CurrentDocument current;
    for (size_t k = 1; k <= document.lines.size(); ++k)
        StoreLine(current, k, document.lines[k - 1]);
    StoreHeader(current.header, document);
    current.lineCount = static_cast<int16_t>(document.lines.size());
    return current;
}

} // namespace dovrel
