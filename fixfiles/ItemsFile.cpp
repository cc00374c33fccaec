#include "fixfiles/ItemsFile.h"

#include "platform/Ascii.h"

#include "fixfiles/FieldPrefilter.h"
#include "fixfiles/ProgressReset.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/FileSystem.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace dovrel {

namespace {

constexpr size_t kItemKeyOffset = 0, kItemKeyWidth = 12;
constexpr size_t kCategoryOffset = 52, kCategoryWidth = 3;
constexpr size_t kForeignNameOffset = 85, kForeignNameWidth = 40;
constexpr int64_t kProgressEvery = 5;

// Keys compare without regard to the case of Latin letters only.
std::string FoldKey(std::string_view key) {
    return AsciiFold(key);
}

// Each distinct trimmed item key of the document, to the first entry that
// holds it, and the sorted Latin digests of those keys. An item record whose
// key field has none of these digests cannot match any line and is passed
// over without being decoded: most of a large items file is passed over so.
// A bit per value of a digest's top 12 bits answers most records at once.
struct ItemIndex {
    std::unordered_map<std::string, int> firstEntry;
    std::vector<uint64_t> digests;
    std::array<uint64_t, 64> digestBits{};

    explicit ItemIndex(const CurrentDocument& doc) {
        int count = std::clamp<int>(doc.lineCount, 0, kMaxDocLines);
        for (int entry = 1; entry <= count; ++entry)
            firstEntry.try_emplace(FoldKey(Trim(doc.lines[entry].itemKey)), entry);
        for (const auto& entry : firstEntry) {
            uint64_t digest = FieldPrefilter::LatinDigest(entry.first);
            digests.push_back(digest);
            digestBits[digest >> 58] |= uint64_t{1} << ((digest >> 52) & 63);
        }
        std::sort(digests.begin(), digests.end());
    }

    bool mayHold(uint64_t digest) const {
        return ((digestBits[digest >> 58] >> ((digest >> 52) & 63)) & 1) != 0 &&
               std::binary_search(digests.begin(), digests.end(), digest);
    }
};

// Gives the record's category code and foreign name to the first line that
// has its key, if any.
void ApplyItem(const unsigned char* record, const ItemIndex& index, CurrentDocument& doc) {
    std::string_view stored = Field(record, kItemKeyOffset, kItemKeyWidth);
    if (!index.mayHold(FieldPrefilter::LatinDigest(stored)))
        return;
    auto found = index.firstEntry.find(FoldKey(Trim(LogicalText(stored))));
    if (found == index.firstEntry.end())
        return;
    DocumentLine& line = doc.lines[found->second];
    line.catCode = std::string(Field(record, kCategoryOffset, kCategoryWidth));
    line.foreignName = TrimCopy(Field(record, kForeignNameOffset, kForeignNameWidth));
}

} // namespace

int64_t LastScanRecord(int64_t fileLength, size_t recordLength) {
    // (length / recordLength) - 1 rounded half to even, in whole numbers so
    // that no length is too large to be exact.
    auto n = static_cast<int64_t>(recordLength);
    if (n <= 0 || fileLength < 0)
        return -1;
    int64_t whole = fileLength / n - 1;
    int64_t twiceRest = 2 * (fileLength % n);
    if (twiceRest > n || (twiceRest == n && whole % 2 != 0))
        ++whole;
    return whole;
}

bool ReadITM(const Path& CompPath, CurrentDocument& doc, ProgressBar progress) {
    RecordFile file(ResolvePath(CompPath.plus("\\ITM.fix")), kItmRecordLength);
    int64_t last = LastScanRecord(file.length(), kItmRecordLength);
    ProgressReset resetter(progress);
    // One lookup per item record. When several records carry the same key,
    // each writes the same entry again, so the last of them in the file stays.
    ItemIndex index(doc);
    for (int64_t n = 2; n <= last; ++n) {
        const unsigned char* record = file.record(n);
        if (record == nullptr)
            break; // the file has become shorter; what was read still holds
        ApplyItem(record, index, doc);
        if (n % kProgressEvery == 0)
            progress.show(n, last);
    }
    return true;
}

} // namespace dovrel
