#pragma once

#include <cstdint>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace dovrel::sample {

// A document type and its share of the documents.
using TypeWeight = std::pair<int, int>;

struct BigCompanyPools;

struct BigCompanyOptions {
    int64_t docBytes = 100 * 1000 * 1000; // each document file the mix writes to
    int64_t items = 200000;
    int64_t accounts = 5000;
    uint64_t seed = 1;
    // Empty: every type of the invoices and stock movements file IMV.FIX, in
    // shares a busy shop would have.
    std::vector<TypeWeight> typeMix;
};

// "1:40,2:15,20:5" to its pairs; an error for anything else.
std::vector<TypeWeight> ParseTypeMix(std::string_view text);

// Writes a company as large as asked, for measuring the readers: ITM.fix,
// ACT.fix, adf.fix and the four document files. The documents take types from
// the mix, 1 to 40 lines of items from ITM.fix, accounts from ACT.fix with
// their Hebrew names and addresses, and dates rising over ten years; each file
// the mix writes to is filled until it holds docBytes (ending at a whole
// document), the others hold only their first record. The same options and
// seed always give the same bytes. Records are encoded by the sample-company
// writer and written in large chunks; nothing is held whole in memory.
class BigCompany {
public:
    using Progress = std::function<void(const std::string& message)>;

    explicit BigCompany(BigCompanyOptions options);
    ~BigCompany();
    BigCompany(const BigCompany&) = delete;
    BigCompany& operator=(const BigCompany&) = delete;

    void write(const std::filesystem::path& dir, const Progress& progress = {});

private:
    void writeItems(const std::filesystem::path& dir) const;
    void writeAccounts(const std::filesystem::path& dir) const;
    void writeDocuments(const std::filesystem::path& dir, const Progress& progress);

    BigCompanyOptions options_;
    std::unique_ptr<BigCompanyPools> pools_;
};

} // namespace dovrel::sample
