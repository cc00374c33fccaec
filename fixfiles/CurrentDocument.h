#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace dovrel {

constexpr int kMaxDocLines = 40;

// The one document on display, kept for the page builders and the item and
// picture lookups. Texts are code page 1255.
struct DocumentHeader {
    uint8_t type = 0;
    double totalBeforeDiscount = 0;
    double foreignTotal = 0;
    double discountPercent = 0;
    std::array<std::string, 3> remarksLogical;
    std::array<std::string, 3> remarksVisual;
    std::string customerVisual;
    std::string address1Visual;
    std::string address2Visual;
    int16_t warehouse = 0;
};

// Fixed-width fields keep their width: a blank item key is twelve spaces.
struct DocumentLine {
    std::string itemKey = std::string(12, ' ');
    std::string catCode = std::string(3, ' ');
    std::string picFile = std::string(50, ' ');
    std::string foreignName;
    std::string descriptionVisual;
};

struct LineAmounts {
    double price = 0;
    uint8_t currency = 0;
    double quantity = 0;
    double discount = 0; // percent

    bool isZero() const { return price == 0 && currency == 0 && quantity == 0 && discount == 0; }
};

struct CurrentDocument {
    DocumentHeader header;
    // Entries 1 to 40, in the order the lines were accepted; entry 0 unused.
    std::array<DocumentLine, kMaxDocLines + 1> lines;
    // Entries 1 to 40, by the line's own line number; entry 0 unused.
    std::array<LineAmounts, kMaxDocLines + 1> amounts;
    int16_t lineCount = 0;

    void clearLines() {
        lines.fill(DocumentLine{});
        amounts.fill(LineAmounts{});
    }
};

} // namespace dovrel
