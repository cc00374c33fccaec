#include "fixfiles/TextDecoding.h"

#include "platform/Ascii.h"

#include "fixfiles/CompanyFile.h"
#include "platform/Encoding.h"

#include <array>
#include <cstring>

namespace dovrel {

namespace {

constexpr unsigned char kDosAlef = 0x80;
constexpr unsigned char kDosTav = 0x9A;
constexpr unsigned char kWindowsOffset = 0x60;

bool IsDosHebrew(unsigned char c) {
    return c >= kDosAlef && c <= kDosTav;
}

char ToWindowsHebrew(unsigned char c) {
    return static_cast<char>(c + kWindowsOffset);
}

// The result grows at both ends. Every input byte adds at most one byte and
// the first Latin letter adds one space in front, so a buffer of twice the
// input plus two, started in the middle, never overflows at either end.
class TwoEndedBuffer {
public:
    explicit TwoEndedBuffer(size_t inputLength)
        : text_(2 * inputLength + 2, '\0'), front_(inputLength + 1), back_(inputLength + 1) {}

    void pushFront(char c) { text_[--front_] = c; }
    void pushBack(char c) { text_[back_++] = c; }

    std::string take() && {
        size_t length = back_ - front_;
        std::memmove(text_.data(), text_.data() + front_, length);
        text_.resize(length);
        return std::move(text_);
    }

private:
    std::string text_;
    size_t front_;
    size_t back_;
};

} // namespace

std::string LogicalText(std::string_view text) {
    TwoEndedBuffer result(text.size());
    bool hebrew = false;
    bool latin = false;
    for (size_t i = text.size(); i-- > 0;) {
        auto c = static_cast<unsigned char>(text[i]);
        if (IsDosHebrew(c)) {
            result.pushBack(ToWindowsHebrew(c));
            hebrew = true;
        } else if (IsAsciiAlnum(static_cast<char>(c))) {
            if (!latin) {
                result.pushFront(' ');
            }
            result.pushFront(static_cast<char>(c));
            hebrew = false;
            latin = true;
        } else if (!hebrew) {
            result.pushFront(static_cast<char>(c));
        } else {
            result.pushBack(latin ? ' ' : static_cast<char>(c));
        }
    }
    return std::move(result).take();
}

std::string VisualText(std::string_view text) {
    std::string result(text.size(), '\0');
    for (size_t i = 0; i < text.size(); ++i) {
        result[i] = VisualChar(text[i]);
    }
    return result;
}

std::string MappedLetters(std::string_view text) {
    std::string result(text);
    for (char& c : result)
        if (IsDosHebrew(static_cast<unsigned char>(c)))
            c = ToWindowsHebrew(static_cast<unsigned char>(c));
    return result;
}

char VisualChar(char c) {
    switch (c) {
    case '(':
        return ')';
    case ')':
        return '(';
    case '<':
        return '>';
    case '>':
        return '<';
    case '[':
        return ']';
    case ']':
        return '[';
    case '{':
        return '}';
    case '}':
        return '{';
    default:
        break;
    }
    auto u = static_cast<unsigned char>(c);
    return IsDosHebrew(u) ? ToWindowsHebrew(u) : c;
}

namespace {

using CurrencyPair = std::pair<std::string, std::string>;

// Codes 1 to 21; codes 10 to 18 are left empty here and come from the company.
const std::array<CurrencyPair, 22>& FixedCurrencies() {
    static const std::array<CurrencyPair, 22> table = [] {
        std::array<CurrencyPair, 22> t;
        auto set = [&t](int code, std::string_view hebrew, std::string_view printed) {
            t[code] = {FromUtf8(Utf8(hebrew)), FromUtf8(Utf8(printed))};
        };
        set(1, "$", "$");
        set(2, "לש", "£");
        set(3, "מג", "DM");
        set(4, "אר", "EUR");
        set(5, "פב", "BF");
        set(6, "פש", "SF");
        set(7, "פצ", "FF");
        set(8, "לא", "IL");
        set(9, "ין", "JY");
        set(19, "מ", "מ");
        set(20, "מא", "מא");
        set(21, "ש", "NIS");
        return t;
    }();
    return table;
}

constexpr int16_t kFirstCompanyCurrency = 10;
constexpr int16_t kLastCompanyCurrency = 18;

CurrencyPair CompanyCurrency(int16_t code, const CompanyRecord& company) {
    std::string name = company.currencyName(code - kFirstCompanyCurrency + 1);
    // A company record that was never read holds code 0 bytes; such a field
    // is as empty as one of spaces and must not reach a page as control bytes.
    std::string_view trimmed = Trim(name);
    if (trimmed.find_first_not_of('\0') == std::string_view::npos) {
        trimmed = {};
    }
    if (trimmed.empty()) {
        std::string number = std::to_string(code);
        return {number, number};
    }
    std::string text = LogicalText(trimmed);
    return {text, text};
}

} // namespace

std::pair<std::string, std::string> CurrencyNames(int16_t code, const CompanyRecord& company) {
    if (code >= kFirstCompanyCurrency && code <= kLastCompanyCurrency) {
        return CompanyCurrency(code, company);
    }
    const auto& table = FixedCurrencies();
    if (code < 1 || static_cast<size_t>(code) >= table.size()) {
        return {};
    }
    return table[static_cast<size_t>(code)];
}

} // namespace dovrel
