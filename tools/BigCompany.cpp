#include "tools/BigCompany.h"

#include "fixfiles/DocTypes.h"
#include "platform/Error.h"
#include "tools/SampleWriter.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <cerrno>
#include <charconv>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <map>
#include <system_error>

namespace dovrel::sample {
namespace {

constexpr int64_t kMaxDocBytes = int64_t{1} << 30;
constexpr int64_t kMaxItems = 2'000'000;
constexpr int64_t kMaxAccounts = 1'000'000;
constexpr size_t kChunkBytes = size_t{8} << 20;
constexpr int64_t kProgressEvery = int64_t{64} << 20;
constexpr int kYears = 10;
constexpr int kFirstYear = 2015;

// The shares of the documents in the invoices and stock movements file.
const std::vector<TypeWeight> kDefaultMix = {{1, 40}, {2, 15}, {3, 5}, {4, 3},  {5, 8},
                                             {6, 3},  {7, 10}, {9, 2}, {10, 2}, {12, 4},
                                             {14, 1}, {15, 2}, {19, 1}};

const char* const kFirstNames[] = {"משה",  "דוד",   "יוסי",  "רחל",  "שרה",  "אבי", "נועה", "מיכל",
                                   "יעקב", "אורית", "רונית", "איתן", "עמית", "תמר", "גיל",  "ליאת"};
const char* const kLastNames[] = {"כהן",    "לוי",    "מזרחי", "פרץ",   "ביטון", "דהן",  "אברהם",
                                  "פרידמן", "אזולאי", "גבאי",  "שפירא", "קליין", "רוזן", "חדד"};
const char* const kFirms[] = {"בע\"מ", "ושות'", "מחשבים", "יבוא ושיווק", "שיווק", "טכנולוגיות"};
const char* const kStreets[] = {"הרצל",    "ויצמן",   "בן גוריון", "ז'בוטינסקי", "רוטשילד",
                                "העצמאות", "הנביאים", "אלנבי",     "סוקולוב",    "ביאליק"};
const char* const kCities[] = {"תל אביב",   "ירושלים",     "חיפה",  "באר שבע", "נתניה",  "חולון",
                               "פתח תקווה", "ראשון לציון", "אשדוד", "רעננה",   "כפר סבא"};
const char* const kDistricts[] = {"מרכז", "צפון", "דרום", "שרון", "שפלה", "ירושלים"};
const char* const kPrefixes[] = {"KB", "MS", "HD", "CB", "PW", "SC", "A", "B"};
struct ItemWords {
    const char* hebrew;
    const char* english;
};
const ItemWords kItemWords[] = {
    {"מקלדת", "Keyboard"},        {"עכבר", "Mouse"},           {"דיסק קשיח", "Hard disk"},
    {"כבל רשת", "Network cable"}, {"ספק כוח", "Power supply"}, {"סורק", "Scanner"},
    {"מסך", "Monitor"},           {"מדפסת", "Printer"},        {"זיכרון", "Memory"},
    {"מעבד", "Processor"},        {"מתאם", "Adapter"},         {"רמקולים", "Speakers"}};
const char* const kDetails[] = {"כחול", "שחור", "לבן", "XL", "L", "SN4821", "V2", "אפור"};
const char* const kRemarks[] = {"אספקה עד סוף החודש", "לפי הזמנה טלפונית", "תשלום שוטף + 30",
                                "המחיר כולל התקנה",   "משלוח לסניף",       "אחריות לשנה"};
const char* const kTextLines[] = {"הערה: הסחורה נבדקה", "לפי הצעת מחיר קודמת", "ללא החזרה",
                                  "המשך בעמוד הבא"};

template <typename T, size_t N> constexpr size_t Count(const T (&)[N]) {
    return N;
}

// A small fast generator (splitmix64) whose sequence is the same everywhere,
// so a seed always gives the same company.
class Random {
public:
    explicit Random(uint64_t seed) : state_(seed) {}
    uint64_t next() {
        uint64_t z = (state_ += 0x9E3779B97F4A7C15ULL);
        z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ULL;
        z = (z ^ (z >> 27)) * 0x94D049BB133111EBULL;
        return z ^ (z >> 31);
    }
    // 0 to n - 1.
    uint64_t below(uint64_t n) { return n == 0 ? 0 : next() % n; }
    double unit() { return static_cast<double>(next() >> 11) / 9007199254740992.0; }
    // 0 to n - 1, the low numbers more often: a few customers and items
    // make most of the business.
    uint64_t skewed(uint64_t n) {
        double u = unit();
        return std::min<uint64_t>(n - 1, static_cast<uint64_t>(u * u * static_cast<double>(n)));
    }
    template <typename T, size_t N> const T& pick(const T (&list)[N]) { return list[below(N)]; }

private:
    uint64_t state_;
};

std::string ItemKey(int64_t index) {
    return std::string(kPrefixes[index % static_cast<int64_t>(Count(kPrefixes))]) + "-" +
           std::to_string(1000 + index);
}

std::string AccountKey(int64_t index) {
    return std::to_string(10000 + index);
}

std::string AccountName(int64_t index) {
    auto i = static_cast<size_t>(index);
    std::string name = std::string(kFirstNames[i % Count(kFirstNames)]) + " " +
                       kLastNames[(i / Count(kFirstNames)) % Count(kLastNames)];
    if (i % 3 == 0)
        name =
            std::string(kLastNames[i % Count(kLastNames)]) + " " + kFirms[(i / 3) % Count(kFirms)];
    return name;
}

std::string Address1(int64_t index) {
    return std::string(kStreets[static_cast<size_t>(index) % Count(kStreets)]) + " " +
           std::to_string(1 + index % 120);
}

std::string Address2(int64_t index) {
    return kCities[static_cast<size_t>(index / 7) % Count(kCities)];
}

std::string Phone(int64_t index) {
    std::string phone = "0";
    phone += std::to_string(2 + index % 8);
    phone += "-";
    phone += std::to_string(5000000 + index);
    return phone;
}

void Check(int64_t value, int64_t min, int64_t max, const std::string& what) {
    if (value < min || value > max)
        throw Error(what + " must be from " + std::to_string(min) + " to " + std::to_string(max));
}

} // namespace

std::vector<TypeWeight> ParseTypeMix(std::string_view text) {
    DocTypeTable types;
    DocFileTable files;
    InitDocTypes(types, files);
    std::vector<TypeWeight> mix;
    while (!text.empty()) {
        size_t comma = text.find(',');
        std::string_view part = text.substr(0, comma);
        text = comma == std::string_view::npos ? std::string_view() : text.substr(comma + 1);
        size_t colon = part.find(':');
        int type = 0, weight = 0;
        const char* end = part.data() + part.size();
        bool ok =
            colon != std::string_view::npos &&
            std::from_chars(part.data(), part.data() + colon, type).ptr == part.data() + colon &&
            std::from_chars(part.data() + colon + 1, end, weight).ptr == end;
        if (!ok || weight < 1 || weight > 1000)
            throw Error("type mix entry \"" + std::string(part) +
                        "\": expected TYPE:WEIGHT with a weight from 1 to 1000");
        bool known = std::any_of(types.begin(), types.begin() + kFilledDocTypes,
                                 [&](const DocTypeRow& row) { return row.code == type; });
        if (!known)
            throw Error("type mix entry \"" + std::string(part) + "\": " + std::to_string(type) +
                        " is not a document type");
        mix.emplace_back(type, weight);
    }
    if (mix.empty())
        throw Error("the type mix is empty");
    return mix;
}

// Texts encoded once, in the form the records store them.
struct BigCompanyPools {
    struct Account {
        std::string key, name, address1, address2;
    };
    struct Item {
        std::string key, description;
        double price = 0;
    };
    std::vector<Account> accounts;
    std::vector<Item> items;
    std::vector<std::string> details, remarks, textLines;
};

namespace {

// A file written in large chunks.
class ChunkedFile {
public:
    explicit ChunkedFile(const std::filesystem::path& path) : path_(path.string()) {
        file_ = std::fopen(path_.c_str(), "wb");
        if (file_ == nullptr)
            ThrowSystemError("cannot create", path_, errno);
        buffer_.reserve(kChunkBytes + 64 * 1024);
    }
    ~ChunkedFile() {
        if (file_ != nullptr)
            std::fclose(file_);
    }
    std::string& buffer() { return buffer_; }
    int64_t size() const { return written_ + static_cast<int64_t>(buffer_.size()); }
    void flushIfFull() {
        if (buffer_.size() >= kChunkBytes)
            flush();
    }
    void close() {
        flush();
        std::FILE* file = std::exchange(file_, nullptr);
        if (std::fclose(file) != 0)
            ThrowSystemError("cannot write", path_, errno);
    }

private:
    void flush() {
        if (std::fwrite(buffer_.data(), 1, buffer_.size(), file_) != buffer_.size())
            ThrowSystemError("cannot write", path_, errno != 0 ? errno : EIO);
        written_ += static_cast<int64_t>(buffer_.size());
        buffer_.clear();
    }

