#include "pictures/PictureLookup.h"

#include "fixfiles/CurrentDocument.h"
#include "pictures/PictureCollation.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <algorithm>

namespace dovrel {

namespace {

std::string_view TrimSpaces(std::string_view text) {
    size_t first = text.find_first_not_of(' ');
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(' ') - first + 1);
}

std::string KeyOf(const std::optional<std::string>& bound) {
    return bound ? PictureCollation::instance().sortKey(*bound) : std::string();
}

// Whether the value lies within the bounds; an empty sort key is a Null bound
// (a text's sort key is never empty).
bool Within(const std::string& value, const std::string& from, const std::string& to) {
    return (from.empty() || value >= from) && (to.empty() || value <= to);
}

} // namespace

PictureLookup::PictureLookup(std::vector<PictureRange> ranges) : ranges_(std::move(ranges)) {
    keys_.reserve(ranges_.size());
    for (const PictureRange& range : ranges_)
        keys_.push_back({KeyOf(range.FromItemKey), KeyOf(range.ToItemKey), KeyOf(range.FromCatCode),
                         KeyOf(range.ToCatCode)});
}

bool PictureLookup::contains(size_t range, const std::string& key, const std::string& code) const {
    const Keys& k = keys_[range];
    return Within(code, k.fromCode, k.toCode) && Within(key, k.fromKey, k.toKey);
}

const std::string* PictureLookup::pictureFor(std::string_view itemKey,
                                             std::string_view catCode) const {
    if (TrimSpaces(catCode).empty() || ranges_.empty())
        return nullptr;
    const PictureCollation& order = PictureCollation::instance();
    std::string key = order.sortKey(TrimSpaces(itemKey));
    std::string code = order.sortKey(catCode);
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

void FillPictures(const std::string& dbName, CurrentDocument& doc) {
    if (!FileExists(dbName))
        return;
    PictureLookup lookup(PictureDb(dbName).rangesInLookupOrder());
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
