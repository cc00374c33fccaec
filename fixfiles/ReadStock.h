#pragma once

#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/DocumentView.h"
#include "platform/Messages.h"
#include "platform/Path.h"
#include "platform/Variant.h"

#include <cstdint>
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

// Finds the next document of the type in row pWizFile of the document-type
// table, walking the type's document file from the view's record position in
// the direction pStartFrom ("First", "Next", "Previous", "Last"), under the
// search (pSearchBy, pSearchValue) and the from-date text. The document found
// fills the view's boxes and grid and the current document. Returns the record
// number where the scan stopped, or 0 when the file is missing or an error was
// reported in a message box.
int32_t ReadStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                  int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                  const std::string& pStartFrom, const std::string& pFromDate);

} // namespace dovrel
