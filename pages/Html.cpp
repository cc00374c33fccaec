#include "pages/Html.h"

#include "fixfiles/Formats.h"
#include "platform/Error.h"

#include <cmath>

namespace dovrel {

std::string EscapeHtml(std::string_view text) {
    std::string out;
    out.reserve(text.size());
    for (char c : text) {
        switch (c) {
        case '&': out += "&amp;"; break;
        case '<': out += "&lt;"; break;
        case '>': out += "&gt;"; break;
        case '"': out += "&quot;"; break;
        case '\'': out += "&#39;"; break;
        default: out += c; break;
        }
    }
    return out;
}

std::string AsIsTable(std::string_view text) {
    std::string out = "<table cellspacing='0' cellpadding='0' border='0' align='right' dir='rtl'>";
    out += "<tr>";
    for (size_t i = text.size(); i-- > 0;) {
        out += "<td>";
        out += text[i] == ' ' ? std::string("&nbsp;") : EscapeHtml(text.substr(i, 1));
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
    case 0: return "all";
    case 1: return "none";
    case 2: return "rows";
    case 3: return "cols";
    default: return "";
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
