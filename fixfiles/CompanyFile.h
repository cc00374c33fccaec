#pragma once

#include "platform/Path.h"

#include <array>
#include <string>
#include <string_view>

namespace dovrel {

constexpr size_t kAdfRecordLength = 7495;
constexpr size_t kCompanyNameOffset = 0, kCompanyNameWidth = 20;
constexpr size_t kCompanyTitleOffset = 20, kCompanyTitleWidth = 60;
constexpr size_t kCurrencyNamesOffset = 7360, kCurrencyNameWidth = 15, kCurrencyNames = 9;

// The company definition record: record 1 of adf.fix, kept whole as stored.
// Before any successful read it holds bytes of code 0.
struct CompanyRecord {
    std::string bytes = std::string(kAdfRecordLength, '\0');

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

} // namespace dovrel
