#pragma once

#include <string>
#include <string_view>

struct sqlite3;
struct UCollator;

namespace dovrel {

// The text order of the picture ranges: ICU's root collation at secondary
// strength. Case is ignored; a space sorts before digits, digits before Latin
// letters, Latin before Hebrew letters; a text sorts before every longer text
// that begins with it; numbers are compared character by character ("5" after
// "10"). ICU's Hebrew locale puts Hebrew before Latin, so the root order is used.
//
// One collator serves the whole process (ICU collators may be shared between
// threads for comparing). Texts are code page 1255 unless said otherwise.
class PictureCollation {
public:
    // The name under which the order is registered on a database connection and
    // which the picture table's text columns declare.
    static constexpr const char* kName = "HEBREW_NOCASE";

    // The collator, made on first use; throws Error when ICU cannot give it.
    static const PictureCollation& instance();

    // Negative, zero or positive as a sorts before, equal to or after b.
    int compare(std::string_view a, std::string_view b) const;
    int compareUtf8(std::string_view a, std::string_view b) const;
    // A byte string whose plain byte order is this order: comparing two keys
    // gives the same answer as compare() on their texts.
    std::string sortKey(std::string_view text) const;

    // Registers the order on a connection under kName; throws Error on failure.
    void registerWith(sqlite3* db) const;

    ~PictureCollation();
    PictureCollation(const PictureCollation&) = delete;
    PictureCollation& operator=(const PictureCollation&) = delete;

private:
    PictureCollation();

    UCollator* collator_ = nullptr;
};

} // namespace dovrel
