#include "fixfiles/ReadStock.h"

#include "fixfiles/DateSerial.h"
#include "fixfiles/FieldPrefilter.h"
#include "fixfiles/ProgressBar.h"
#include "fixfiles/ReadingOrder.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/Messages.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstring>
#include <limits>
#include <optional>
#include <tuple>
#include <utility>
#include <vector>

namespace dovrel {
namespace {

using Record = std::array<unsigned char, kDocRecordLength>;

double Checked(double value) {
    if (!std::isfinite(value))
        throw Error("Overflow");
    return value;
}

enum class SearchBy { None, AccountKey, Reference1, CustomerName, ItemKey, Details };

SearchBy ParseSearchBy(const std::string& name) {
    static const std::pair<const char*, SearchBy> names[] = {
        {"AccountKey", SearchBy::AccountKey},
        {"Reference1", SearchBy::Reference1},
        {"CustomerName", SearchBy::CustomerName},
        {"ItemKey", SearchBy::ItemKey},
        {"Details", SearchBy::Details}};
    for (const auto& [text, by] : names)
        if (EqualsNoCase(name, text))
            return by;
    return SearchBy::None;
}

// The characters a prefilter may insist on. Reading order mirrors brackets,
// so a bracket of the text may come from its twin in the field: brackets are
// left to the comparison itself.
std::string PrefilterText(std::string text, bool reading) {
    if (reading)
        for (char& c : text)
            if (std::string_view("()[]{}<>").find(c) != std::string_view::npos)
                c = ' ';
    return text;
}

struct Walk {
    int64_t first = 0;
    int64_t last = 0;
    int step = 1;
};

StockRead Ended(StockRead::Outcome outcome, int32_t stoppedAt = 0) {
    StockRead read;
    read.outcome = outcome;
    read.stoppedAt = stoppedAt;
    return read;
}

// One read: the walk over the document file and the loading of the document
// it finds. Documents and lines are copied out of the file's block before they
// are decoded further, since the next record read may replace the block.
// A walk may test millions of records, so a record is decoded only as far as
// its test needs, and a searched field is decoded only when a FieldPrefilter
// says it may match.
class StockScan {
public:
    StockScan(DocumentView& view, const StockContext& context, const std::string& pSearchBy,
              const Variant& pSearchValue)
        : view_(view), ctx_(context), searchBy_(ParseSearchBy(pSearchBy)),
          searchValue_(pSearchValue), progress_{view.ProgressFrame, view.ProgressFill} {}

    StockRead run(const Path& pCompPath, int16_t pWizFile, const std::string& pStartFrom,
                  const std::string& pFromDate);

    struct Candidate {
        bool accepted = false;
        int64_t end = 0; // the last record the document consumed
    };

    // For a walk over every document of a file: the file and the dates that
    // bound the documents taken.
    void prepareWalk(const Path& file, std::optional<Date> from, std::optional<Date> to) {
        file_ = file;
        fromDate_ = from;
        toDate_ = to;
    }
    // Tries the header at record `at`, as the view's record position; the
    // document accepted is then taken with takeFound.
    Candidate tryAt(RecordFile& file, const unsigned char* headerRec, int64_t at) {
        view_.PubACTLocation = static_cast<int32_t>(at);
        return tryDocument(file, headerRec, at);
    }
    std::optional<Document> takeFound() { return std::exchange(found_, std::nullopt); }

private:
    Walk planWalk(const std::string& direction, int64_t records);
    Candidate tryDocument(RecordFile& file, const unsigned char* headerRec, int64_t at);
    bool passesHeader(const unsigned char* h, bool& matched);
    bool lineMatches(const unsigned char* rec);
    bool anyLineMatches(RecordFile& file, int64_t cont, int lineRecords, uint8_t docType);
    void processLine(const unsigned char* rec, uint8_t docType);
    void accept(const Record& header, const Record& cont, const Date& date);
    const std::string& searchText();
    const FieldPrefilter& filterFor(std::optional<FieldPrefilter>& filter, const std::string& text);
    bool reading() const { return view_.ReadingOrder() != 0; }

