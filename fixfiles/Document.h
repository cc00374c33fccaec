#pragma once

#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DateSerial.h"
#include "platform/Path.h"

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// One text field of a stored document, trimmed, in code page 1255: as stored
// (the stored visual order, only the Hebrew letters mapped), as the control
// shows it (LogicalText), and in the order people read it (ReadingOrderText),
// which is what goes out to people outside the control.
struct DocumentText {
    std::string stored;
    std::string logical;
    std::string reading;
};

// A document as the document reader accepted it: where it lies, its header,
// its lines with their amounts, its totals, and the names the company gives
// its own currencies. Front ends build on this value, never on what the
// control's boxes show at the moment.
struct Document {
    struct Line {
        int lineNumber = 0;    // as stored, counted from 1
        bool textOnly = false; // item key "*": only the number and description count
        DocumentText itemKey;
        // Not in the document file: filled from the items file when it is read.
        std::string categoryCode;
        DocumentText description;
        DocumentText details;
        double quantity = 0;
        double price = 0; // in the line's currency
        uint8_t currency = 0;
        std::string currencyName;    // the Hebrew abbreviation the control shows
        std::string currencyPrinted; // the code the English page prints
        double discount = 0;         // percent
        double total = 0;            // in shekels
    };

    struct Totals {
        double beforeDiscount = 0;
        double beforeVat = 0; // after the document discount
        double vat = 0;
        double withVat = 0; // as stored
        double foreign = 0; // the lines in their currencies, less their discounts
    };

    uint8_t type = 0;
    Path file;          // the document file it was read from
    int32_t record = 0; // the header record's number
    DocumentText accountKey;
    DocumentText reference; // shown as stored: `logical` keeps its bytes unconverted
    DocumentText customer;
    DocumentText address1;
    DocumentText address2;
    Date date;
    std::array<DocumentText, 3> remarks;
    int16_t warehouse = 0;
    double discountPercent = 0;
    double vatPercent = 0;
    std::vector<Line> lines; // in the order they were accepted
    Totals totals;
    DocumentText companyTitle;
    std::array<DocumentText, 9> currencyNames; // currency codes 10 to 18
};

// What the page builders keep of a document: its entry k (1 to 40) of the
// lines and the amounts of its line number, and the header.
void StoreLine(CurrentDocument& current, size_t k, const Document::Line& line);
void StoreHeader(DocumentHeader& header, const Document& document);
// The current document as the reader leaves it after accepting the document.
CurrentDocument ToCurrentDocument(const Document& document);

} // namespace dovrel
