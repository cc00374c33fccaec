// The items, accounts and company readers on an arbitrary file. The input
// starts with control bytes, then the file's bytes:
//   lineCount 1 byte, signed: the current document's line count (any value)
//   keys      4 x 12 bytes: item keys of the document's lines (repeated
//             over lines 1 to 40); the first is also looked up as an account
// The rest is written as ITM.fix, ACT.fix and adf.fix in a private directory.

#include "FuzzSupport.h"

#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/ItemsFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Controls.h"
#include "platform/Error.h"

using namespace dovrel;
using dovrel::fuzz::Bytes;
using dovrel::fuzz::Require;

namespace {

constexpr size_t kKeys = 4;

void Items(const std::string& dir, CurrentDocument& doc, ProgressBar progress) {
    try {
        ReadITM(Path(dir), doc, progress);
    } catch (const Error&) {
    }
    Require(progress.fill.Width() == 0, "the progress bar is empty after the items scan");
    for (const DocumentLine& line : doc.lines)
        Require(line.catCode.size() == 3 && line.itemKey.size() == 12, "fields keep their width");
}

void Accounts(const std::string& dir, const std::string& key, ProgressBar progress) {
    AccountsTable table;
    try {
        ReadACT(Path(dir), table, progress);
        Require(table.AccountsLoaded, "a finished scan marks the accounts loaded");
    } catch (const Error&) {
    }
    Require(progress.fill.Width() == 0, "the progress bar is empty after the accounts scan");
    Require(table.AccountCount >= 0 &&
                static_cast<size_t>(table.AccountCount) + 1 == table.Accounts.size(),
            "the account count matches the table");
    for (const std::string& k : {key, TrimCopy(key), std::string()}) {
        AccountEntry found = FindAccount(table, k);
        Require(found.Key.empty() || EqualsNoCase(found.Key, k), "FindAccount finds its key");
    }
    if (table.AccountCount > 0)
        Require(!FindAccount(table, table.Accounts[1].Key).Key.empty(), "a loaded key is found");
}

void Company(const std::string& dir) {
    CompanyRecord company;
    bool read = ReadAdf(Path(dir), company);
    Require(company.bytes.size() == kAdfRecordLength, "the company record keeps its length");
    Require(read || company.bytes == std::string(kAdfRecordLength, '\0'),
            "a failed read leaves the record as it was");
    for (int16_t code = 0; code <= 22; ++code)
        CurrencyNames(code, company);
    company.title();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    Bytes in(data, size);
    CurrentDocument doc;
    doc.lineCount = static_cast<int8_t>(in.byte());
    std::string keys[kKeys];
    for (std::string& key : keys)
        key = in.text(12);
    for (size_t line = 1; line <= kMaxDocLines; ++line) {
        doc.lines[line].itemKey = keys[(line - 1) % kKeys];
        doc.lines[line].itemKey.resize(12, ' ');
    }

    const std::string& dir = fuzz::PrivateDir();
    for (const char* name : {"/ITM.fix", "/ACT.fix", "/adf.fix"})
        fuzz::WriteFile(dir + name, in.rest());

    Shape frame("ProgressFrame", 3720, 4680, 3015, 495);
    Shape fill("ProgressFill", 3720, 4680, 0, 495);
    Items(dir, doc, {frame, fill});
    Accounts(dir, keys[0], {frame, fill});
    Company(dir);
    return 0;
}
