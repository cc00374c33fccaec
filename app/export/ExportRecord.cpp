#include "app/export/ExportRecord.h"

#include "fixfiles/DocTypes.h"
#include "platform/Ascii.h"
#include "platform/Encoding.h"

#include <cmath>
#include <cstdio>
#include <filesystem>

namespace dovrel {

using json = nlohmann::ordered_json;

namespace {

// Damaged files can hold amounts that are not numbers; JSON has no such
// number, so they go out as null.
json Number(double value) {
    return std::isfinite(value) ? json(value) : json();
}

std::string IsoDate(const Date& date) {
    char text[16];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d", date.year(), date.month(), date.day());
    return text;
}

const DocTypeRow* TypeRow(uint8_t code) {
    static const DocTypeTable types = [] {
        DocTypeTable table;
        DocFileTable files;
        InitDocTypes(table, files);
        return table;
    }();
    for (const DocTypeRow& row : types)
        if (row.code == code && !row.hebrewTitle.empty())
            return &row;
    return nullptr;
}

// The document's fields and the line's fields, in the order of the columns.
const char* const kDocumentColumns[] = {"type",
                                        "title",
                                        "file",
                                        "record",
                                        "reference",
                                        "date",
                                        "account",
                                        "customer",
                                        "address1",
                                        "address2",
                                        "remark1",
                                        "remark2",
                                        "remark3",
                                        "warehouse",
                                        "discountPercent",
                                        "vatPercent",
                                        "totalBeforeDiscount",
                                        "totalBeforeVat",
                                        "totalVat",
                                        "totalWithVat",
                                        "totalForeign"};
const char* const kLineColumns[] = {
    "line",  "key",      "category",     "description",     "details",  "quantity",
    "price", "currency", "currencyName", "currencyPrinted", "discount", "total"};

// A JSON value as one CSV cell: texts as they are, numbers as JSON writes
// them, null as nothing.
std::string Cell(const json& value) {
    if (value.is_null())
        return {};
    if (value.is_string())
        return value.get<std::string>();
    return value.dump();
}

std::vector<std::string> DocumentCells(const json& record) {
    const json& totals = record["totals"];
    const json& remarks = record["remarks"];
    std::vector<std::string> cells;
    for (const char* key : {"type", "title", "file", "record", "reference", "date", "account",
                            "customer", "address1", "address2"})
        cells.push_back(Cell(record[key]));
    for (size_t i = 0; i < 3; ++i)
        cells.push_back(i < remarks.size() ? Cell(remarks[i]) : std::string());
    for (const char* key : {"warehouse", "discountPercent", "vatPercent"})
        cells.push_back(Cell(record[key]));
    for (const char* key : {"beforeDiscount", "beforeVat", "vat", "withVat", "foreign"})
        cells.push_back(Cell(totals[key]));
    return cells;
}

std::vector<std::string> LineCells(const json& line) {
    std::vector<std::string> cells;
    for (const char* key :
         {"line", "key", "category", "description", "details", "quantity", "price"})
        cells.push_back(Cell(line[key]));
    const json& currency = line["currency"];
    for (const char* key : {"code", "name", "printed"})
        cells.push_back(currency.is_object() ? Cell(currency[key]) : std::string());
    cells.push_back(Cell(line["discount"]));
    cells.push_back(Cell(line["total"]));
    return cells;
}

} // namespace

std::string ExportRecord::Text(const std::string& cp1255) {
    return ToUtf8(cp1255).str();
}

json ExportRecord::Json(const Document& document) {
    const DocTypeRow* type = TypeRow(document.type);
    json remarks = json::array();
    for (const DocumentText& remark : document.remarks)
        remarks.push_back(Text(remark.reading));
    json lines = json::array();
    for (const Document::Line& line : document.lines)
        lines.push_back(Line(document, line));
    std::string file = std::filesystem::path(document.file.native()).filename().string();
    return {{"type", document.type},
            {"title", type ? Text(type->hebrewTitle) : std::string()},
            {"file", Path(file).shown().str()},
            {"record", document.record},
            {"reference", Text(document.reference.reading)},
            {"date", IsoDate(document.date)},
            {"account", Text(document.accountKey.reading)},
            {"customer", Text(document.customer.reading)},
            {"address1", Text(document.address1.reading)},
            {"address2", Text(document.address2.reading)},
            {"remarks", remarks},
            {"warehouse", document.warehouse},
            {"discountPercent", Number(document.discountPercent)},
            {"vatPercent", Number(document.vatPercent)},
            {"totals",
             {{"beforeDiscount", Number(document.totals.beforeDiscount)},
              {"beforeVat", Number(document.totals.beforeVat)},
              {"vat", Number(document.totals.vat)},
              {"withVat", Number(document.totals.withVat)},
              {"foreign", Number(document.totals.foreign)}}},
            {"lines", lines}};
}

// A text-only line ("*") has only its number and description; its amounts
// are not read, so they are null rather than a made-up zero.
json ExportRecord::Line(const Document& document, const Document::Line& line) {
    json out = {{"line", line.lineNumber},
                {"key", Text(line.itemKey.reading)},
                {"category", Text(TrimCopy(line.categoryCode))},
                {"description", Text(line.description.reading)},
                {"details", Text(line.details.reading)},
                {"quantity", nullptr},
                {"price", nullptr},
                {"currency", nullptr},
                {"discount", nullptr},
                {"total", nullptr}};
    if (line.textOnly)
        return out;
    out["quantity"] = Number(line.quantity);
    out["price"] = Number(line.price);
    out["currency"] = Currency(document, line);
    out["discount"] = Number(line.discount);
    out["total"] = Number(line.total);
    return out;
}

// The company's own currencies (codes 10 to 18) are named by the company,
// and their names go out in reading order like every other text.
json ExportRecord::Currency(const Document& document, const Document::Line& line) {
    std::string name = line.currencyName, printed = line.currencyPrinted;
    if (line.currency >= 10 && line.currency <= 18) {
        const DocumentText& own = document.currencyNames[static_cast<size_t>(line.currency - 10)];
        if (!own.reading.empty())
            name = printed = own.reading;
    }
    return {{"code", line.currency}, {"name", Text(name)}, {"printed", Text(printed)}};
}

const std::vector<std::string>& ExportRecord::CsvColumns() {
    static const std::vector<std::string> columns = [] {
        std::vector<std::string> names(std::begin(kDocumentColumns), std::end(kDocumentColumns));
        names.insert(names.end(), std::begin(kLineColumns), std::end(kLineColumns));
        return names;
    }();
    return columns;
}

std::vector<std::vector<std::string>> ExportRecord::CsvRows(const json& record) {
    std::vector<std::string> document = DocumentCells(record);
    std::vector<std::vector<std::string>> rows;
    for (const json& line : record["lines"]) {
        rows.push_back(document);
        std::vector<std::string> cells = LineCells(line);
        rows.back().insert(rows.back().end(), cells.begin(), cells.end());
    }
    if (rows.empty()) {
        rows.push_back(document);
        rows.back().resize(CsvColumns().size());
    }
    return rows;
}

} // namespace dovrel
