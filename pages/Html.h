#pragma once

#include <cstdint>
#include <string>
#include <string_view>

namespace dovrel {

// The text with "&", "<", ">", '"' and "'" written as character references,
// so that data put into a page can never become markup or end an attribute.
// Works on code page 1255 bytes: every other byte is kept as it is.
std::string EscapeHtml(std::string_view text);

// A fragment that shows the characters of a text in exactly their stored
// left-to-right order whatever the browser's bidirectional layout would do:
// a right-to-left table row with the last character in its first cell.
// Spaces become "&nbsp;" cells; every other character is escaped.
std::string AsIsTable(std::string_view text);

// One right-aligned cell of a line row; an empty value shows "&nbsp;". The
// value is markup already (escaped by the caller).
std::string RightCell(std::string_view value);

// The value of the lines table's rules attribute for a position of the
// separator-lines list.
std::string RulesFor(int32_t listIndex);

// "0.00": two decimals without grouping, a leading "-" for negative values
// (-0.004 gives "-0.00").
std::string FormatFixed2(double value);

} // namespace dovrel
