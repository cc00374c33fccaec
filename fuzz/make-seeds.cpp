// Writes the seed corpora of the fuzz targets into OUTDIR/<target>/: small
// companies made with the sample-company writer, each file prefixed with the
// control bytes its target reads first. The host and grid seeds are plain
// text kept in fuzz/corpus/.

#include "platform/Error.h"
#include "tools/SampleWriter.h"

#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace fs = std::filesystem;
using dovrel::sample::DosVisual;
using dovrel::sample::WriteCompany;

namespace {

// Documents of several types and files, text-only, hidden and foreign-currency
// lines, a from-date to pass, a search to match, and damage at the end.
const char* const kCompanies[] = {
    R"J({"documents": [
      {"type": 20, "account": "1001", "customer": "כהן ובניו", "reference": "77",
       "address1": "רח' הרצל 45", "remarks": ["הערה (1)", "", "Note"], "date": "2024-03-15",
       "lines": [{"key": "A100", "description": "מסמרים 5 ס\"מ", "details": "קופסה",
                  "price": 10.5, "quantity": 2, "discount": 12.5},
                 {"key": "*", "description": "שורת טקסט"},
                 {"key": "#", "description": "hidden"},
                 {"key": "B200", "currency": 10, "price": 3, "quantity": 4}]},
      {"type": 21, "account": "1002", "customer": "Levi Ltd", "date": "1999-12-31",
       "discountPercent": 10, "lines": [{"key": "C300", "price": 1.25, "quantity": 8}]},
      {"type": 20, "account": "1001", "date": "2023-01-02",
       "lines": [{"key": "A100", "docType": 21, "price": 1, "quantity": 1},
                 {"key": "D400", "price": 2, "quantity": 3, "lineNumber": 40}]}],
      "company": {"currencies": ["יורו"]}})J",
    R"J({"documents": [
      {"file": "ISHP.FIX", "filler": 2},
      {"type": 22, "customer": "ספק", "lineCount": 3, "lines": [{"key": "A1", "price": 5}]},
      {"type": 23, "date": {"year": 0, "month": 0, "day": 0}},
      {"type": 20, "lines": [{"key": "N", "price": {"hex": "00 00 00 00 00 00 F8 7F"},
                              "quantity": 1}]}],
      "damage": [{"file": "ISHP.FIX", "truncate": 60}]})J",
    R"J({"items": [{"key": "A100", "name": "מסמרים", "category": "01", "foreignName": "Nails"},
                  {"key": "b200", "name": "ברגים", "category": "02", "foreignName": "Screws"},
                  {"key": "A100", "name": "again", "category": "03", "foreignName": "Again"}],
        "accounts": [{"key": "1001", "name": "כהן", "phone": "03-1234567",
                      "district": "מרכז", "details": "לקוח ותיק"},
                     {"key": "ab", "name": "Levi", "district": "", "details": ""}],
        "company": {"name": "דמו", "title": "דמו בע\"מ", "currencies": ["יורו", "", "ין"]}})J",
    R"J({"items": {"trailer": false, "list": [{"key": "A100", "category": "9"}]},
        "accounts": {"trailer": false, "list": [{"key": "1001"}]},
        "damage": [{"file": "ITM.fix", "append": "01 02 03"},
                   {"file": "ACT.fix", "truncate": 100}]})J",
};

