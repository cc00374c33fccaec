#pragma once

#include <string>

namespace dovrel {

// An amount in the format "##,##0.00": at least one integer digit, integer
// digits grouped by three with ",", two decimals, a leading "-" for negative
// amounts. An amount exactly halfway between two cents rounds away from zero
// (0.125 gives "0.13"); an amount that rounds to zero prints "0.00", never
// "-0.00". An amount that is not a finite number is an error ("Overflow").
std::string FormatAmount(double value);

} // namespace dovrel
