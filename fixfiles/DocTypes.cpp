#include "fixfiles/DocTypes.h"

#include "platform/Encoding.h"

#include <string_view>

namespace dovrel {

namespace {

struct DocTypeSource {
    int16_t code;
    std::string_view hebrewTitle; // UTF-8
    std::string_view englishTitle;
    int16_t fileNumber;
};

constexpr DocTypeSource kDocTypeSources[kFilledDocTypes] = {
    {1, "חשבונית מס", "Invoice", 3},
    {2, "חשבונית מס קבלה", "Invoice/Receipt", 3},
    {3, "חשבונית  סוכן", "Agent Invoice", 3},
    {4, "חשבונית ריכוז", "Summary invoice", 3},
    {5, "חשבונית זיכוי", "Credit Invoice", 3},
    {6, "חשבון יצוא", "Export Invoice", 3},
    {7, "חשבונית רכש", "Purchase invoice", 3},
    {9, "כניסה ישירה מיבוא", "Import file", 3},
    {10, "דוח יצור - אבות", "Production report", 3},
    {12, "העברות בין מחסנים - כניסה", "Transfer between warehouses", 3},
    {14, "יתרת פתיחה", "Opening Balance", 3},
    {15, "עדכון בעקבות ספירת מלאי", "Stock Taking Report", 3},
    {19, "יציאה ממחסן ערובה", "Bonded Exit", 3},
    {20, "תעודת משלוח", "Delivery Note", 1},
    {21, "תעודת משלוח סוכן", "Agent Delivery Note", 1},
    {22, "החזרה", "Return Delivery Note", 1},
    {23, "תעודת משלוח רכש", "Purchase Delivery Note", 1},
    {30, "הזמנת לקוח", "Order", 2},
    {31, "הזמנת סוכן", "Agent Order", 2},
    {32, "הזמנת יצוא", "Export Order", 2},
    {33, "חשבונית שריון", "Lay-Bye Invoice", 2},
    {34, "הזמנת רכש", "Purchase Order", 2},
    {35, "הזמנת יבוא", "Import Order", 2},
    {36, "הוראת עבודה", "Job Instructions", 2},
    {40, "הצעת מחיר", "Quotation", 4},
    {41, "הצעת מחיר רכש", "Purchase Quotation", 4},
};

} // namespace

void InitDocTypes(DocTypeTable& docTypes, DocFileTable& docFiles) {
    docFiles = {"", "\\ISHP.FIX", "\\IORDR.FIX", "\\IMV.FIX", "\\IBD.FIX"};
    docTypes = {};
    for (int row = 0; row < kFilledDocTypes; ++row) {
        const DocTypeSource& source = kDocTypeSources[row];
        docTypes[row] = {source.code, FromUtf8(Utf8(source.hebrewTitle)),
                         std::string(source.englishTitle), source.fileNumber};
    }
}

int16_t DocTypeIndex(const DocTypeTable& docTypes, int16_t code) {
    for (int16_t row = 0; row < kFilledDocTypes; ++row) {
        if (docTypes[row].code == code) {
            return row;
        }
    }
    return 0;
}

} // namespace dovrel
