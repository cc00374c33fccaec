#pragma once

#include <string>
#include <vector>

namespace dovrel {

// One CSV record: the cells joined by commas, a cell quoted when it holds a
// comma, a quote, CR or LF (quotes inside doubled), ended by CR LF.
std::string CsvLine(const std::vector<std::string>& cells);

} // namespace dovrel
