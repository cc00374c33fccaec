#pragma once

#include "platform/Path.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

// The width of a company's name as the chooser keeps it.
constexpr size_t kCompanyNameField = 20;

// One company found by a scan: its directory and its name.
struct CompanyEntry {
    // The main directory followed by the company directory's name, without a
    // trailing separator, whole: a shortened path would name a directory that
    // does not exist.
    std::string path;
    // The stored name converted by WAsc2Heb, space-filled or cut to 20 bytes.
    std::string name;
    // The stored name in the order people read it, trimmed, for lists
    // outside the control.
    std::string readingName;
    // The company directory by its native name.
    Path folder;
};

// A stored company name (DOS Hebrew, visual order) as text in logical order,
// in code page 1255: Hebrew letters become their code page 1255 letters and,
// like every character other than a Latin letter or a digit, go before what
// was built so far; Latin letters and digits go after it.
std::string WAsc2Heb(std::string_view stored);

// Sorts the entries lo to hi (positions in the table) by their name fields,
// compared character by character by code point. Entries with equal names
// end in the order this particular sort leaves them, which the chooser's
// list relies on.
void SortCompanies(std::vector<CompanyEntry>& table, int32_t lo, int32_t hi);

// Scans the main directory for company directories: its immediate
// subdirectories that hold a file named "ADF.FIX" (in any letter case).
// Hidden entries (names starting with ".") are skipped, and so is a
// subdirectory that cannot be listed. The result is sorted by SortCompanies;
// subdirectories are visited in name order, so equal names always come out
// in the same order. An empty root scans "/". A main directory that cannot be
// listed or a company file that cannot be read is an Error.
std::vector<CompanyEntry> FindCompanies(const std::string& root);
// The same for a main directory named natively: folders whose names the code
// page lacks are listed too, and each entry's folder is the one to open.
std::vector<CompanyEntry> FindCompanies(const Path& root);

// The name a list shows for an entry: the name without surrounding spaces;
// empty for a blank name, which a list leaves out.
std::string ListedName(const CompanyEntry& entry);

} // namespace dovrel
