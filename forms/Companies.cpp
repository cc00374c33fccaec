#include "forms/Companies.h"

#include "platform/Ascii.h"
#include "platform/FileReach.h"

#include "fixfiles/ReadingOrder.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <unicode/unistr.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <fstream>

namespace dovrel {

namespace fs = std::filesystem;

namespace {

// The Unicode code point of every code page 1255 byte; a byte the code page
// leaves undefined stands for itself.
const std::array<char32_t, 256>& CodePoints() {
    static const std::array<char32_t, 256> points = [] {
        std::array<char32_t, 256> table{};
        for (int b = 0; b < 256; ++b) {
            std::string utf8 = ToUtf8(std::string(1, static_cast<char>(b))).str();
            UChar32 cp = icu::UnicodeString::fromUTF8(utf8).char32At(0);
            table[static_cast<size_t>(b)] =
                cp == 0xFFFD ? static_cast<char32_t>(b) : static_cast<char32_t>(cp);
        }
        return table;
    }();
    return points;
}

// -1, 0 or 1 as a is before, equal to or after b.
int CompareNames(const std::string& a, const std::string& b) {
    const auto& points = CodePoints();
    size_t n = std::min(a.size(), b.size());
    for (size_t i = 0; i < n; ++i) {
        char32_t x = points[static_cast<unsigned char>(a[i])];
        char32_t y = points[static_cast<unsigned char>(b[i])];
        if (x != y)
            return x < y ? -1 : 1;
    }
    return a.size() == b.size() ? 0 : (a.size() < b.size() ? -1 : 1);
}

// Splits lo..hi around the name of the middle entry; afterwards i > j, and
// lo..j and i..hi remain to be sorted.
void Partition(std::vector<CompanyEntry>& t, int32_t lo, int32_t hi, int32_t& i, int32_t& j) {
    const std::string pivot = t[static_cast<size_t>(lo + (hi - lo) / 2)].name;
    i = lo;
    j = hi;
    while (i <= j) {
        int ci = CompareNames(t[static_cast<size_t>(i)].name, pivot);
        int cj = CompareNames(t[static_cast<size_t>(j)].name, pivot);
        if (ci >= 0 && cj <= 0) {
            std::swap(t[static_cast<size_t>(i)], t[static_cast<size_t>(j)]);
            ++i;
            --j;
        } else {
            if (ci < 0)
                ++i;
            if (cj > 0)
                --j;
        }
    }
}

// The main directory with a separator at its end; "/" for an empty one.
std::string WithSeparator(const std::string& root) {
    if (root.empty())
        return "/";
    if (root.back() == '/' || root.back() == '\\')
        return root;
    bool dosStyle = root.find('\\') != std::string::npos && root.find('/') == std::string::npos;
    return root + (dosStyle ? "\\" : "/");
}

bool IsHidden(const std::string& name) {
    return name.starts_with('.');
}

// The visible subdirectories of a folder, in name order, as native names.
std::vector<std::string> Subdirectories(const fs::path& folder) {
    std::error_code ec;
    fs::directory_iterator it(folder, ec);
    if (ec)
        throw Error("Cannot list the directory " + Path(folder.string()).shown().str() + ": " +
                    ec.message());
    std::vector<std::string> names;
    for (; it != fs::directory_iterator(); it.increment(ec)) {
        if (ec)
            throw Error("Cannot list the directory " + Path(folder.string()).shown().str() + ": " +
                        ec.message());
        std::string name = it->path().filename().string();
        std::error_code typeError;
        if (!IsHidden(name) && it->is_directory(typeError))
            names.push_back(name);
    }
    std::sort(names.begin(), names.end());
    return names;
}

// The company file in dir: a visible regular file named ADF.FIX in any
// letter case (the first in name order when there are several); empty when
// there is none or the directory cannot be listed.
fs::path CompanyFileIn(const fs::path& dir) {
    // A link out of the folders this thread is held to is no company of it.
    if (!FileReach::Allows(dir.string()))
        return {};
    std::error_code ec;
    fs::directory_iterator it(dir, ec);
    std::vector<std::string> found;
    for (; !ec && it != fs::directory_iterator(); it.increment(ec)) {
        std::string name = it->path().filename().string();
        std::error_code typeError;
        if (EqualsNoCase(name, "ADF.FIX") && it->is_regular_file(typeError))
            found.push_back(name);
    }
    if (found.empty())
        return {};
    return dir / *std::min_element(found.begin(), found.end());
}

// The first 20 bytes of the company file, the company's stored name; fewer
// when the file is shorter.
std::string ReadStoredName(const fs::path& file) {
    std::ifstream in(file, std::ios::binary);
    if (!in)
        throw Error("Cannot open the company file " + file.string());
    std::string name(kCompanyNameField, '\0');
    in.read(name.data(), static_cast<std::streamsize>(name.size()));
    if (in.bad())
        throw Error("Cannot read the company file " + file.string());
    name.resize(static_cast<size_t>(in.gcount()));
    return name;
}

} // namespace

std::string WAsc2Heb(std::string_view stored) {
    std::string before; // in reverse: each character went before all others
    std::string after;
    for (char ch : stored) {
        auto c = static_cast<unsigned char>(ch);
        if (c >= 0x80 && c <= 0x9A)
            before += static_cast<char>(c + 0x60);
        else if (IsAsciiAlnum(static_cast<char>(c)))
            after += ch;
        else
            before += ch;
    }
    std::reverse(before.begin(), before.end());
    return before + after;
}

void SortCompanies(std::vector<CompanyEntry>& table, int32_t lo, int32_t hi) {
    if (lo < 0 || hi >= static_cast<int32_t>(table.size()))
        throw Error("Company positions out of range");
    // The smaller side is sorted by a nested call and the larger one by this
    // loop, so the depth stays small however the names fall.
    while (lo < hi) {
        int32_t i = 0, j = 0;
        Partition(table, lo, hi, i, j);
        if (j - lo < hi - i) {
            SortCompanies(table, lo, j);
            lo = i;
        } else {
            SortCompanies(table, i, hi);
            hi = j;
        }
    }
}

std::string ListedName(const CompanyEntry& entry) {
    return std::string(Trim(entry.name));
}

namespace {

// The companies in the folders of main (native, ending in a separator);
// mainText is main as the control names it. The control cannot open a folder
// whose name its code page lacks, so such folders are left out unless the
// caller works with native names.
std::vector<CompanyEntry> CompaniesIn(const Path& main, const std::string& mainText,
                                      bool nativeNames) {
    fs::path resolved = ResolvePath(main).native();
    std::vector<CompanyEntry> table;
    for (const std::string& native : Subdirectories(resolved)) {
        std::string name = FromUtf8(ValidUtf8(native));
        if (!nativeNames && ToUtf8(name).str() != native)
            continue;
        fs::path file = CompanyFileIn(resolved / native);
        if (file.empty())
            continue;
        std::string stored = ReadStoredName(file);
        std::string companyName = WAsc2Heb(Trim(stored));
        companyName.resize(kCompanyNameField, ' ');
        table.push_back({mainText + name, std::move(companyName), ReadingOrderText(stored),
                         Path(main.native() + native)});
    }
    if (!table.empty())
        SortCompanies(table, 0, static_cast<int32_t>(table.size()) - 1);
    return table;
}

} // namespace

std::vector<CompanyEntry> FindCompanies(const std::string& root) {
    std::string main = WithSeparator(root);
    return CompaniesIn(PathFromCp1255(main), main, false);
}

std::vector<CompanyEntry> FindCompanies(const Path& root) {
    Path main(WithSeparator(root.native()));
    return CompaniesIn(main, FromUtf8(main.shown()), true);
}

} // namespace dovrel
