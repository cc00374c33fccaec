#pragma once

#include "pictures/PictureDb.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

class PictureCache;
struct CurrentDocument;

// Finds the picture of a document line among the picture ranges. Bounds are
// inclusive and compared in the pictures' text order; a Null bound leaves its
// end open; a line lies in a range when both its item key and its category
// code do. Among the ranges that contain a line, the last one in the lookup
// order (FromItemKey, then FromCatCode, Null first) decides.
class PictureLookup {
public:
    // A text's sort key, its first eight bytes also as one number, so that
    // most comparisons are decided without comparing the bytes; a Null bound
    // has no key.
    struct SortKey {
        uint64_t head = 0;
        std::string bytes;
        bool null = true;
    };

    // The ranges in the lookup order (PictureDb::rangesInLookupOrder).
    explicit PictureLookup(std::vector<PictureRange> ranges);

    // The picture file of a line with this item key (spaces around it ignored)
    // and category code (compared as stored, spaces included), or nullptr when
    // no range contains it or the code is blank. A deciding range without a
    // picture file is an Error.
    const std::string* pictureFor(std::string_view itemKey, std::string_view catCode) const;

private:
    struct Keys {
        SortKey fromKey, toKey, fromCode, toCode;
    };

    static SortKey sortKeyOf(const std::optional<std::string>& text);
    bool contains(size_t range, const SortKey& key, const SortKey& code) const;

    std::vector<PictureRange> ranges_;
    std::vector<Keys> keys_; // sort keys of the bounds, beside each range
};

// Gives each line of the document the picture file of the last range that
// contains it (padded with spaces to 50 characters, cut at 50); lines that no
// range contains keep theirs. A missing database file changes nothing. The
// cache keeps the ranges between calls.
void FillPictures(const std::string& dbName, CurrentDocument& doc, PictureCache& cache);

} // namespace dovrel
