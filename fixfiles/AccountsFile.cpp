#include "fixfiles/AccountsFile.h"

#include "fixfiles/ItemsFile.h"
#include "fixfiles/ProgressReset.h"
#include "fixfiles/ReadingOrder.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/FileSystem.h"

#include <algorithm>
#include <string_view>

namespace dovrel {

namespace {

constexpr size_t kAccountKeyOffset = 0, kAccountKeyWidth = 8;
constexpr size_t kPhoneOffset = 60, kPhoneWidth = 30;
constexpr size_t kDistrictOffset = 120, kDistrictWidth = 15;
constexpr size_t kDetailsOffset = 167, kDetailsWidth = 50;
constexpr int64_t kProgressEvery = 5;

// A trimmed text field, put into reading order when it holds anything.
std::string LogicalField(const unsigned char* record, size_t offset, size_t width) {
    std::string_view text = Trim(Field(record, offset, width));
    if (text.empty())
        return {};
    return TrimCopy(LogicalText(text));
}

// The same field in the order people read it, for lists outside the control.
std::string ReadingField(const unsigned char* record, size_t offset, size_t width) {
    return ReadingOrderText(Field(record, offset, width));
}

std::string KeyOf(const unsigned char* record) {
    return TrimCopy(LogicalText(Field(record, kAccountKeyOffset, kAccountKeyWidth)));
}

AccountEntry EntryOf(const unsigned char* record, std::string key) {
    AccountEntry entry;
    entry.Key = std::move(key);
    entry.Phone = TrimCopy(Field(record, kPhoneOffset, kPhoneWidth));
    entry.Details = LogicalField(record, kDetailsOffset, kDetailsWidth);
    entry.District = LogicalField(record, kDistrictOffset, kDistrictWidth);
    return entry;
}

AccountEntry ReadingEntryOf(const unsigned char* record, std::string key) {
    AccountEntry entry;
    entry.Key = std::move(key);
    entry.Phone = ReadingField(record, kPhoneOffset, kPhoneWidth);
    entry.Details = ReadingField(record, kDetailsOffset, kDetailsWidth);
    entry.District = ReadingField(record, kDistrictOffset, kDistrictWidth);
    return entry;
}

void AddAccount(AccountsTable& table, const unsigned char* record) {
    std::string key = KeyOf(record);
    if (key.empty())
        return;
    table.Accounts.push_back(EntryOf(record, std::move(key)));
    ++table.AccountCount;
}

AccountEntry NoAccount() {
    std::string empty = FromUtf8(Utf8("ריק"));
    return AccountEntry{"", empty, empty, empty};
}

} // namespace

bool ReadACT(const Path& CompPath, AccountsTable& table, ProgressBar progress) {
    RecordFile file(ResolvePath(CompPath.plus("\\ACT.fix")), kActRecordLength);
    int64_t last = LastScanRecord(file.length(), kActRecordLength);
    ProgressReset resetter(progress);
    table.AccountCount = 0;
    table.Accounts.assign(1, AccountEntry{});
    for (int64_t n = 2; n <= last; ++n) {
        const unsigned char* record = file.record(n);
        if (record == nullptr)
            break; // the file has become shorter; the accounts read so far hold
        AddAccount(table, record);
        if (n % kProgressEvery == 0)
            progress.show(n, last);
    }
    table.AccountsLoaded = true;
    return true;
}

AccountEntry FindAccount(const AccountsTable& table, const std::string& key) {
    auto count = std::min<size_t>(static_cast<size_t>(std::max(table.AccountCount, 0)),
                                  table.Accounts.empty() ? 0 : table.Accounts.size() - 1);
    for (size_t i = 1; i <= count; ++i)
        if (EqualsNoCase(table.Accounts[i].Key, key))
            return table.Accounts[i];
    return NoAccount();
}

AccountEntry FindAccountInFile(const Path& CompPath, const std::string& key, ProgressBar progress,
                               TextOrder order) {
    RecordFile file(ResolvePath(CompPath.plus("\\ACT.fix")), kActRecordLength);
    int64_t last = LastScanRecord(file.length(), kActRecordLength);
    ProgressReset resetter(progress);
    for (int64_t n = 2; n <= last; ++n) {
        const unsigned char* record = file.record(n);
        if (record == nullptr)
            break;
        if (std::string found = KeyOf(record); !found.empty() && EqualsNoCase(found, key))
            return order == TextOrder::Reading ? ReadingEntryOf(record, std::move(found))
                                               : EntryOf(record, std::move(found));
        if (n % kProgressEvery == 0)
            progress.show(n, last);
    }
    return NoAccount();
}

} // namespace dovrel
