#pragma once

#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/Document.h"
#include "fixfiles/DocumentView.h"
#include "platform/Messages.h"
#include "platform/Path.h"
#include "platform/Variant.h"

#include <cstdint>
#include <optional>
#include <string>

namespace dovrel {

constexpr size_t kDocRecordLength = 170;

// The shared data the document reader works with.
struct StockContext {
    const DocTypeTable& docTypes;
    const DocFileTable& docFiles;
    const CompanyRecord& company;
    CurrentDocument& doc;
    Messages& messages;
};

// What one walk over a document file came to.
struct StockRead {
    enum class Outcome { Found, NotFound, FileMissing, Failed };
    Outcome outcome = Outcome::NotFound;
    // The record number where the scan stopped (for a document found, its
    // last line record); 0 when the file is missing or the read failed.
    int32_t stoppedAt = 0;
    std::optional<Document> document; // when found
    std::string error;                // when failed: the description, UTF-8
};

// Finds the next document of the type in row pWizFile of the document-type
// table, walking the type's document file from the view's record position in
// the direction pStartFrom ("First", "Next", "Previous", "Last"), under the
// search (pSearchBy, pSearchValue) and the from-date text. The walk moves the
// view's record position and progress bar, reads its search boxes and fills
// the current document; it shows nothing and reports nothing.
StockRead WalkStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                    int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                    const std::string& pStartFrom, const std::string& pFromDate);

// The walk, then what the control makes of it: the document found is shown
// in the view's boxes and grid, nothing found empties them, a missing file or
// a failure is reported in a message box. Returns the record number where
// the scan stopped, or 0 when the file is missing or an error was reported.
int32_t ReadStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                  int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                  const std::string& pStartFrom, const std::string& pFromDate);

} // namespace dovrel
