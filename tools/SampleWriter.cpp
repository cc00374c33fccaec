#include "tools/SampleWriter.h"

#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"

#include <unicode/utf8.h>

#include <algorithm>
#include <bit>
#include <cerrno>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <initializer_list>
#include <map>
#include <optional>
#include <system_error>
#include <utility>
#include <vector>

namespace dovrel::sample {
namespace {

using nlohmann::json;

constexpr size_t kDocRecord = 170;
constexpr size_t kItemRecord = 500;
constexpr size_t kAccountRecord = 650;
constexpr size_t kCompanyRecord = 7495;
// The writer builds every file in memory before it writes any of them, so a
// bad description leaves nothing behind; this bounds what it will hold.
constexpr size_t kMaxFileBytes = size_t{64} * 1024 * 1024;

constexpr char kShip[] = "ISHP.FIX";
constexpr char kOrders[] = "IORDR.FIX";
constexpr char kMoves[] = "IMV.FIX";
constexpr char kQuotes[] = "IBD.FIX";
constexpr char kItems[] = "ITM.fix";
constexpr char kAccounts[] = "ACT.fix";
constexpr char kCompany[] = "adf.fix";

constexpr UChar32 kAlef = 0x05D0;
constexpr UChar32 kTav = 0x05EA;
constexpr unsigned char kDosAlef = 0x80;
constexpr unsigned char kDosTav = 0x9A;

using Files = std::map<std::string, std::string>;

// The place of a value in the description, for error messages:
// "documents[3].lines[2].price".
class Where {
public:
    Where() = default;
    Where operator[](std::string_view key) const {
        return Where(path_.empty() ? std::string(key) : path_ + "." + std::string(key));
    }
    Where operator[](size_t index) const {
        return Where(path_ + "[" + std::to_string(index) + "]");
    }
    [[noreturn]] void Fail(const std::string& message) const {
        throw Error((path_.empty() ? std::string("description") : path_) + ": " + message);
    }

private:
    explicit Where(std::string path) : path_(std::move(path)) {}
    std::string path_;
};

// ---- Text -------------------------------------------------------------

std::string HexCode(UChar32 c) {
    char buf[16];
    std::snprintf(buf, sizeof buf, "U+%04X", static_cast<unsigned>(c));
    return buf;
}

std::vector<UChar32> CodePoints(std::string_view utf8) {
    std::vector<UChar32> out = dovrel::CodePoints(utf8);
    if (std::find(out.begin(), out.end(), -1) != out.end())
        throw Error("text is not valid UTF-8");
    return out;
}

bool IsHebrewLetter(UChar32 c) {
    return c >= kAlef && c <= kTav;
}

bool IsLatinOrDigit(UChar32 c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z');
}

// Characters that belong to a Latin run when a Latin letter or digit stands
// on both sides: "1.5", "03-1234567", "A-100", "12:30", and the space of
// "Widget Pro", which the DOS screen also shows left to right.
bool IsRunJoiner(UChar32 c) {
    return c == '.' || c == ',' || c == '-' || c == '/' || c == ':' || c == ' ';
}

// Brackets turn round when the text is stored in visual order, exactly as
// the reader turns them back.
UChar32 Mirrored(UChar32 c) {
    if (c >= 0x80)
        return c;
    return static_cast<unsigned char>(VisualChar(static_cast<char>(c)));
}

// The DOS byte of one character: Hebrew letters 0x80-0x9A, everything else
// its code page 1255 byte. A character whose code page 1255 byte falls among
// the DOS letters would read back as a Hebrew letter, so it is refused.
char DosByte(UChar32 c) {
    if (IsHebrewLetter(c))
        return static_cast<char>(kDosAlef + (c - kAlef));
    if (c < 0x80)
        return static_cast<char>(c);
    uint8_t utf8[4];
    int32_t length = 0;
    UBool error = false;
    U8_APPEND(utf8, length, 4, c, error);
    std::string cp = FromUtf8(
        Utf8(std::string_view(reinterpret_cast<const char*>(utf8), static_cast<size_t>(length))));
    if (error || cp.size() != 1 || cp == "?")
        throw Error("character " + HexCode(c) + " has no byte in code page 1255");
    auto b = static_cast<unsigned char>(cp[0]);
    if (b >= kDosAlef && b <= kDosTav)
        throw Error("character " + HexCode(c) +
                    " cannot be stored: its byte is a Hebrew letter in the DOS code");
    return cp[0];
}

std::string DosBytesOf(const std::vector<UChar32>& text) {
    std::string out;
    out.reserve(text.size());
    for (UChar32 c : text)
        out.push_back(DosByte(c));
    return out;
}

// Marks the characters that keep their own order inside reversed text.
std::vector<bool> LatinRuns(const std::vector<UChar32>& text) {
    std::vector<bool> inRun(text.size(), false);
    for (size_t i = 0; i < text.size(); ++i) {
        if (IsLatinOrDigit(text[i]))
            inRun[i] = true;
        else if (IsRunJoiner(text[i]) && i > 0 && i + 1 < text.size())
            inRun[i] = IsLatinOrDigit(text[i - 1]) && IsLatinOrDigit(text[i + 1]);
    }
    return inRun;
}

std::vector<UChar32> VisualOrder(const std::vector<UChar32>& logical) {
    if (std::none_of(logical.begin(), logical.end(), IsHebrewLetter))
        return logical;
    std::vector<bool> inRun = LatinRuns(logical);
    std::vector<UChar32> visual(logical.rbegin(), logical.rend());
    std::reverse(inRun.begin(), inRun.end());
    size_t i = 0;
    while (i < visual.size()) {
        if (!inRun[i]) {
            visual[i] = Mirrored(visual[i]);
            ++i;
            continue;
        }
        size_t end = i;
        while (end < visual.size() && inRun[end])
            ++end;
        std::reverse(visual.begin() + static_cast<std::ptrdiff_t>(i),
                     visual.begin() + static_cast<std::ptrdiff_t>(end));
        i = end;
    }
    return visual;
}

int HexDigit(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    return -1;
}

// "8D 85 8C 99" (or "8D858C99") to its bytes.
std::string HexBytes(std::string_view hex, const Where& where) {
    std::string out;
    size_t i = 0;
    while (i < hex.size()) {
        if (hex[i] == ' ') {
            ++i;
            continue;
        }
        int high = HexDigit(hex[i]);
        int low = i + 1 < hex.size() ? HexDigit(hex[i + 1]) : -1;
        if (high < 0 || low < 0)
            where.Fail("expected hexadecimal bytes such as \"8D 85 0A\"");
        out.push_back(static_cast<char>(high * 16 + low));
        i += 2;
    }
    return out;
}

// ---- Checked reading of the description -------------------------------

const json* Find(const json& object, std::string_view key) {
    auto it = object.find(key);
    return it == object.end() ? nullptr : &*it;
}

void CheckObject(const json& value, const Where& where,
                 std::initializer_list<std::string_view> allowed) {
    if (!value.is_object())
        where.Fail("expected an object");
    for (const auto& item : value.items()) {
        if (std::find(allowed.begin(), allowed.end(), item.key()) == allowed.end())
            where[item.key()].Fail("unknown key");
    }
}

const std::string& StringValue(const json& value, const Where& where) {
    if (!value.is_string())
        where.Fail("expected a string");
    return value.get_ref<const std::string&>();
}

int64_t WholeNumber(const json& value, const Where& where, int64_t min, int64_t max) {
    bool whole = value.is_number_integer();
    if (whole && value.is_number_unsigned() && value.get<uint64_t>() > static_cast<uint64_t>(max))
        whole = false;
    int64_t n = whole ? value.get<int64_t>() : 0;
    if (!whole || n < min || n > max)
        where.Fail("expected a whole number from " + std::to_string(min) + " to " +
                   std::to_string(max));
    return n;
}

int ByteField(const json& object, std::string_view key, const Where& where, int fallback) {
    const json* value = Find(object, key);
    return value ? static_cast<int>(WholeNumber(*value, where[key], 0, 255)) : fallback;
}

bool BoolField(const json& object, std::string_view key, const Where& where, bool fallback) {
    const json* value = Find(object, key);
    if (value == nullptr)
        return fallback;
    if (!value->is_boolean())
        where[key].Fail("expected true or false");
    return value->get<bool>();
}

// A stored number: its bytes and the value they hold.
struct StoredNumber {
    std::string bytes;
    double value = 0;
};

StoredNumber DoubleBytes(double value) {
    auto bits = std::bit_cast<uint64_t>(value);
    StoredNumber n{std::string(8, '\0'), value};
    for (size_t i = 0; i < 8; ++i)
        n.bytes[i] = static_cast<char>((bits >> (8 * i)) & 0xFF);
    return n;
}

// A percentage as an int16 in hundredths (12.5 is 1250); nothing when it
// does not fit.
std::optional<StoredNumber> HundredthsBytes(double percent) {
    double hundredths = std::round(percent * 100);
    if (!(hundredths >= INT16_MIN && hundredths <= INT16_MAX))
        return std::nullopt;
    auto stored = static_cast<uint16_t>(static_cast<int16_t>(hundredths));
    return StoredNumber{
        std::string{static_cast<char>(stored & 0xFF), static_cast<char>(stored >> 8)}, percent};
}

StoredNumber HexNumber(const json& value, const Where& where, size_t width) {
    CheckObject(value, where, {"hex"});
    if (!value.contains("hex"))
        where.Fail("expected a number or {\"hex\": \"...\"}");
    std::string bytes = HexBytes(StringValue(value.at("hex"), where["hex"]), where["hex"]);
    if (bytes.size() != width)
        where["hex"].Fail("expected exactly " + std::to_string(width) + " bytes");
    uint64_t bits = 0;
    for (size_t i = width; i-- > 0;)
        bits = (bits << 8) | static_cast<unsigned char>(bytes[i]);
    double value8 = width == 8 ? std::bit_cast<double>(bits) : 0;
    return {bytes, width == 8 ? value8 : static_cast<int16_t>(bits) / 100.0};
}

StoredNumber DoubleField(const json& object, std::string_view key, const Where& where,
                         double fallback) {
    const json* value = Find(object, key);
    if (value == nullptr)
        return DoubleBytes(fallback);
    if (value->is_number())
        return DoubleBytes(value->get<double>());
    if (value->is_object())
        return HexNumber(*value, where[key], 8);
    where[key].Fail("expected a number");
}

// A percentage stored as an int16 in hundredths: 12.5 is 1250.
StoredNumber HundredthsField(const json& object, std::string_view key, const Where& where) {
    const json* value = Find(object, key);
    if (value == nullptr)
        return {std::string(2, '\0'), 0};
    if (value->is_object())
        return HexNumber(*value, where[key], 2);
    if (!value->is_number())
        where[key].Fail("expected a number");
    std::optional<StoredNumber> stored = HundredthsBytes(value->get<double>());
    if (!stored)
        where[key].Fail("expected a number from -327.68 to 327.67");
    return *stored;
}

std::string Padded(std::string bytes, size_t width) {
    bytes.resize(width, ' ');
    return bytes;
}

// Runs a text conversion, naming the entry in its error.
template <typename Convert> std::string Converted(const Where& where, Convert convert) {
    try {
        return convert();
    } catch (const Error& e) {
        where.Fail(e.what());
    }
}

// A text in reading order, cut before it is turned so that it keeps its
// beginning. Hebrew text stands right-aligned in its field as on the DOS
// screen: the padding goes before it in visual order. Padded after it, a
// mixed field such as "רח' הרצל 45" would read back with the padding
// between the number and the words.
std::string ReadingOrderText(const std::string& utf8, size_t width, Order order) {
    std::vector<UChar32> text = CodePoints(utf8);
    if (text.size() > width)
        text.resize(width);
    if (order == Order::AsGiven || std::none_of(text.begin(), text.end(), IsHebrewLetter))
        return Padded(DosBytesOf(text), width);
    std::string bytes = DosBytesOf(VisualOrder(text));
    return std::string(width - bytes.size(), ' ') + bytes;
}

// A text field: a string in reading order, {"visual": ...} or {"hex": ...}.
// The last two are cut to the field's width or padded with spaces after
// them, byte for byte as given.
std::string TextValue(const json& value, const Where& where, size_t width, Order order) {
    if (value.is_string()) {
        const std::string& utf8 = value.get_ref<const std::string&>();
        return Converted(where, [&] { return ReadingOrderText(utf8, width, order); });
    }
    bool visual = value.is_object() && value.contains("visual");
    bool hex = value.is_object() && value.contains("hex");
    if (value.is_object())
        CheckObject(value, where, {"visual", "hex"});
    if (visual == hex)
        where.Fail("expected a string, {\"visual\": \"...\"} or {\"hex\": \"...\"}");
    if (visual) {
        const std::string& text = StringValue(value.at("visual"), where["visual"]);
        return Padded(Converted(where["visual"], [&] { return DosBytes(text); }), width);
    }
    return Padded(HexBytes(StringValue(value.at("hex"), where["hex"]), where["hex"]), width);
}

std::string TextField(const json& object, std::string_view key, const Where& where, size_t width,
                      Order order = Order::Visual) {
    const json* value = Find(object, key);
    return value ? TextValue(*value, where[key], width, order) : std::string(width, ' ');
}

// ---- Records ------------------------------------------------------------

void Put(std::string& record, size_t offset, std::string_view bytes) {
    record.replace(offset, bytes.size(), bytes);
}

void PutByte(std::string& record, size_t offset, int value) {
    record[offset] = static_cast<char>(value);
}

void Zero(std::string& record, size_t offset, size_t width) {
    record.replace(offset, width, width, '\0');
}

void Append(std::string& file, std::string_view bytes, const Where& where) {
    if (file.size() + bytes.size() > kMaxFileBytes)
        where.Fail("the file would grow beyond " + std::to_string(kMaxFileBytes) + " bytes");
    file.append(bytes);
}

std::string FillerRecord(size_t length) {
    std::string record(length, ' ');
    record[0] = '\0';
    return record;
}

// ---- Document files -------------------------------------------------------

constexpr std::string_view kDocumentFiles[] = {kShip, kOrders, kMoves, kQuotes};
constexpr std::string_view kAllFiles[] = {kShip,  kOrders,   kMoves,  kQuotes,
                                          kItems, kAccounts, kCompany};

std::string FileOfType(int type) {
    if (type >= 20 && type <= 23)
        return kShip;
    if (type >= 30 && type <= 36)
        return kOrders;
    if (type == 40 || type == 41)
        return kQuotes;
    return kMoves;
}

template <size_t N>
std::string FileName(const json& value, const Where& where, const std::string_view (&names)[N]) {
    const std::string& name = StringValue(value, where);
    if (std::find(std::begin(names), std::end(names), name) != std::end(names))
        return name;
    std::string list;
    for (std::string_view known : names)
        list += (list.empty() ? "\"" : ", \"") + std::string(known) + "\"";
    where.Fail("expected one of " + list);
}

const json& Required(const json& object, std::string_view key, const Where& where) {
    const json* value = Find(object, key);
    if (value == nullptr)
        where.Fail("missing \"" + std::string(key) + "\"");
    return *value;
}

double PlainNumber(const json& object, std::string_view key, const Where& where, double fallback) {
    const json* value = Find(object, key);
    if (value == nullptr)
        return fallback;
    if (!value->is_number())
        where[key].Fail("expected a number");
    return value->get<double>();
}

struct Line {
    std::string record;
    double total = 0;
    bool shown = true; // neither hidden ("#") nor of another document type
};

bool ShownLine(const std::string& record, int docType) {
    std::string_view key = std::string_view(record).substr(1, 12);
    while (!key.empty() && key.front() == ' ')
        key.remove_prefix(1);
    while (!key.empty() && key.back() == ' ')
        key.remove_suffix(1);
    return key != "#" && static_cast<unsigned char>(record[93]) == docType;
}

// The stored form of each field of a line record; the description writer
// and the record-level entry point both fill it.
struct LineFields {
    int kind = 3;
    std::string key, description, details; // stored bytes, cut or padded to width
    int currency = 21;
    int docType = 0;
    StoredNumber price, total, quantity, discount;
    int lineNumber = 1;
};

std::string EncodeLine(const LineFields& f) {
    std::string record(kDocRecord, ' ');
    PutByte(record, 0, f.kind);
    Put(record, 1, Padded(f.key, 12));
    Put(record, 13, Padded(f.description, 40));
    Zero(record, 53, 2);
    Put(record, 64, Padded(f.details, 8));
    PutByte(record, 72, f.currency);
    PutByte(record, 93, f.docType);
    Zero(record, 94, 14);
    Put(record, 108, f.price.bytes);
    Put(record, 116, f.total.bytes);
    Put(record, 124, f.quantity.bytes);
    Zero(record, 132, 24);
    Put(record, 156, f.discount.bytes);
    Zero(record, 158, 4);
    PutByte(record, 162, f.lineNumber);
    return record;
}

Line LineRecord(const json& line, const Where& where, int docType, size_t position) {
    CheckObject(line, where,
                {"kind", "key", "description", "details", "currency", "docType", "price", "rate",
                 "total", "quantity", "discount", "lineNumber"});
    if (!line.contains("lineNumber") && position > 255)
        where.Fail("lines after the 255th need a \"lineNumber\"");
    LineFields f;
    f.kind = ByteField(line, "kind", where, 3);
    f.key = TextField(line, "key", where, 12);
    f.description = TextField(line, "description", where, 40);
    f.details = TextField(line, "details", where, 8);
    f.currency = ByteField(line, "currency", where, 21);
    f.docType = ByteField(line, "docType", where, docType);
    f.price = DoubleField(line, "price", where, 0);
    double rate = PlainNumber(line, "rate", where, 1);
    f.quantity = DoubleField(line, "quantity", where, 0);
    f.discount = HundredthsField(line, "discount", where);
    f.total = DoubleField(line, "total", where,
                          f.price.value * rate * f.quantity.value * (100 - f.discount.value) / 100);
    f.lineNumber = ByteField(line, "lineNumber", where, static_cast<int>(position));
    std::string record = EncodeLine(f);
    return {record, f.total.value, ShownLine(record, docType)};
}

std::vector<Line> LineRecords(const json& doc, const Where& where, int docType) {
    std::vector<Line> lines;
    const json* list = Find(doc, "lines");
    if (list == nullptr)
        return lines;
    if (!list->is_array())
        where["lines"].Fail("expected an array");
    for (size_t i = 0; i < list->size(); ++i)
        lines.push_back(LineRecord((*list)[i], where["lines"][i], docType, i + 1));
    return lines;
}

std::vector<std::string> Remarks(const json& doc, const Where& where) {
    std::vector<std::string> remarks(3, std::string(48, ' '));
    const json* list = Find(doc, "remarks");
    if (list == nullptr)
        return remarks;
    if (!list->is_array() || list->size() > 3)
        where["remarks"].Fail("expected an array of at most 3 texts");
    for (size_t i = 0; i < list->size(); ++i)
        remarks[i] = TextValue((*list)[i], where["remarks"][i], 48, Order::Visual);
    return remarks;
}

std::optional<std::string> ParseDate(std::string_view text) {
    if (text.size() != 10 || text[4] != '-' || text[7] != '-')
        return std::nullopt;
    int parts[3] = {0, 0, 0};
    int part = 0;
    for (size_t i = 0; i < text.size(); ++i) {
        if (i == 4 || i == 7) {
            ++part;
            continue;
        }
        if (text[i] < '0' || text[i] > '9')
            return std::nullopt;
        parts[part] = parts[part] * 10 + (text[i] - '0');
    }
    std::chrono::year_month_day date{std::chrono::year(parts[0]),
                                     std::chrono::month(static_cast<unsigned>(parts[1])),
                                     std::chrono::day(static_cast<unsigned>(parts[2]))};
    if (!date.ok() || parts[0] < 1900 || parts[0] > 2155)
        return std::nullopt;
    return std::string{static_cast<char>(parts[0] - 1900), static_cast<char>(parts[1]),
                       static_cast<char>(parts[2])};
}

// The three date bytes: year - 1900, month, day.
std::string DateBytes(const json& doc, const Where& where) {
    const json* value = Find(doc, "date");
    Where at = where["date"];
    if (value == nullptr)
        return {static_cast<char>(124), 1, 1};
    if (value->is_object()) {
        CheckObject(*value, at, {"year", "month", "day"});
        return {static_cast<char>(ByteField(*value, "year", at, 124)),
                static_cast<char>(ByteField(*value, "month", at, 1)),
                static_cast<char>(ByteField(*value, "day", at, 1))};
    }
    std::optional<std::string> date;
    if (value->is_string())
        date = ParseDate(value->get_ref<const std::string&>());
    if (!date)
        at.Fail("expected a date \"YYYY-MM-DD\" from 1900 to 2155, or {\"year\", \"month\", "
                "\"day\"} bytes");
    return *date;
}

// The stored form of the fields of a header and its continuation record.
struct DocumentFields {
    int kind = 1;
    int type = 20;
    std::string account, customer, address1, address2, reference; // stored bytes
    std::vector<std::string> remarks = std::vector<std::string>(3);
    int lineCount = 0;
    std::string date; // three bytes: year - 1900, month, day
    StoredNumber discount, withVat, vat, before;
    int warehouse = 1;
};

std::string EncodeHeader(const DocumentFields& f) {
    std::string record(kDocRecord, ' ');
    PutByte(record, 0, f.kind);
    PutByte(record, 1, f.type);
    Put(record, 2, Padded(f.account, 8));
    Put(record, 10, Padded(f.customer, 30));
    Put(record, 40, Padded(f.address1, 30));
    Put(record, 70, Padded(f.address2, 30));
    Put(record, 100, Padded(f.reference, 5));
    Put(record, 110, Padded(f.remarks[0], 48));
    PutByte(record, 158, f.lineCount);
    return record;
}

std::string EncodeContinuation(const DocumentFields& f) {
    std::string record(kDocRecord, ' ');
    PutByte(record, 0, 2);
    PutByte(record, 1, 0);
    Put(record, 5, Padded(f.remarks[1], 48));
    Put(record, 53, Padded(f.remarks[2], 48));
    Zero(record, 101, 1);
    Put(record, 102, f.date);
    Zero(record, 105, 7);
    Put(record, 112, f.discount.bytes);
    Put(record, 120, f.withVat.bytes);
    Put(record, 128, f.vat.bytes);
    Zero(record, 136, 2);
    PutByte(record, 138, f.warehouse);
    Zero(record, 139, 1);
    Zero(record, 153, 1);
    Put(record, 154, f.before.bytes);
    Zero(record, 165, 1);
    return record;
}

double TotalWithVat(double before, double discount, double vat) {
    return before * (100 - discount) / 100 * (100 + vat) / 100;
}

DocumentFields DocumentFieldsOf(const json& doc, const Where& where, int type, int lineCount,
                                double linesTotal) {
    DocumentFields f;
    f.remarks = Remarks(doc, where);
    f.kind = ByteField(doc, "kind", where, 1);
    f.type = type;
    f.account = TextField(doc, "account", where, 8);
    f.customer = TextField(doc, "customer", where, 30);
    f.address1 = TextField(doc, "address1", where, 30);
    f.address2 = TextField(doc, "address2", where, 30);
    f.reference = TextField(doc, "reference", where, 5);
    f.lineCount = lineCount;
    f.date = DateBytes(doc, where);
    f.discount = DoubleField(doc, "discountPercent", where, 0);
    f.before = DoubleField(doc, "totalBeforeDiscount", where, linesTotal);
    f.vat = DoubleField(doc, "vatPercent", where, 17);
    f.withVat = DoubleField(doc, "totalWithVat", where,
                            TotalWithVat(f.before.value, f.discount.value, f.vat.value));
    f.warehouse = ByteField(doc, "warehouse", where, 1);
    return f;
}

int LineCount(const json& doc, const Where& where, size_t lines) {
    if (doc.contains("lineCount"))
        return ByteField(doc, "lineCount", where, 0);
    if (lines > 255)
        where.Fail("a document of more than 255 lines needs a \"lineCount\"");
    return static_cast<int>(lines);
}

void AppendDocument(const json& doc, const Where& where, Files& files) {
    CheckObject(doc, where,
                {"type", "kind", "file", "account", "customer", "address1", "address2", "reference",
                 "remarks", "lineCount", "date", "discountPercent", "totalWithVat", "vatPercent",
                 "warehouse", "totalBeforeDiscount", "lines"});
    int type = ByteField(doc, "type", where, 20);
    const json* file = Find(doc, "file");
    std::string name = file ? FileName(*file, where["file"], kDocumentFiles) : FileOfType(type);
    std::vector<Line> lines = LineRecords(doc, where, type);
    double linesTotal = 0;
    for (const Line& line : lines)
        if (line.shown)
            linesTotal += line.total;
    DocumentFields fields =
        DocumentFieldsOf(doc, where, type, LineCount(doc, where, lines.size()), linesTotal);
    std::string& bytes = files[name];
    Append(bytes, EncodeHeader(fields), where);
    Append(bytes, EncodeContinuation(fields), where);
    for (const Line& line : lines)
        Append(bytes, line.record, where);
}

void AppendFiller(const json& entry, const Where& where, Files& files) {
    CheckObject(entry, where, {"file", "filler"});
    std::string name = FileName(Required(entry, "file", where), where["file"], kDocumentFiles);
    auto count = WholeNumber(Required(entry, "filler", where), where["filler"], 0,
                             static_cast<int64_t>(kMaxFileBytes / kDocRecord));
    std::string& bytes = files[name];
    std::string record = FillerRecord(kDocRecord);
    for (int64_t i = 0; i < count; ++i)
        Append(bytes, record, where);
}

// Record 1 of a document file never holds a document: it is a filler (kind 0).
void WriteDocuments(const json& documents, const Where& where, Files& files) {
    if (!documents.is_array())
        where.Fail("expected an array");
    for (std::string_view name : kDocumentFiles)
        files[std::string(name)] = FillerRecord(kDocRecord);
    for (size_t i = 0; i < documents.size(); ++i) {
        const json& entry = documents[i];
        if (entry.is_object() && entry.contains("filler"))
            AppendFiller(entry, where[i], files);
        else
            AppendDocument(entry, where[i], files);
    }
}

// ---- Items, accounts, company ----------------------------------------------

// An items or accounts section: a list, or {"trailer": false, "list": [...]}.
// The closing record is there because the readers never read a file's last
// record.
struct RecordList {
    const json* list;
    Where where;
    bool trailer;
};

RecordList ListSection(const json& section, const Where& where) {
    static const json kNone = json::array();
    if (section.is_array())
        return {&section, where, true};
    if (!section.is_object())
        where.Fail("expected an array or {\"trailer\": ..., \"list\": [...]}");
    CheckObject(section, where, {"trailer", "list"});
    bool trailer = BoolField(section, "trailer", where, true);
    const json* list = Find(section, "list");
    if (list != nullptr && !list->is_array())
        where["list"].Fail("expected an array");
    return {list ? list : &kNone, where["list"], trailer};
}

std::string ItemRecord(const json& item, const Where& where) {
    CheckObject(item, where, {"key", "name", "category", "foreignName"});
    std::string record(kItemRecord, ' ');
    Put(record, 0, TextField(item, "key", where, 12));
    Put(record, 12, TextField(item, "name", where, 40));
    Put(record, 52, TextField(item, "category", where, 3, Order::AsGiven));
    Put(record, 85, TextField(item, "foreignName", where, 40, Order::AsGiven));
    return record;
}

std::string AccountRecord(const json& account, const Where& where) {
    CheckObject(account, where, {"key", "name", "phone", "district", "details"});
    std::string record(kAccountRecord, ' ');
    Put(record, 0, TextField(account, "key", where, 8));
    Put(record, 8, TextField(account, "name", where, 30));
    Put(record, 60, TextField(account, "phone", where, 30, Order::AsGiven));
    Put(record, 120, TextField(account, "district", where, 15));
    Put(record, 167, TextField(account, "details", where, 50));
    return record;
}

template <typename MakeRecord>
std::string ListFile(const json& section, const Where& where, size_t recordLength,
                     MakeRecord makeRecord) {
    RecordList records = ListSection(section, where);
    std::string filler(recordLength, ' ');
    std::string bytes = filler;
    for (size_t i = 0; i < records.list->size(); ++i)
        Append(bytes, makeRecord((*records.list)[i], records.where[i]), where);
    if (records.trailer)
        Append(bytes, filler, where);
    return bytes;
}

std::string CompanyRecord(const json& company, const Where& where) {
    CheckObject(company, where, {"name", "title", "currencies"});
    std::string record(kCompanyRecord, ' ');
    Put(record, 0, TextField(company, "name", where, 20));
    Put(record, 20, TextField(company, "title", where, 60));
    const json* names = Find(company, "currencies");
    if (names == nullptr)
        return record;
    if (!names->is_array() || names->size() > 9)
        where["currencies"].Fail("expected an array of at most 9 texts");
    for (size_t i = 0; i < names->size(); ++i)
        Put(record, 7360 + 15 * i,
            TextValue((*names)[i], where["currencies"][i], 15, Order::Visual));
    return record;
}

// ---- Damage and output -----------------------------------------------------

void ApplyDamage(const json& entry, const Where& where, Files& files) {
    CheckObject(entry, where, {"file", "truncate", "length", "append"});
    std::string name = FileName(Required(entry, "file", where), where["file"], kAllFiles);
    int actions = static_cast<int>(entry.contains("truncate")) +
                  static_cast<int>(entry.contains("length")) +
                  static_cast<int>(entry.contains("append"));
    if (actions != 1)
        where.Fail("expected exactly one of \"truncate\", \"length\" and \"append\"");
    if (entry.contains("truncate")) {
        auto it = files.find(name);
        if (it == files.end())
            where["file"].Fail(name + " is not written by this description");
        auto cut = WholeNumber(entry.at("truncate"), where["truncate"], 0,
                               static_cast<int64_t>(it->second.size()));
        it->second.resize(it->second.size() - static_cast<size_t>(cut));
    } else if (entry.contains("length")) {
        auto length = WholeNumber(entry.at("length"), where["length"], 0,
                                  static_cast<int64_t>(kMaxFileBytes));
        files[name].resize(static_cast<size_t>(length), '\0');
    } else {
        const std::string& hex = StringValue(entry.at("append"), where["append"]);
        Append(files[name], HexBytes(hex, where["append"]), where["append"]);
    }
}

void WriteFile(const std::filesystem::path& path, const std::string& bytes) {
    std::FILE* file = std::fopen(path.c_str(), "wb");
    if (file == nullptr)
        ThrowSystemError("cannot create", path.string(), errno);
    size_t written = std::fwrite(bytes.data(), 1, bytes.size(), file);
    int err = written == bytes.size() ? 0 : (errno != 0 ? errno : EIO);
    if (std::fclose(file) != 0 && err == 0)
        err = errno != 0 ? errno : EIO;
    if (err != 0)
        ThrowSystemError("cannot write", path.string(), err);
}

void WriteFiles(const Files& files, const std::filesystem::path& dir) {
    std::error_code ec;
    std::filesystem::create_directories(dir, ec);
    if (ec || !std::filesystem::is_directory(dir))
        throw Error("cannot create the directory " + dir.string() + ": " +
                    (ec ? ec.message() : std::string("a file of that name is in the way")));
    for (const auto& [name, bytes] : files)
        WriteFile(dir / name, bytes);
}

Files CompanyFiles(const json& description) {
    Where root;
    CheckObject(description, root, {"company", "items", "accounts", "documents", "damage"});
    Files files;
    if (const json* company = Find(description, "company"))
        files[kCompany] = CompanyRecord(*company, root["company"]);
    if (const json* items = Find(description, "items"))
        files[kItems] = ListFile(*items, root["items"], kItemRecord, ItemRecord);
    if (const json* accounts = Find(description, "accounts"))
        files[kAccounts] = ListFile(*accounts, root["accounts"], kAccountRecord, AccountRecord);
    if (const json* documents = Find(description, "documents"))
        WriteDocuments(*documents, root["documents"], files);
    if (const json* damage = Find(description, "damage")) {
        if (!damage->is_array())
            root["damage"].Fail("expected an array");
        for (size_t i = 0; i < damage->size(); ++i)
            ApplyDamage((*damage)[i], root["damage"][i], files);
    }
    return files;
}

// The library's message without its "[json.exception.parse_error.101] " tag.
std::string JsonMessage(const nlohmann::json::exception& e) {
    std::string_view message = e.what();
    if (message.starts_with("[json.exception.") && message.find("] ") != std::string_view::npos)
        message.remove_prefix(message.find("] ") + 2);
    return std::string(message);
}

} // namespace

// ---- Public text conversions ------------------------------------------------

std::string DosVisual(std::string_view utf8) {
    return DosBytesOf(VisualOrder(CodePoints(utf8)));
}

std::string DosBytes(std::string_view utf8) {
    return DosBytesOf(CodePoints(utf8));
}

void WriteCompany(const nlohmann::json& description, const std::filesystem::path& dir) {
    Files files;
    try {
        files = CompanyFiles(description);
    } catch (const nlohmann::json::exception& e) {
        throw Error("the description cannot be used: " + JsonMessage(e));
    }
    WriteFiles(files, dir);
}

void WriteCompany(std::string_view descriptionJson, const std::filesystem::path& dir) {
    nlohmann::json description;
    try {
        description = nlohmann::json::parse(descriptionJson.begin(), descriptionJson.end(), nullptr,
                                            true, true);
    } catch (const nlohmann::json::exception& e) {
        throw Error("the description is not valid JSON: " + JsonMessage(e));
    }
    WriteCompany(description, dir);
}

void WriteCompany(const std::string& descriptionJson, const std::filesystem::path& dir) {
    WriteCompany(std::string_view(descriptionJson), dir);
}

void WriteCompany(const char* descriptionJson, const std::filesystem::path& dir) {
    if (descriptionJson == nullptr)
        throw Error("no description was given");
    WriteCompany(std::string_view(descriptionJson), dir);
}

// ---- Record-level writing ----------------------------------------------------

namespace {

void CheckByte(int value, const std::string& what) {
    if (value < 0 || value > 255)
        throw Error(what + ": expected a whole number from 0 to 255");
}

LineFields LineFieldsOf(const LineData& line, int docType, int lineNumber) {
    CheckByte(line.currency, "line currency");
    LineFields f;
    f.key = line.key;
    f.description = line.description;
    f.details = line.details;
    f.currency = line.currency;
    f.docType = docType;
    f.price = DoubleBytes(line.price);
    f.quantity = DoubleBytes(line.quantity);
    std::optional<StoredNumber> discount = HundredthsBytes(line.discount);
    if (!discount)
        throw Error("line discount " + std::to_string(line.discount) +
                    " is outside -327.68 to 327.67");
    f.discount = *discount;
    f.total = DoubleBytes(line.price * line.rate * line.quantity * (100 - line.discount) / 100);
    f.lineNumber = lineNumber;
    return f;
}

std::string DateBytesOf(const DocumentData& doc) {
    std::chrono::year_month_day date{std::chrono::year(doc.year),
                                     std::chrono::month(static_cast<unsigned>(doc.month)),
                                     std::chrono::day(static_cast<unsigned>(doc.day))};
    if (!date.ok() || doc.year < 1900 || doc.year > 2155 || doc.month < 1 || doc.day < 1)
        throw Error("document date " + std::to_string(doc.year) + "-" + std::to_string(doc.month) +
                    "-" + std::to_string(doc.day) + " does not exist or is outside 1900 to 2155");
    return {static_cast<char>(doc.year - 1900), static_cast<char>(doc.month),
            static_cast<char>(doc.day)};
}

DocumentFields FieldsOf(const DocumentData& doc, double linesTotal) {
    CheckByte(doc.type, "document type");
    CheckByte(doc.warehouse, "warehouse");
    DocumentFields f;
    f.type = doc.type;
    f.account = doc.account;
    f.customer = doc.customer;
    f.address1 = doc.address1;
    f.address2 = doc.address2;
    f.reference = doc.reference;
    f.remarks.assign(doc.remarks.begin(), doc.remarks.end());
    f.lineCount = static_cast<int>(doc.lines.size());
    f.date = DateBytesOf(doc);
    f.discount = DoubleBytes(doc.discountPercent);
    f.before = DoubleBytes(linesTotal);
    f.vat = DoubleBytes(doc.vatPercent);
    f.withVat = DoubleBytes(TotalWithVat(linesTotal, doc.discountPercent, doc.vatPercent));
    f.warehouse = doc.warehouse;
    return f;
}

} // namespace

std::string StoredText(std::string_view utf8, size_t width, Order order) {
    return ReadingOrderText(std::string(utf8), width, order);
}

std::string DocumentFileOf(int type) {
    return FileOfType(type);
}

void AppendDocumentRecords(const DocumentData& doc, std::string& out) {
    if (doc.lines.size() > 255)
        throw Error("a document holds at most 255 line records");
    std::vector<std::string> lines;
    lines.reserve(doc.lines.size());
    double linesTotal = 0;
    for (size_t i = 0; i < doc.lines.size(); ++i) {
        LineFields line = LineFieldsOf(doc.lines[i], doc.type, static_cast<int>(i + 1));
        lines.push_back(EncodeLine(line));
        if (ShownLine(lines.back(), doc.type))
            linesTotal += line.total.value;
    }
    DocumentFields fields = FieldsOf(doc, linesTotal);
    out += EncodeHeader(fields);
    out += EncodeContinuation(fields);
    for (const std::string& line : lines)
        out += line;
}

std::string ItemRecordOf(const nlohmann::json& item) {
    return ItemRecord(item, Where()["item"]);
}

std::string AccountRecordOf(const nlohmann::json& account) {
    return AccountRecord(account, Where()["account"]);
}

std::string FillerRecordOf(size_t recordLength, bool documentFile) {
    return documentFile ? FillerRecord(recordLength) : std::string(recordLength, ' ');
}

} // namespace dovrel::sample
