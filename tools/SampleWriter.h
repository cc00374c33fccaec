#pragma once

#include <array>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include <nlohmann/json.hpp>

namespace dovrel::sample {

// Writes the company directory the description asks for (see tools/README.md)
// into dir, creating it when missing. A description that does not fit the
// schema is an error (dovrel::Error) that names the offending entry.
void WriteCompany(const nlohmann::json& description, const std::filesystem::path& dir);
void WriteCompany(std::string_view descriptionJson, const std::filesystem::path& dir);
// The same for JSON text held as std::string or a literal, which would
// otherwise convert to either of the two above.
void WriteCompany(const std::string& descriptionJson, const std::filesystem::path& dir);
void WriteCompany(const char* descriptionJson, const std::filesystem::path& dir);

// Unicode text in reading order (UTF-8) as the DOS system stores it: visual
// order, DOS Hebrew letters, other characters in Windows-1255.
std::string DosVisual(std::string_view utf8);
// Unicode text already in visual order: letters mapped, order kept.
std::string DosBytes(std::string_view utf8);

// ---- Record-level writing -------------------------------------------------
// For makers of files too large to describe in one JSON document: they encode
// their texts once with StoredText and write records one document at a time.
// The records are those the description above gives for the same values.

enum class Order { Visual, AsGiven };

// The bytes a reading-order text (UTF-8) takes in a field of the width, as a
// JSON string there would be stored: cut, turned to visual order unless
// AsGiven, padded.
std::string StoredText(std::string_view utf8, size_t width, Order order = Order::Visual);

// Texts hold stored bytes (StoredText); a shorter one is padded with spaces,
// a longer one cut.
struct LineData {
    std::string key, description, details;
    int currency = 21;
    double price = 0;
    double quantity = 0;
    double discount = 0; // percent, kept to hundredths
    double rate = 1;     // not stored: the shekel value of one unit of the currency
};

// A document whose lines are numbered from 1 and all belong to its type;
// totals are computed as for a description that leaves them out.
struct DocumentData {
    int type = 20;
    std::string account, customer, address1, address2, reference;
    std::array<std::string, 3> remarks;
    int year = 2024, month = 1, day = 1;
    double discountPercent = 0;
    double vatPercent = 17;
    int warehouse = 1;
    std::vector<LineData> lines; // at most 255
};

// "ISHP.FIX", "IORDR.FIX", "IMV.FIX" or "IBD.FIX": the file of the type.
std::string DocumentFileOf(int type);
// Appends the document's header, continuation and line records to out.
void AppendDocumentRecords(const DocumentData& doc, std::string& out);
// One record of ITM.fix or ACT.fix from an entry of the "items" or
// "accounts" list; record 1 and the closing record are FillerRecord.
std::string ItemRecordOf(const nlohmann::json& item);
std::string AccountRecordOf(const nlohmann::json& account);
// The filler record of a file of the record length: kind byte 0 and spaces
// for a document file, all spaces for the items and accounts files.
std::string FillerRecordOf(size_t recordLength, bool documentFile);

} // namespace dovrel::sample