std::string ReadAll(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

void Write(const fs::path& dir, const std::string& name, const std::string& bytes) {
    fs::create_directories(dir);
    std::ofstream out(dir / name, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    if (!out)
        throw dovrel::Error("cannot write " + (dir / name).string());
}

std::string Int32(int32_t value) {
    std::string bytes;
    for (int i = 0; i < 4; ++i)
        bytes += static_cast<char>((static_cast<uint32_t>(value) >> (8 * i)) & 0xFF);
    return bytes;
}

// row, search, value length and text, from-date choice, position.
std::string StockPrefix(char row, char search, const std::string& value, char date,
                        int32_t position) {
    return std::string{row, search, static_cast<char>(value.size())} + value + date +
           Int32(position);
}

void StockSeeds(const fs::path& out, const std::string& ishp, int company) {
    const std::string prefixes[] = {
        StockPrefix(0, 0, "", 0, 2),
        StockPrefix(1, 1, "1001", 1, 3),
        StockPrefix(0, 3, DosVisual("כהן"), 2, 1000),
        StockPrefix(0, 4, "A100", 0, 0),
        StockPrefix(2, 5, DosVisual("קופסה"), 3, -5),
        StockPrefix(0, 2, "77", 9, 2) + "01/01/2000",
        StockPrefix(static_cast<char>(0xF0), 0, "", 0, 2),
    };
    int n = 0;
    for (const std::string& prefix : prefixes)
        Write(out / "readstock", "company" + std::to_string(company) + "-" + std::to_string(n++),
              prefix + ishp);
}

// The options byte of the page target, then the document file.
void PageSeeds(const fs::path& out, const std::string& ishp, int company) {
    int n = 0;
    for (char options : {char(0x00), char(0x0F), char(0x7F), char(0xFF)})
        Write(out / "pages", "company" + std::to_string(company) + "-" + std::to_string(n++),
              options + ishp);
}

void ItemSeeds(const fs::path& out, const fs::path& company, int index) {
    std::string keys = "A100        B200        b200        1001        ";
    int n = 0;
    for (const char* name : {"ITM.fix", "ACT.fix", "adf.fix"}) {
        if (!fs::exists(company / name))
            continue;
        std::string file = ReadAll(company / name);
        for (char count : {char(3), char(40), char(-1)})
            Write(out / "itemfiles", "company" + std::to_string(index) + "-" + std::to_string(n++),
                  std::string(1, count) + keys + file);
    }
}

// Record length - 1, block choice, reads; then the file.
void RecordSeeds(const fs::path& out, const fs::path& company, int index) {
    const std::pair<const char*, int> files[] = {
        {"ISHP.FIX", 170}, {"ITM.fix", 500}, {"ACT.fix", 650}, {"adf.fix", 7495}};
    int n = 0;
    for (const auto& [name, length] : files) {
        if (!fs::exists(company / name))
            continue;
        std::string file = ReadAll(company / name).substr(0, 3000);
        int small = length > 256 ? 99 : length;
        std::string reads =
            std::string{3, 2, 0, 1, 0, static_cast<char>(0xFF), static_cast<char>(0xFF)};
        for (char block : {char(0), char(10), char(0xFF)})
            Write(out / "recordfile", "company" + std::to_string(index) + "-" + std::to_string(n++),
                  std::string{static_cast<char>(small - 1), block} + reads + file);
    }
}

void TextSeeds(const fs::path& out) {
    const std::string texts[] = {
        DosVisual("שלום עולם"),
        DosVisual("רח' הרצל 45 (פינה)"),
        DosVisual("Widget Pro 3 ב-5"),
        "  padded text   \tPADDED",
        "15/03/2024",
        "1/2/05\t31/12/99",
        "0/13/2024",
        std::string("\x00\x00\x00\x00\x00\x00\xF0\x3F\x0A\x00", 10),
        std::string("\x00\x00\x00\x00\x00\x00\xF8\x7F\x00\x00\x00\x00\x00\x00\xF0\x7F", 16),
        std::string("\x7B\x14\xAE\x47\xE1\x7A\x84\x3F") + DosVisual("יורו"),
    };
    int n = 0;
    for (const std::string& text : texts)
        Write(out / "text", "text-" + std::to_string(n++), text);
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: make-seeds OUTDIR\n");
        return 2;
    }
    try {
        fs::path out = argv[1];
        int index = 0;
        for (const char* description : kCompanies) {
            fs::path company = out / "companies" / std::to_string(index);
            fs::remove_all(company);
            WriteCompany(description, company);
            if (fs::exists(company / "ISHP.FIX"))
                StockSeeds(out, ReadAll(company / "ISHP.FIX"), index);
            PageSeeds(out, ReadAll(company / "ISHP.FIX"), index);
            ItemSeeds(out, company, index);
            RecordSeeds(out, company, index);
            ++index;
        }
        TextSeeds(out);
        return 0;
    } catch (const std::exception& e) {
        std::fprintf(stderr, "make-seeds: %s\n", e.what());
        return 1;
    }
}
