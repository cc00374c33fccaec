#include "pictures/PictureLookup.h"

#include "platform/Ascii.h"

#include "fixfiles/CurrentDocument.h"
#include "pictures/PictureCache.h"
#include "pictures/PictureCollation.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <algorithm>
#include <memory>
#include <optional>

namespace dovrel {

namespace {

// The order of two sort keys: their heads first, their bytes when the heads
// are equal. Sort keys hold no zero bytes, so a head padded with zeros keeps
// a shorter key first.
int Compare(const PictureLookup::SortKey& a, const PictureLookup::SortKey& b) {
    if (a.head != b.head)
        return a.head < b.head ? -1 : 1;
    return a.bytes.compare(b.bytes);
}

// Whether the value lies within the bounds; a Null bound leaves its end open.
bool Within(const PictureLookup::SortKey& value, const PictureLookup::SortKey& from,
            const PictureLookup::SortKey& to) {
    return (from.null || Compare(value, from) >= 0) && (to.null || Compare(value, to) <= 0);
}

} // namespace

PictureLookup::SortKey PictureLookup::sortKeyOf(const std::optional<std::string>& text) {
    SortKey key;
    if (!text)
        return key;
    key.bytes = PictureCollation::instance().sortKey(*text);
    key.null = false;
    for (size_t i = 0; i < 8; ++i)
        key.head = key.head << 8 | (i < key.bytes.size() ? static_cast<uint8_t>(key.bytes[i]) : 0);
    return key;
}

PictureLookup::PictureLookup(std::vector<PictureRange> ranges) : ranges_(std::move(ranges)) {
    keys_.reserve(ranges_.size());
    for (const PictureRange& range : ranges_)
        keys_.push_back({sortKeyOf(range.FromItemKey), sortKeyOf(range.ToItemKey),
                         sortKeyOf(range.FromCatCode), sortKeyOf(range.ToCatCode)});
}

bool PictureLookup::contains(size_t range, const SortKey& key, const SortKey& code) const {
    const Keys& k = keys_[range];
    return Within(key, k.fromKey, k.toKey) && Within(code, k.fromCode, k.toCode);
}

const std::string* PictureLookup::pictureFor(std::string_view itemKey,
                                             std::string_view catCode) const {
    if (Trim(catCode).empty() || ranges_.empty())
        return nullptr;
    SortKey key = sortKeyOf(std::string(Trim(itemKey)));
    SortKey code = sortKeyOf(std::string(catCode));
    for (size_t i = ranges_.size(); i-- > 0;) {
        if (!contains(i, key, code))
            continue;
        if (!ranges_[i].PicFile)
            throw Error("The picture range " + std::to_string(ranges_[i].RangeID) +
                        " has no picture file");
        return &*ranges_[i].PicFile;
    }
    return nullptr;
}

void FillPictures(const std::string& dbName, CurrentDocument& doc, PictureCache& cache) {
    if (!FileExists(PathFromCp1255(dbName)))
        return;
    std::shared_ptr<const PictureLookup> found = cache.lookupOf(dbName);
    const PictureLookup& lookup = *found;
    int count = std::clamp<int>(doc.lineCount, 0, kMaxDocLines);
    for (int i = 1; i <= count; ++i) {
        DocumentLine& line = doc.lines[static_cast<size_t>(i)];
        if (const std::string* picture = lookup.pictureFor(line.itemKey, line.catCode)) {
            line.picFile = picture->substr(0, PictureDb::kPicFileSize);
            line.picFile.resize(PictureDb::kPicFileSize, ' ');
        }
    }
}

} // namespace dovrel