    DocumentView& view_;
    const StockContext& ctx_;
    SearchBy searchBy_;
    const Variant& searchValue_;
    std::optional<std::string> searchText_;
    std::optional<FieldPrefilter> headerFilter_;
    std::optional<FieldPrefilter> lineFilter_;
    ProgressBar progress_;
    std::optional<Date> fromDate_;
    std::optional<Date> toDate_;
    uint8_t code_ = 0;
    Path file_;
    // The document being loaded.
    int accepted_ = 0;
    std::vector<Document::Line> lines_;
    double factor_ = 1;
    double foreignSum_ = 0;
    std::optional<Document> found_;
    std::optional<Document> company_; // only its company title and currency names
};

const std::string& StockScan::searchText() {
    if (!searchText_)
        searchText_ = searchValue_.toText();
    return *searchText_;
}

// Made on first use, like the search text, so that a search whose value
// cannot be read fails only when a document is tested against it.
const FieldPrefilter& StockScan::filterFor(std::optional<FieldPrefilter>& filter,
                                           const std::string& text) {
    if (!filter)
        filter.emplace(PrefilterText(text, reading()));
    return *filter;
}

// The document date of a continuation record. Worked out only where it is
// used: a search tries many documents that neither the date nor the page needs.
Date DateOf(const std::array<unsigned char, kDocRecordLength>& cont) {
    return DateSerial(cont[102] + 1900, cont[103], cont[104]);
}

// Whether the item key field, trimmed, is "#". Asked of every line a search
// meets, so it looks at the bytes instead of trimming: a key that starts
// with anything but a space or "#" is answered at once.
bool IsHiddenLine(const unsigned char* rec) {
    bool hash = false;
    for (size_t i = 1; i <= 12; ++i) {
        if (rec[i] == ' ')
            continue;
        if (rec[i] != '#' || hash)
            return false;
        hash = true;
    }
    return hash;
}

// The text a search compares: as the control shows the field, trimmed.
std::string SearchedText(std::string_view field, bool reading) {
    return reading ? ReadingOrderText(field) : TrimCopy(LogicalText(field));
}

std::string AccountKeyOf(const unsigned char* header, bool reading = false) {
    return SearchedText(Field(header, 2, 8), reading);
}

// A text field as stored (trimmed), as the control shows it and as people
// read it.
DocumentText TextOf(std::string_view field) {
    return {MappedLetters(Trim(field)), TrimCopy(LogicalText(field)), ReadingOrderText(field)};
}

// The company's title and currency names; bytes of code 0 (a record never
// read) count as spaces.
void TakeCompany(Document& doc, const CompanyRecord& company) {
    auto blank = [](std::string text) {
        std::replace(text.begin(), text.end(), '\0', ' ');
        return text;
    };
    doc.companyTitle = TextOf(blank(company.title()));
    for (size_t i = 0; i < doc.currencyNames.size(); ++i) {
        auto code = static_cast<int16_t>(10 + i);
        std::string name = blank(company.currencyName(code - 9));
        doc.currencyNames[i] = {MappedLetters(Trim(name)), CurrencyNames(code, company).first,
                                ReadingOrderText(name)};
    }
}

// One line record. The amounts of a text-only line are not examined.
Document::Line LineOf(const unsigned char* rec, const CompanyRecord& company) {
    Document::Line line;
    line.lineNumber = rec[162];
    line.textOnly = Trim(Field(rec, 1, 12)) == "*";
    line.itemKey = TextOf(Field(rec, 1, 12));
    line.description = TextOf(Field(rec, 13, 40));
    line.details = TextOf(Trim(Field(rec, 64, 8)));
    if (line.textOnly)
        return line;
    // Checked here, so that showing the line cannot fail.
    line.quantity = Checked(DoubleAt(rec, 124));
    line.price = Checked(DoubleAt(rec, 108));
    line.total = Checked(DoubleAt(rec, 116));
    line.currency = rec[72];
    std::tie(line.currencyName, line.currencyPrinted) = CurrencyNames(line.currency, company);
    line.discount = Int16At(rec, 156) / 100.0;
    if (!line.itemKey.logical.empty() && (line.lineNumber < 1 || line.lineNumber > kMaxDocLines))
        throw Error("Line number " + std::to_string(line.lineNumber) + " is outside 1 to " +
                    std::to_string(kMaxDocLines));
    return line;
}

StockRead StockScan::run(const Path& pCompPath, int16_t pWizFile, const std::string& pStartFrom,
                         const std::string& pFromDate) {
    if (pWizFile < 0 || pWizFile >= kDocTypeRows)
        throw Error("Document type row " + std::to_string(pWizFile) + " is outside the table");
    const DocTypeRow& row = ctx_.docTypes[static_cast<size_t>(pWizFile)];
    // A row without a file would name only the company directory; it is
    // treated as a missing file, never opened.
    bool hasFile = row.fileNumber >= 1 && row.fileNumber <= 4;
    Path path =
        hasFile ? pCompPath.plus(ctx_.docFiles[static_cast<size_t>(row.fileNumber)]) : Path();
    if (!hasFile || !FileExists(path))
        return Ended(StockRead::Outcome::FileMissing);
    code_ = static_cast<uint8_t>(row.code);
    ctx_.doc.clearLines();
    if (pFromDate.size() >= 6)
        fromDate_ = TextToDate(pFromDate);

    file_ = ResolvePath(path);
    RecordFile file(file_, kDocRecordLength);
    double exact = static_cast<double>(file.length()) / kDocRecordLength;
    auto records = static_cast<int64_t>(std::nearbyint(exact));
    if (records > std::numeric_limits<int32_t>::max() - 1024)
        throw Error("The document file " + file.path() + " is too large");
    Walk walk = planWalk(pStartFrom, records);

    progress_.reset();
    int64_t p = walk.first;
    bool found = false;
    while (walk.step > 0 ? p <= walk.last : p >= walk.last) {
        const unsigned char* rec = file.record(p);
        view_.PubACTLocation = static_cast<int32_t>(p);
        if (rec != nullptr && rec[0] == 1 && rec[1] == code_) {
            Candidate doc = tryDocument(file, rec, p);
            if (doc.accepted) {
                found = true;
                p = doc.end;
                break;
            }
            // Forward, the walk goes on after the records the document took;
            // backward, before its header, so no header is ever tested twice.
            if (walk.step > 0)
                p = doc.end;
        }
        if (p % 5 == 0)
            progress_.show(std::min(p, records), records);
        p += walk.step;
    }
    ctx_.doc.lineCount = static_cast<int16_t>(found ? accepted_ : 0);
    StockRead read = Ended(found ? StockRead::Outcome::Found : StockRead::Outcome::NotFound,
                           static_cast<int32_t>(p));
    read.document = std::move(found_);
    return read;
}

Walk StockScan::planWalk(const std::string& direction, int64_t records) {
    int64_t position = view_.PubACTLocation;
    if (EqualsNoCase(direction, "First")) {
        view_.PubACTLocation = 2;
        return {2, records, 1};
    }
    if (EqualsNoCase(direction, "Next")) {
        // An empty file has no last record to stop at; the walk finds nothing.
        int64_t next = records == 0 && position >= 0 ? 1 : std::min(position + 1, records);
        view_.PubACTLocation = static_cast<int32_t>(next);
        return {next, records, 1};
    }
    // Records past the end of the file hold nothing, so a backward walk from
    // far beyond it starts at the last record (and takes no time getting there).
    if (EqualsNoCase(direction, "Previous"))
        return {std::min(position - 1, records), 2, -1};
    if (EqualsNoCase(direction, "Last")) {
        view_.PubACTLocation = static_cast<int32_t>(records);
        return {records, 2, -1};
    }
    throw Error("Unknown direction \"" + ToUtf8(direction).str() + "\"");
}

StockScan::Candidate StockScan::tryDocument(RecordFile& file, const unsigned char* headerRec,
                                            int64_t at) {
    // Tested where it lies, copied only when it passes: most headers of a
    // search fail.
    bool matched = false;
    if (!passesHeader(headerRec, matched))
        return {false, at};
    Record header;
    std::memcpy(header.data(), headerRec, header.size());
    int lineRecords = header[158];

    // A header whose continuation record is not in the file yet is a document
    // still being written; it is passed over.
    const unsigned char* contRec = file.record(at + 1);
    if (contRec == nullptr)
        return {false, at + 1};
    Record cont;
    std::memcpy(cont.data(), contRec, cont.size());
    if ((fromDate_ && DateOf(cont) < *fromDate_) || (toDate_ && DateOf(cont) > *toDate_))
        return {false, at + 1};

    // A line search looks for its line first; the document it finds is then
    // shown whole, from its first line.
    if (!matched && !anyLineMatches(file, at + 1, lineRecords, header[1]))
        return {false, at + 1 + lineRecords};
    lines_.clear();
    factor_ = (100 - DoubleAt(cont.data(), 112)) / 100;
    accepted_ = 0;
    foreignSum_ = 0;
    int64_t p = at + 1;
    for (int i = 0; i < lineRecords; ++i) {
        // Line records past the end of the file produce nothing.
        if (const unsigned char* rec = file.record(++p)) {
            // Asked again, as a writer may have changed the lines meanwhile.
            if (!matched)
                matched = rec[93] == header[1] && !IsHiddenLine(rec) && lineMatches(rec);
            processLine(rec, header[1]);
        }
    }
    if (!matched)
        return {false, p};
    accept(header, cont, DateOf(cont));
    return {true, p};
}

bool StockScan::passesHeader(const unsigned char* h, bool& matched) {
    matched = true;
    switch (searchBy_) {
    case SearchBy::None:
        return true;
    case SearchBy::AccountKey:
        return EqualsNoCase(AccountKeyOf(h, reading()), searchText());
    case SearchBy::Reference1: {
        std::string_view stored = Field(h, 100, 5);
        return EqualsNoCase(reading() ? ReadingOrderText(stored) : std::string(Trim(stored)),
                            searchText());
    }
    case SearchBy::CustomerName: {
        std::string_view stored = Field(h, 10, 30);
        return filterFor(headerFilter_, searchText()).mayContain(stored) &&
               ContainsNoCase(SearchedText(stored, reading()), searchText());
    }
    case SearchBy::ItemKey:
    case SearchBy::Details:
        matched = false;
        return view_.txtAccountKey.Text().empty() ||
               EqualsNoCase(view_.txtAccountKey.Text(), AccountKeyOf(h, reading()));
    }
    return true;
}

// Whether the line makes a document of an item-key or details search match.
bool StockScan::lineMatches(const unsigned char* rec) {
    if (searchBy_ == SearchBy::ItemKey) {
        std::string_view stored = Field(rec, 1, 12);
        const std::string& wanted = view_.txtItemKey.Text();
        return filterFor(lineFilter_, wanted).mayEqual(stored) &&
               EqualsNoCase(SearchedText(stored, reading()), wanted);
    }
    if (searchBy_ == SearchBy::Details) {
        std::string_view stored = Trim(Field(rec, 64, 8));
        const std::string& wanted = view_.txtDetails.Text();
        return filterFor(lineFilter_, wanted).mayContain(stored) &&
               ContainsNoCase(SearchedText(stored, reading()), wanted);
    }
    return false;
}

bool StockScan::anyLineMatches(RecordFile& file, int64_t cont, int lineRecords, uint8_t docType) {
    for (int64_t p = cont + 1; p <= cont + lineRecords; ++p) {
        const unsigned char* rec = file.record(p);
        if (rec != nullptr && rec[93] == docType && !IsHiddenLine(rec) && lineMatches(rec))
            return true;
    }
    return false;
}

void StockScan::processLine(const unsigned char* rec, uint8_t docType) {
    if (rec[93] != docType || IsHiddenLine(rec))
        return;
    if (++accepted_ > kMaxDocLines)
        throw Error("The document has more than " + std::to_string(kMaxDocLines) + " lines");
    Document::Line line = LineOf(rec, ctx_.company);
    if (!line.textOnly && !line.itemKey.logical.empty())
        foreignSum_ =
            Checked(foreignSum_ + line.price * line.quantity * (100 - line.discount) / 100);
    StoreLine(ctx_.doc, static_cast<size_t>(accepted_), line);
    lines_.push_back(std::move(line));
}

void StockScan::accept(const Record& header, const Record& cont, const Date& date) {
    const unsigned char* h = header.data();
    const unsigned char* c = cont.data();
    Document doc;
    doc.type = h[1];
    doc.file = file_;
    doc.record = view_.PubACTLocation;
    doc.accountKey = TextOf(Field(h, 2, 8));
    doc.reference = {MappedLetters(Trim(Field(h, 100, 5))), TrimCopy(Field(h, 100, 5)),
                     ReadingOrderText(Field(h, 100, 5))};
    doc.customer = TextOf(Field(h, 10, 30));
    doc.address1 = TextOf(Field(h, 40, 30));
    doc.address2 = TextOf(Field(h, 70, 30));
    doc.date = date;
    const std::string_view remarks[3] = {Trim(Field(h, 110, 48)), Trim(Field(c, 5, 48)),
                                         Trim(Field(c, 53, 48))};
    for (size_t i = 0; i < 3; ++i)
        doc.remarks[i] = {MappedLetters(remarks[i]), LogicalText(remarks[i]),
                          ReadingOrderText(remarks[i])};
    doc.warehouse = c[138];
    doc.discountPercent = DoubleAt(c, 112);
    doc.vatPercent = DoubleAt(c, 128);
    // Checked before anything changes, so that a damaged amount leaves the
    // current document as it was and showing the totals cannot fail.
    Document::Totals& totals = doc.totals;
    totals.beforeDiscount = DoubleAt(c, 154);
    totals.beforeVat = Checked(totals.beforeDiscount * factor_);
    totals.vat = Checked(totals.beforeDiscount * factor_ * doc.vatPercent / 100);
    totals.withVat = Checked(DoubleAt(c, 120));
    totals.foreign = std::fabs(doc.discountPercent) >= 0.01 ? foreignSum_ * factor_ : foreignSum_;
    doc.lines = std::move(lines_);
    // The company's texts are the same for every document of a walk.
    if (!company_)
        TakeCompany(company_.emplace(), ctx_.company);
    doc.companyTitle = company_->companyTitle;
    doc.currencyNames = company_->currencyNames;

    StoreHeader(ctx_.doc.header, doc);
    view_.PubPrevLocation = view_.PubACTLocation;
    found_ = std::move(doc);
}

} // namespace

StockRead WalkStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                    int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                    const std::string& pStartFrom, const std::string& pFromDate) {
    try {
        StockScan scan(view, context, pSearchBy, pSearchValue);
        return scan.run(pCompPath, pWizFile, pStartFrom, pFromDate);
    } catch (const std::exception& e) {
        StockRead failed = Ended(StockRead::Outcome::Failed);
        failed.error = ErrorText(e);
        return failed;
    }
}

