#pragma once

#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/Document.h"
#include "fixfiles/DocumentView.h"
#include "platform/Messages.h"
#include "platform/Path.h"
#include "platform/Variant.h"

#include <bitset>
#include <cstdint>
#include <memory>
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
    Utf8 error;                       // when failed: the description
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

// Every document of a set of types in one document file, in the order of the
// file, each decoded as the reader accepts it, for work over many documents
// (export, printing a batch). The file stays open for the walk, which goes on
// after the records a document took; memory does not grow with the file. A
// document that cannot be read (more lines than the control holds, an amount
// that is not a number) is given with its error, and the walk goes on after
// its records.
class DocumentWalk {
public:
    struct Step {
        enum class Kind { Document, Damaged, End };
        Kind kind = Kind::End;
        std::optional<Document> document; // a Document
        int32_t record = 0;               // the header record
        uint8_t type = 0;
        std::string error; // a Damaged document's description, UTF-8
    };
    using Types = std::bitset<256>;

    // Opens the document file at path (an error when it cannot be opened).
    // Only documents dated from `from` to `to` (when given) are taken, and
    // only headers from record `start` on.
    DocumentWalk(const Path& path, Types types, const CompanyRecord& company,
                 std::optional<Date> from = std::nullopt, std::optional<Date> to = std::nullopt,
                 int64_t start = 2);
    ~DocumentWalk();
    DocumentWalk(const DocumentWalk&) = delete;
    DocumentWalk& operator=(const DocumentWalk&) = delete;

    Step next();
    // The record the walk is at and the records of the file, for progress.
    int64_t position() const { return position_; }
    int64_t records() const { return records_; }

private:
    struct Scan;
    std::unique_ptr<Scan> scan_;
    Types types_;
    int64_t position_ = 2;
    int64_t records_ = 0;
};

} // namespace dovrel
