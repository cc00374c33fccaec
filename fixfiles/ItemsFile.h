#pragma once

#include "fixfiles/CurrentDocument.h"
#include "fixfiles/ProgressBar.h"
#include "platform/Path.h"

#include <string>

namespace dovrel {

constexpr size_t kItmRecordLength = 500;

// Gives the lines of the current document their items' category codes and
// foreign names from CompPath\ITM.fix. True when the whole file was read;
// a file that becomes shorter during the scan ends it early, still true, with
// the items read so far applied. A missing or unreadable file raises an error
// before anything is touched.
bool ReadITM(const Path& CompPath, CurrentDocument& doc, ProgressBar progress);

// The last record ReadITM and ReadACT read: (length / record length) - 1,
// rounded to the nearest whole number, halves to even. Records 2 up to it are
// read; record 1 and the file's last record are not.
int64_t LastScanRecord(int64_t fileLength, size_t recordLength);

} // namespace dovrel
