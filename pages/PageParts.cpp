#include "pages/PageParts.h"

#include "fixfiles/DateSerial.h"
#include "fixfiles/TextDecoding.h"
#include "pages/Html.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/SafeFile.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

namespace dovrel {

PageContext::PageContext(const PageView& pageView, const CurrentDocument& document,
                         const PageSettings& pageSettings, CivilDate pageDay, int16_t pageMode)
    : view(pageView), doc(document), settings(pageSettings), today(pageDay), mode(pageMode) {
    int count = std::clamp<int>(doc.lineCount, 0, kMaxDocLines);
    for (int i = 1; i <= count; ++i)
        lineKeys.push_back(Trim(doc.lines[static_cast<size_t>(i)].itemKey));
}

} // namespace dovrel

namespace dovrel::page {

namespace {

std::string JoinDate(int year, int month, int day, bool monthFirst, char separator) {
    char text[32];
    int first = monthFirst ? month : day;
    int second = monthFirst ? day : month;
    std::snprintf(text, sizeof text, "%02d%c%02d%c%04d", first, separator, second, separator, year);
    return text;
}

} // namespace

std::string H(const char* utf8) {
    // A handful of short words a page, each a table lookup a character:
    // converting them as they come costs less than keeping them.
    return FromUtf8(Utf8(utf8));
}

void WriteHead(PageFile& page) {
    page.line("<HTML>");
    page.line("<HEAD>");
    page.line("<TITLE></TITLE>");
    page.line("<meta http-equiv='Content-Type' content='text/html; charset=windows-1255'>");
    page.line("<STYLE>");
}

std::string FormatToday(CivilDate today, bool monthFirst, char separator) {
    return JoinDate(today.year, today.month, today.day, monthFirst, separator);
}

std::string FormatShownDate(const std::string& text, bool monthFirst, char separator) {
    try {
        Date date = TextToDate(text);
        return JoinDate(date.year(), date.month(), date.day(), monthFirst, separator);
    } catch (const Error&) {
        return EscapeHtml(text);
    }
}

int32_t LastLineRow(const Grid& grid) {
    int32_t last = grid.Rows() - 2;
    if (last > kMaxDocLines)
        throw Error("The grid shows " + std::to_string(last) + " lines; a document holds at most " +
                    std::to_string(kMaxDocLines));
    return last;
}

const LineAmounts& AmountsOfRow(const PageContext& context, int32_t row) {
    static const LineAmounts none;
    std::string_view text = Trim(context.view.lines.TextMatrix(row, 0));
    int number = 0;
    auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size() || number < 1 ||
        number > kMaxDocLines)
        return none;
    return context.doc.amounts[static_cast<size_t>(number)];
}

const DocumentLine* LineOfRow(const PageContext& context, int32_t row) {
    std::string_view key = Trim(context.view.lines.TextMatrix(row, 1));
    for (size_t i = 0; i < context.lineKeys.size(); ++i)
        if (EqualsNoCase(context.lineKeys[i], key))
            return &context.doc.lines[i + 1];
    return nullptr;
}

std::string DrawingText(const PageContext& context, int32_t row) {
    const DocumentLine* line = LineOfRow(context, row);
    if (line == nullptr || Trim(line->picFile).empty())
        return "&nbsp;";
    const PageSettings& s = context.settings;
    return "<img src='" + EscapeHtml(JoinFolder(s.picPath, TrimCopy(line->picFile))) + "' width='" +
           EscapeHtml(s.picX) + "' height='" + EscapeHtml(s.picY) + "' border='0' align='middle'>";
}

} // namespace dovrel::page
