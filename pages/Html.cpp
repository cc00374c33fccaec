#include "pages/Html.h"

#include "fixfiles/Formats.h"
#include "platform/Error.h"

#include <cmath>

namespace dovrel {

namespace {

constexpr std::string_view kSpecial = "&<>\"'";

void AppendEscaped(std::string& out, char c) {
    switch (c) {
    case '&':
        out += "&amp;";
        break;
    case '<':
        out += "&lt;";
        break;
    case '>':
        out += "&gt;";
        break;
    case '"':
        out += "&quot;";
        break;
    case '\'':
        out += "&#39;";
        break;
    default:
        out += c;
        break;
    }
}

} // namespace

std::string EscapeHtml(std::string_view text) {
    if (text.find_first_of(kSpecial) == std::string_view::npos)
        return std::string(text);
    std::string out;
    out.reserve(text.size() + 16);
    for (char c : text)
        AppendEscaped(out, c);
    return out;
}

std::string AsIsTable(std::string_view text) {
    std::string out;
    out.reserve(80 + text.size() * 16);
    out += "<table cellspacing='0' cellpadding='0' border='0' align='right' dir='rtl'><tr>";
    for (size_t i = text.size(); i-- > 0;) {
        out += "<td>";
        if (text[i] == ' ')
            out += "&nbsp;";
        else
            AppendEscaped(out, text[i]);
        out += "</td>";
    }
    out += "</tr></table>";
    return out;
}

std::string RightCell(std::string_view value) {
    std::string out = "<td valign='top' align='right'>";
    out += value.empty() ? std::string_view("&nbsp;") : value;
    out += "</td>";
    return out;
}

std::string RulesFor(int32_t listIndex) {
    switch (listIndex) {
    case -1:
    case 0:
        return "all";
    case 1:
        return "none";
    case 2:
        return "rows";
    case 3:
        return "cols";
    default:
        return "";
    }
}

std::string FormatFixed2(double value) {
    if (!std::isfinite(value))
        throw Error("Overflow");
    // The grouped format's digits without the separators; the sign is put
    // back even where the amount rounds to zero.
    std::string grouped = FormatAmount(std::fabs(value));
    std::string digits;
    for (char c : grouped)
        if (c != ',')
            digits += c;
    return value < 0 ? "-" + digits : digits;
}

} // namespace dovrel
