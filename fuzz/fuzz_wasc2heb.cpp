// The company chooser's name handling on arbitrary bytes. The whole input is
// converted by WAsc2Heb; it is also written as a company's ADF.FIX and
// scanned; and its 20-byte pieces are sorted as company names.

#include "FuzzSupport.h"

#include "forms/Companies.h"
#include "platform/Error.h"

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

using namespace dovrel;
using dovrel::fuzz::Require;

namespace {

bool IsLatinOrDigit(unsigned char c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
}

void Convert(std::string_view stored) {
    std::string text = WAsc2Heb(stored);
    Require(text.size() == stored.size(), "WAsc2Heb keeps the length");
    std::string latin, others;
    for (char c : stored)
        (IsLatinOrDigit(static_cast<unsigned char>(c)) ? latin : others) += c;
    Require(text.substr(others.size()) == latin, "Latin letters and digits end it, in order");
    for (size_t i = 0; i < others.size(); ++i) {
        auto in = static_cast<unsigned char>(others[others.size() - 1 - i]);
        auto out = static_cast<unsigned char>(text[i]);
        Require(out == (in >= 0x80 && in <= 0x9A ? in + 0x60 : in),
                "the other characters come first, reversed, letters mapped");
    }
}

void Scan(std::string_view stored) {
    static const std::string main = fuzz::PrivateDir() + "/main";
    std::filesystem::create_directories(main + "/comp");
    fuzz::WriteFile(main + "/comp/ADF.FIX", stored);
    std::vector<CompanyEntry> table = FindCompanies(main);
    Require(table.size() == 1, "the company is found");
    Require(table[0].name.size() == kCompanyNameField, "names are 20 bytes");
    Require(table[0].path == main + "/comp", "the path is whole");
}

void Sort(std::string_view data) {
    std::vector<CompanyEntry> table;
    for (size_t at = 0; at < data.size() && table.size() < 64; at += 3) {
        std::string name(data.substr(at, 3));
        name.resize(kCompanyNameField, ' ');
        table.push_back({std::to_string(at), name});
    }
    if (table.empty())
        return;
    std::vector<CompanyEntry> sorted = table;
    SortCompanies(sorted, 0, static_cast<int32_t>(sorted.size()) - 1);
    auto byPath = [](const CompanyEntry& a, const CompanyEntry& b) { return a.path < b.path; };
    std::vector<CompanyEntry> a = table, b = sorted;
    std::sort(a.begin(), a.end(), byPath);
    std::sort(b.begin(), b.end(), byPath);
    for (size_t i = 0; i < a.size(); ++i)
        Require(a[i].path == b[i].path && a[i].name == b[i].name, "the sort keeps every entry");
    // Names of bytes below 0x80 and Hebrew letters: code point order is byte order.
    bool plain = std::all_of(data.begin(), data.end(), [](char c) {
        auto u = static_cast<unsigned char>(c);
        return u < 0x80 || (u >= 0xE0 && u <= 0xFA);
    });
    if (plain)
        Require(std::is_sorted(sorted.begin(), sorted.end(),
                               [](const auto& x, const auto& y) { return x.name < y.name; }),
                "the names come out in order");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    std::string_view bytes(reinterpret_cast<const char*>(data), size);
    Convert(bytes);
    Scan(bytes.substr(0, 7495));
    Sort(bytes);
    return 0;
}
