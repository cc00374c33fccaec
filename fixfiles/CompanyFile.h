#pragma once

#include "platform/Path.h"

#include <array>
#include <compare>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace dovrel {

constexpr size_t kAdfRecordLength = 7495;
constexpr size_t kCompanyNameOffset = 0, kCompanyNameWidth = 20;
constexpr size_t kCompanyTitleOffset = 20, kCompanyTitleWidth = 60;
constexpr size_t kCurrencyNamesOffset = 7360, kCurrencyNameWidth = 15, kCurrencyNames = 9;

// Which file, in which state: a file changed or replaced since differs in
// one of these.
struct FileStamp {
    Path path;
    uint64_t device = 0;
    uint64_t inode = 0;
    int64_t size = 0;
    int64_t modifiedSeconds = 0;
    int64_t modifiedNanoseconds = 0;

    bool operator==(const FileStamp&) const = default;
};

// The stamp of an existing file; none when it cannot be looked at.
std::optional<FileStamp> StampOf(const Path& path);

// The company definition record: record 1 of adf.fix, kept whole as stored.
// Before any successful read it holds bytes of code 0.
struct CompanyRecord {
    std::string bytes = std::string(kAdfRecordLength, '\0');
    // The file the record was last read from, as it was then.
    std::optional<FileStamp> source;

    // The 60-character company title field, as stored.
    std::string title() const { return bytes.substr(kCompanyTitleOffset, kCompanyTitleWidth); }
    // Stores a title left-aligned in the field: cut after 60 bytes, padded with spaces.
    void setTitle(std::string_view title);
    // Currency name 1 to 9 (for currency codes 10 to 18), 15 bytes as stored.
    std::string currencyName(int index) const;
};

// Reads record 1 of the company's adf.fix into the company record. False when
// the file is missing, short or unreadable; the record then keeps what it had.
// Never raises an error.
bool ReadAdf(const Path& pCompPath, CompanyRecord& company);

// ReadAdf, unless the record already holds the company's adf.fix as the file
// is now; true when it does afterwards. Showing a company's documents reads
// its record once, and again only when the file changes.
bool LoadCompany(const Path& pCompPath, CompanyRecord& company);

} // namespace dovrel
