#include "pictures/PictureCollation.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <sqlite3.h>
#include <unicode/ucol.h>
#include <unicode/ustring.h>

#include <climits>
#include <vector>

namespace dovrel {

namespace {

int CheckedLength(std::string_view text) {
    if (text.size() > static_cast<size_t>(INT_MAX / 4))
        throw Error("Text too long to compare: " + std::to_string(text.size()) + " bytes");
    return static_cast<int>(text.size());
}

std::u16string ToUtf16(std::string_view utf8) {
    std::u16string wide(utf8.size() + 1, u'\0');
    int32_t length = 0;
    UErrorCode status = U_ZERO_ERROR;
    u_strFromUTF8WithSub(wide.data(), static_cast<int32_t>(wide.size()), &length, utf8.data(),
                         CheckedLength(utf8), 0xFFFD, nullptr, &status);
    if (U_FAILURE(status))
        throw Error(std::string("Cannot convert a text for comparing: ") + u_errorName(status));
    wide.resize(static_cast<size_t>(length));
    return wide;
}

int CollateCallback(void* self, int sizeA, const void* a, int sizeB, const void* b) {
    try {
        return static_cast<const PictureCollation*>(self)->compareUtf8(
            {static_cast<const char*>(a), static_cast<size_t>(sizeA)},
            {static_cast<const char*>(b), static_cast<size_t>(sizeB)});
    } catch (...) {
        return 0; // nothing may leave through SQLite; only texts of gigabytes fail here
    }
}

} // namespace

PictureCollation::PictureCollation() {
    UErrorCode status = U_ZERO_ERROR;
    collator_ = ucol_open("", &status); // the root order
    if (U_FAILURE(status) || collator_ == nullptr)
        throw Error(std::string("Cannot open ICU's root collation: ") + u_errorName(status));
    ucol_setStrength(collator_, UCOL_SECONDARY);
    ucol_setAttribute(collator_, UCOL_ALTERNATE_HANDLING, UCOL_NON_IGNORABLE, &status);
    ucol_setAttribute(collator_, UCOL_NUMERIC_COLLATION, UCOL_OFF, &status);
    if (U_FAILURE(status)) {
        ucol_close(collator_);
        throw Error(std::string("Cannot set up ICU's root collation: ") + u_errorName(status));
    }
}

PictureCollation::~PictureCollation() {
    ucol_close(collator_);
}

const PictureCollation& PictureCollation::instance() {
    static const PictureCollation collation;
    return collation;
}

int PictureCollation::compare(std::string_view a, std::string_view b) const {
    return compareUtf8(ToUtf8(a).str(), ToUtf8(b).str());
}

int PictureCollation::compareUtf8(std::string_view a, std::string_view b) const {
    UErrorCode status = U_ZERO_ERROR;
    UCollationResult result = ucol_strcollUTF8(collator_, a.data(), CheckedLength(a), b.data(),
                                               CheckedLength(b), &status);
    if (U_FAILURE(status))
        throw Error(std::string("Cannot compare two texts: ") + u_errorName(status));
    return static_cast<int>(result);
}

std::string PictureCollation::sortKey(std::string_view text) const {
    std::u16string wide = ToUtf16(ToUtf8(text).str());
    std::vector<uint8_t> key(wide.size() * 4 + 16);
    for (;;) {
        int32_t needed = ucol_getSortKey(collator_, wide.data(), static_cast<int32_t>(wide.size()),
                                         key.data(), static_cast<int32_t>(key.size()));
        if (needed <= 0)
            throw Error("Cannot make the sort key of a text");
        if (static_cast<size_t>(needed) <= key.size())
            return std::string(key.begin(), key.begin() + needed - 1); // without the final 0
        key.resize(static_cast<size_t>(needed));
    }
}

void PictureCollation::registerWith(sqlite3* db) const {
    if (sqlite3_create_collation_v2(db, kName, SQLITE_UTF8, const_cast<PictureCollation*>(this),
                                    CollateCallback, nullptr) != SQLITE_OK)
        throw Error(std::string("Cannot register the text order of the pictures: ") +
                    sqlite3_errmsg(db));
}

} // namespace dovrel
