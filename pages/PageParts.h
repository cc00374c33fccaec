#pragma once

#include "pages/DocumentPage.h"

#include <string>
#include <string_view>

// Pieces both document pages share.
namespace dovrel::page {

// A code page 1255 text from a UTF-8 string literal.
std::string H(const char* utf8);

// The five lines every page starts with, before its style block.
void WriteHead(PageFile& page);

// Today's date, day/month/year or month/day/year with the separator given.
std::string FormatToday(CivilDate today, bool monthFirst, char separator);
// The date box read as a day/month/year date and written again in the order
// given; a text that is not a date is kept (escaped).
std::string FormatShownDate(const std::string& text, bool monthFirst, char separator);

// The grid rows that hold document lines: 1 to Rows - 2. More rows than the
// document can hold is an error.
int32_t LastLineRow(const Grid& grid);
// The amounts of the line shown in a grid row, found by the row's own line
// number (column 0); a row without a valid line number has none.
const LineAmounts& AmountsOfRow(const PageContext& context, int32_t row);
// The first document line whose item key is the one in the row's item
// column, compared trimmed and without regard to case; nullptr when none.
const DocumentLine* LineOfRow(const PageContext& context, int32_t row);
// The drawing cell's text of a row: its picture, or "&nbsp;".
std::string DrawingText(const PageContext& context, int32_t row);

} // namespace dovrel::page
