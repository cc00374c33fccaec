#pragma once

#include "fixfiles/Document.h"

#include <string>
#include <vector>

#include <nlohmann/json.hpp>

namespace dovrel {

// One document as it goes out to other programs: texts in UTF-8 and in the
// order people read them, numbers as numbers, the date in ISO 8601. The
// same object is one record of `dovrel export` and what `show --json`
// prints; its CSV rows (one per line, the document's fields repeated) are
// made from it, so both formats always carry the same values.
class ExportRecord {
public:
    static nlohmann::ordered_json Json(const Document& document);

    // The CSV header and the rows of one record, each with as many cells as
    // the header; a document without lines still gives one row.
    static const std::vector<std::string>& CsvColumns();
    static std::vector<std::vector<std::string>> CsvRows(const nlohmann::ordered_json& record);

    // A text of the control (code page 1255) as UTF-8.
    static std::string Text(const std::string& cp1255);

private:
    static nlohmann::ordered_json Line(const Document& document, const Document::Line& line);
    static nlohmann::ordered_json Currency(const Document& document, const Document::Line& line);
};

} // namespace dovrel
