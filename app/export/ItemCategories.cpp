#include "app/export/ItemCategories.h"

#include "fixfiles/ItemsFile.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Ascii.h"
#include "platform/FileSystem.h"

namespace dovrel {

namespace {
constexpr size_t kItemKeyOffset = 0, kItemKeyWidth = 12;
constexpr size_t kCategoryOffset = 52, kCategoryWidth = 3;
} // namespace

// The records the items reader reads (2 to the one before the last); when a
// key comes twice, the later record holds, as it does for the reader.
ItemCategories::ItemCategories(const Path& compDir) {
    Path path = compDir.plus("\\ITM.fix");
    if (!FileExists(path))
        return;
    RecordFile file(ResolvePath(path), kItmRecordLength);
    int64_t last = LastScanRecord(file.length(), kItmRecordLength);
    for (int64_t n = 2; n <= last; ++n) {
        const unsigned char* record = file.record(n);
        if (record == nullptr)
            break;
        std::string key =
            AsciiFold(Trim(LogicalText(Field(record, kItemKeyOffset, kItemKeyWidth))));
        categories_[key] = std::string(Field(record, kCategoryOffset, kCategoryWidth));
    }
}

void ItemCategories::apply(Document& document) const {
    for (Document::Line& line : document.lines) {
        if (line.textOnly || line.itemKey.logical.empty())
            continue;
        auto found = categories_.find(AsciiFold(Trim(line.itemKey.logical)));
        if (found != categories_.end())
            line.categoryCode = found->second;
    }
}

} // namespace dovrel