    std::string path_;
    std::FILE* file_ = nullptr;
    std::string buffer_;
    int64_t written_ = 0;
};

const std::string_view kDocumentFiles[] = {"ISHP.FIX", "IORDR.FIX", "IMV.FIX", "IBD.FIX"};

// The date of a document that far through its file: the documents of ten
// years in the order they were written.
void SetDate(DocumentData& doc, double fraction) {
    using namespace std::chrono;
    auto first = sys_days(year(kFirstYear) / January / 1);
    auto days = static_cast<int>(fraction * 365.25 * kYears);
    year_month_day date(first + std::chrono::days(std::min(days, 365 * kYears + 1)));
    doc.year = static_cast<int>(date.year());
    doc.month = static_cast<int>(static_cast<unsigned>(date.month()));
    doc.day = static_cast<int>(static_cast<unsigned>(date.day()));
}

LineData MakeLine(const BigCompanyPools& pools, Random& rng) {
    LineData line;
    uint64_t kind = rng.below(100);
    if (kind < 5) { // a text-only line
        line.key = "*";
        line.description = pools.textLines[rng.below(pools.textLines.size())];
        return line;
    }
    const BigCompanyPools::Item& item = pools.items[rng.skewed(pools.items.size())];
    line.key = kind == 5 ? std::string("#") : item.key; // now and then a hidden line
    line.description = item.description;
    if (rng.below(10) < 3)
        line.details = pools.details[rng.below(pools.details.size())];
    // Mostly shekels; now and then dollars or euros at a shekel rate.
    uint64_t currency = rng.below(20);
    line.currency = currency < 17 ? 21 : (currency < 19 ? 1 : 4);
    line.rate = line.currency == 21 ? 1 : (line.currency == 1 ? 3.6 : 4.0);
    line.price = std::round(item.price / line.rate * 100) / 100;
    line.quantity = rng.below(8) == 0 ? 0.5 * static_cast<double>(1 + rng.below(9))
                                      : static_cast<double>(1 + rng.skewed(20));
    static const double kDiscounts[] = {5, 10, 12.5, 15};
    if (rng.below(5) == 0)
        line.discount = rng.pick(kDiscounts);
    return line;
}

DocumentData MakeDocument(const BigCompanyPools& pools, Random& rng, int type, int number,
                          double fraction) {
    DocumentData doc;
    doc.type = type;
    const BigCompanyPools::Account& account = pools.accounts[rng.skewed(pools.accounts.size())];
    doc.account = account.key;
    doc.customer = account.name;
    doc.address1 = account.address1;
    doc.address2 = account.address2;
    doc.reference = StoredText(std::to_string(number % 100000), 5);
    if (rng.below(4) == 0)
        doc.remarks[rng.below(3)] = pools.remarks[rng.below(pools.remarks.size())];
    SetDate(doc, fraction);
    doc.discountPercent = rng.below(10) == 0 ? 5 : 0;
    doc.vatPercent = 17;
    doc.warehouse = static_cast<int>(1 + rng.below(3));
    double u = rng.unit();
    auto lines = 1 + static_cast<size_t>(u * u * 40);
    for (size_t i = 0; i < std::min<size_t>(lines, 40); ++i)
        doc.lines.push_back(MakeLine(pools, rng));
    return doc;
}

// The four document files; a file is full once it holds the asked bytes.
struct DocumentFile {
    std::string name;
    std::unique_ptr<ChunkedFile> out;
    int64_t reported = 0;
};

int DrawType(const std::vector<TypeWeight>& mix, const std::vector<DocumentFile*>& fileOfType,
             int64_t docBytes, Random& rng) {
    int total = 0;
    for (size_t i = 0; i < mix.size(); ++i)
        if (fileOfType[i]->out->size() < docBytes)
            total += mix[i].second;
    if (total == 0)
        return -1;
    auto draw = static_cast<int>(rng.below(static_cast<uint64_t>(total)));
    for (size_t i = 0; i < mix.size(); ++i) {
        if (fileOfType[i]->out->size() >= docBytes)
            continue;
        if (draw < mix[i].second)
            return static_cast<int>(i);
        draw -= mix[i].second;
    }
    return -1;
}
} // namespace

BigCompany::BigCompany(BigCompanyOptions options)
    : options_(std::move(options)), pools_(std::make_unique<BigCompanyPools>()) {
    Check(options_.docBytes, 170, kMaxDocBytes, "--doc-bytes");
    Check(options_.items, 1, kMaxItems, "--items");
    Check(options_.accounts, 1, kMaxAccounts, "--accounts");
    if (options_.typeMix.empty())
        options_.typeMix = kDefaultMix;
    BigCompanyPools& pools = *pools_;
    for (int64_t i = 0; i < options_.accounts; ++i)
        pools.accounts.push_back({StoredText(AccountKey(i), 8), StoredText(AccountName(i), 30),
                                  StoredText(Address1(i), 30), StoredText(Address2(i), 30)});
    for (int64_t i = 0; i < options_.items; ++i) {
        const ItemWords& words = kItemWords[static_cast<size_t>(i) % Count(kItemWords)];
        std::string description = std::string(words.hebrew) + " " + std::to_string(100 + i % 900);
        double price = 5 + static_cast<double>((i * 7919) % 200000) / 100;
        pools.items.push_back({StoredText(ItemKey(i), 12), StoredText(description, 40), price});
    }
    for (const char* text : kDetails)
        pools.details.push_back(StoredText(text, 8));
    for (const char* text : kRemarks)
        pools.remarks.push_back(StoredText(text, 48));
    for (const char* text : kTextLines)
        pools.textLines.push_back(StoredText(text, 40));
}

BigCompany::~BigCompany() = default;

void BigCompany::write(const std::filesystem::path& dir, const Progress& progress) {
    std::error_code ec;
    std::filesystem::create_directories(dir, ec);
    if (ec || !std::filesystem::is_directory(dir))
        throw Error("cannot create the directory " + dir.string());
    WriteCompany(nlohmann::json{{"company",
                                 {{"name", "חברה גדולה"},
                                  {"title", "חברה גדולה למחשבים בע\"מ"},
                                  {"currencies", {"יורו"}}}}},
                 dir);
    writeItems(dir);
    writeAccounts(dir);
    writeDocuments(dir, progress);
}

void BigCompany::writeItems(const std::filesystem::path& dir) const {
    ChunkedFile out(dir / "ITM.fix");
    out.buffer() += FillerRecordOf(500, false);
    for (int64_t i = 0; i < options_.items; ++i) {
        const ItemWords& words = kItemWords[static_cast<size_t>(i) % Count(kItemWords)];
        out.buffer() += ItemRecordOf(
            {{"key", ItemKey(i)},
             {"name", std::string(words.hebrew) + " " + std::to_string(100 + i % 900)},
             {"category", std::to_string(10 + i % 40)},
             {"foreignName", std::string(words.english) + " " + std::to_string(100 + i % 900)}});
        out.flushIfFull();
    }
    out.buffer() += FillerRecordOf(500, false);
    out.close();
}

void BigCompany::writeAccounts(const std::filesystem::path& dir) const {
    ChunkedFile out(dir / "ACT.fix");
    out.buffer() += FillerRecordOf(650, false);
    for (int64_t i = 0; i < options_.accounts; ++i) {
        out.buffer() +=
            AccountRecordOf({{"key", AccountKey(i)},
                             {"name", AccountName(i)},
                             {"phone", Phone(i)},
                             {"district", kDistricts[static_cast<size_t>(i) % Count(kDistricts)]},
                             {"details", Address1(i) + " " + Address2(i)}});
        out.flushIfFull();
    }
    out.buffer() += FillerRecordOf(650, false);
    out.close();
}

void BigCompany::writeDocuments(const std::filesystem::path& dir, const Progress& progress) {
    std::vector<DocumentFile> files;
    for (std::string_view name : kDocumentFiles) {
        files.push_back({std::string(name), std::make_unique<ChunkedFile>(dir / name)});
        files.back().out->buffer() += FillerRecordOf(170, true);
    }
    const std::vector<TypeWeight>& mix = options_.typeMix;
    std::vector<DocumentFile*> fileOfType;
    for (const TypeWeight& entry : mix) {
        auto named = [&](const DocumentFile& f) { return f.name == DocumentFileOf(entry.first); };
        fileOfType.push_back(&*std::find_if(files.begin(), files.end(), named));
    }
    Random rng(options_.seed);
    std::map<int, int> numbers;
    for (int i; (i = DrawType(mix, fileOfType, options_.docBytes, rng)) >= 0;) {
        DocumentFile& file = *fileOfType[static_cast<size_t>(i)];
        double fraction =
            static_cast<double>(file.out->size()) / static_cast<double>(options_.docBytes);
        int type = mix[static_cast<size_t>(i)].first;
        AppendDocumentRecords(MakeDocument(*pools_, rng, type, ++numbers[type], fraction),
                              file.out->buffer());
        file.out->flushIfFull();
        if (progress && file.out->size() >= file.reported + kProgressEvery) {
            file.reported = file.out->size();
            progress(file.name + ": " + std::to_string(file.reported >> 20) + " of " +
                     std::to_string(options_.docBytes >> 20) + " MiB");
        }
    }
    for (DocumentFile& file : files)
        file.out->close();
}

} // namespace dovrel::sample