int32_t ReadStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                  int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                  const std::string& pStartFrom, const std::string& pFromDate) {
    StockRead read = WalkStock(view, context, pCompPath, pWizFile, pSearchBy, pSearchValue,
                               pStartFrom, pFromDate);
    switch (read.outcome) {
    case StockRead::Outcome::Found:
        view.showDocument(std::move(*read.document));
        break;
    case StockRead::Outcome::NotFound:
        view.showNothing();
        break;
    case StockRead::Outcome::FileMissing:
        context.messages.show(MsgIcon::Critical, MsgButtons::Ok, Utf8("שגיאה"),
                              Utf8("קבצי מסמכים לא נמצאו"));
        return 0;
    case StockRead::Outcome::Failed:
        view.ProgressFill.setWidth(0);
        context.messages.show(MsgIcon::Critical, MsgButtons::Ok, Utf8("שגיאה"), read.error);
        return 0;
    }
    view.ProgressFill.setWidth(0);
    return read.stoppedAt;
}

// What a walk holds: a view and a current document of its own, which nobody
// sees, the file and the scan that decodes the documents.
struct DocumentWalk::Scan {
    Scan(const Path& path, const CompanyRecord& company)
        : context{types, files, company, current, messages}, file(path, kDocRecordLength),
          scan(view, context, std::string(), none) {}

