#pragma once

#include "fixfiles/ProgressBar.h"
#include "platform/Path.h"

#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

constexpr size_t kActRecordLength = 650;

struct AccountEntry {
    std::string Key;
    std::string Phone;
    std::string Details;
    std::string District;
};

// The accounts of ACT.fix in file order; entry 0 exists and stays empty.
struct AccountsTable {
    std::vector<AccountEntry> Accounts = std::vector<AccountEntry>(1);
    int32_t AccountCount = 0;
    bool AccountsLoaded = false;
    AccountEntry CurrentAccount;
};

// Loads every account of CompPath\ACT.fix into the table. True when the whole
// file was read; a file that becomes shorter during the scan ends it early,
// still true, with the accounts read so far. A missing or unreadable file
// raises an error before the table is touched; an error during the scan
// leaves it partly filled.
bool ReadACT(const Path& CompPath, AccountsTable& table, ProgressBar progress);

// A copy of the first entry whose key equals key without regard to letter
// case; when there is none, an empty key and "ריק" in the other three fields.
AccountEntry FindAccount(const AccountsTable& table, const std::string& key);

// The order of an account's phone, details and district: as the control shows
// them (LogicalText), or as people read them, for front ends outside it.
enum class TextOrder { Logical, Reading };

// What ReadACT and then FindAccount give, read straight from the file: the
// scan stops at the first match and holds one record at a time, so its memory
// does not grow with the file. The table is not touched.
AccountEntry FindAccountInFile(const Path& CompPath, const std::string& key, ProgressBar progress,
                               TextOrder order = TextOrder::Logical);

} // namespace dovrel