    DocTypeTable types;
    DocFileTable files;
    CurrentDocument current;
    RecordedMessages messages;
    StockContext context;
    DocumentView view;
    RecordFile file;
    Variant none = Variant(std::string());
    StockScan scan;
};

DocumentWalk::DocumentWalk(const Path& path, Types types, const CompanyRecord& company,
                           std::optional<Date> from, std::optional<Date> to, int64_t start)
    : scan_(std::make_unique<Scan>(path, company)), types_(types),
      position_(std::max<int64_t>(start, 1)) {
    scan_->scan.prepareWalk(path, from, to);
    double exact = static_cast<double>(scan_->file.length()) / kDocRecordLength;
    records_ = static_cast<int64_t>(std::nearbyint(exact));
}

DocumentWalk::~DocumentWalk() = default;

DocumentWalk::Step DocumentWalk::next() {
    Step step;
    while (position_ <= records_) {
        int64_t at = position_++;
        const unsigned char* rec = scan_->file.record(at);
        if (rec == nullptr || rec[0] != 1 || !types_.test(rec[1]))
            continue;
        // The walk goes on after the document's records, whatever came of it:
        // its line records are never taken for headers.
        position_ = at + 2 + rec[158];
        step.record = static_cast<int32_t>(at);
        step.type = rec[1];
        try {
            if (!scan_->scan.tryAt(scan_->file, rec, at).accepted)
                continue;
            step.kind = Step::Kind::Document;
            step.document = scan_->scan.takeFound();
        } catch (const std::exception& e) {
            step.kind = Step::Kind::Damaged;
            step.error = e.what();
        }
        return step;
    }
    return {};
}

} // namespace dovrel
