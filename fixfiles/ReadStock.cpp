#include "fixfiles/ReadStock.h"

#include "fixfiles/DateSerial.h"
#include "fixfiles/FieldPrefilter.h"
#include "fixfiles/Formats.h"
#include "fixfiles/ProgressBar.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <array>
#include <cmath>
#include <cstring>
#include <limits>
#include <optional>

namespace dovrel {
namespace {

using Record = std::array<unsigned char, kDocRecordLength>;

double Checked(double value) {
    if (!std::isfinite(value))
        throw Error("Overflow");
    return value;
}

std::string FixedWidth(std::string text, size_t width) {
    text.resize(width, ' ');
    return text;
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

struct Walk {
    int64_t first = 0;
    int64_t last = 0;
    int step = 1;
};

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

    int32_t run(const Path& pCompPath, int16_t pWizFile, const std::string& pStartFrom,
                const std::string& pFromDate);

private:
    struct Candidate {
        bool accepted = false;
        int64_t end = 0; // the last record the document consumed
    };

    Walk planWalk(const std::string& direction, int64_t records);
    Candidate tryDocument(RecordFile& file, const unsigned char* headerRec, int64_t at);
    bool passesHeader(const unsigned char* h, bool& matched);
    bool lineMatches(const unsigned char* rec);
    void processLine(const unsigned char* rec, uint8_t docType, bool& matched);
    void startGrid();
    void accept(const Record& header, const Record& cont, const Date& date);
    void nothingFound();
    const std::string& searchText();
    const FieldPrefilter& filterFor(std::optional<FieldPrefilter>& filter, const std::string& text);

    DocumentView& view_;
    const StockContext& ctx_;
    SearchBy searchBy_;
    const Variant& searchValue_;
    std::optional<std::string> searchText_;
    std::optional<FieldPrefilter> headerFilter_;
    std::optional<FieldPrefilter> lineFilter_;
    ProgressBar progress_;
    std::optional<Date> fromDate_;
    uint8_t code_ = 0;
    // The document being loaded.
    int accepted_ = 0;
    bool gridStarted_ = false;
    double factor_ = 1;
    double foreignSum_ = 0;
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
        filter.emplace(text);
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

std::string AccountKeyOf(const unsigned char* header) {
    return TrimCopy(LogicalText(Field(header, 2, 8)));
}

int32_t StockScan::run(const Path& pCompPath, int16_t pWizFile, const std::string& pStartFrom,
                       const std::string& pFromDate) {
    if (pWizFile < 0 || pWizFile >= kDocTypeRows)
        throw Error("Document type row " + std::to_string(pWizFile) + " is outside the table");
    const DocTypeRow& row = ctx_.docTypes[static_cast<size_t>(pWizFile)];
    // A row without a file would name only the company directory; it is
    // treated as a missing file, never opened.
    bool hasFile = row.fileNumber >= 1 && row.fileNumber <= 4;
    Path path =
        hasFile ? pCompPath.plus(ctx_.docFiles[static_cast<size_t>(row.fileNumber)]) : Path();
    if (!hasFile || !FileExists(path)) {
        ctx_.messages.show(MsgIcon::Critical, MsgButtons::Ok, FromUtf8("שגיאה"),
                           FromUtf8("קבצי מסמכים לא נמצאו"));
        return 0;
    }
    code_ = static_cast<uint8_t>(row.code);
    ctx_.doc.clearLines();
    if (pFromDate.size() >= 6)
        fromDate_ = TextToDate(pFromDate);

    RecordFile file(ResolvePath(path), kDocRecordLength);
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
    if (!found)
        nothingFound();
    progress_.reset();
    if (found)
        ctx_.doc.lineCount = static_cast<int16_t>(accepted_);
    return static_cast<int32_t>(p);
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
    throw Error("Unknown direction \"" + ToUtf8(direction) + "\"");
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
    if (fromDate_ && DateOf(cont) < *fromDate_)
        return {false, at + 1};

    // The grid is reset when the document shows its first line or is
    // accepted: most documents a search tries are rejected, and resetting
    // the grid for each would cost more than testing them.
    gridStarted_ = false;
    factor_ = (100 - DoubleAt(cont.data(), 112)) / 100;
    accepted_ = 0;
    foreignSum_ = 0;
    int64_t p = at + 1;
    for (int i = 0; i < lineRecords; ++i) {
        // Line records past the end of the file produce nothing.
        if (const unsigned char* rec = file.record(++p))
            processLine(rec, header[1], matched);
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
        return EqualsNoCase(AccountKeyOf(h), searchText());
    case SearchBy::Reference1:
        return EqualsNoCase(Trim(Field(h, 100, 5)), searchText());
    case SearchBy::CustomerName: {
        std::string_view stored = Field(h, 10, 30);
        return filterFor(headerFilter_, searchText()).mayContain(stored) &&
               ContainsNoCase(TrimCopy(LogicalText(stored)), searchText());
    }
    case SearchBy::ItemKey:
    case SearchBy::Details:
        matched = false;
        return view_.txtAccountKey.Text().empty() ||
               EqualsNoCase(view_.txtAccountKey.Text(), AccountKeyOf(h));
    }
    return true;
}

// Whether the line makes a document of an item-key or details search match.
bool StockScan::lineMatches(const unsigned char* rec) {
    if (searchBy_ == SearchBy::ItemKey) {
        std::string_view stored = Field(rec, 1, 12);
        const std::string& wanted = view_.txtItemKey.Text();
        return filterFor(lineFilter_, wanted).mayEqual(stored) &&
               EqualsNoCase(TrimCopy(LogicalText(stored)), wanted);
    }
    if (searchBy_ == SearchBy::Details) {
        std::string_view stored = Trim(Field(rec, 64, 8));
        const std::string& wanted = view_.txtDetails.Text();
        return filterFor(lineFilter_, wanted).mayContain(stored) &&
               ContainsNoCase(TrimCopy(LogicalText(stored)), wanted);
    }
    return false;
}

void StockScan::startGrid() {
    if (!gridStarted_)
        view_.InitDocLines();
    gridStarted_ = true;
}

void StockScan::processLine(const unsigned char* rec, uint8_t docType, bool& matched) {
    if (rec[93] != docType || IsHiddenLine(rec))
        return;
    if (!matched)
        matched = lineMatches(rec);
    if (!matched)
        return;
    std::string_view rawKey = Trim(Field(rec, 1, 12));
    std::string itemKey = TrimCopy(LogicalText(Field(rec, 1, 12)));
    std::string details = TrimCopy(LogicalText(Trim(Field(rec, 64, 8))));

    if (++accepted_ > kMaxDocLines)
        throw Error("The document has more than " + std::to_string(kMaxDocLines) + " lines");
    DocumentLine& line = ctx_.doc.lines[static_cast<size_t>(accepted_)];
    std::string_view description = Trim(Field(rec, 13, 40));
    if (!description.empty())
        line.descriptionVisual = VisualText(description);

    const std::string number = std::to_string(rec[162]);
    const std::string descriptionText = TrimCopy(LogicalText(Field(rec, 13, 40)));
    const char tab = '\t';
    std::string row;
    if (rawKey == "*") {
        row = number + tab + tab + descriptionText + std::string(5, tab);
    } else {
        double price = DoubleAt(rec, 108);
        double total = DoubleAt(rec, 116);
        double quantity = DoubleAt(rec, 124);
        uint8_t currency = rec[72];
        row = number + tab + itemKey + tab + descriptionText + tab + details + tab +
              PlainNumber(Checked(quantity)) + tab + FormatAmount(price) + tab +
              CurrencyNames(currency, ctx_.company).first + tab + FormatAmount(total);
        if (!itemKey.empty()) {
            int lineNumber = rec[162];
            if (lineNumber < 1 || lineNumber > kMaxDocLines)
                throw Error("Line number " + std::to_string(lineNumber) + " is outside 1 to " +
                            std::to_string(kMaxDocLines));
            double discount = Int16At(rec, 156) / 100.0;
            line.itemKey = FixedWidth(itemKey, 12);
            ctx_.doc.amounts[static_cast<size_t>(lineNumber)] = {price, currency, quantity,
                                                                 discount};
            foreignSum_ = Checked(foreignSum_ + price * quantity * (100 - discount) / 100);
        }
    }
    startGrid();
    view_.DocLines.AddItem(row, accepted_);
}

void StockScan::accept(const Record& header, const Record& cont, const Date& date) {
    const unsigned char* h = header.data();
    const unsigned char* c = cont.data();
    double discount = DoubleAt(c, 112);
    double before = DoubleAt(c, 154);
    // Everything is formatted before any box changes, so a damaged amount
    // leaves the boxes as they were.
    std::string totalVat = FormatAmount(before * factor_);
    std::string vatValue = FormatAmount(before * factor_ * DoubleAt(c, 128) / 100);
    std::string total1 = FormatAmount(DoubleAt(c, 120));
    double foreignTotal = std::fabs(discount) >= 0.01 ? foreignSum_ * factor_ : foreignSum_;
    startGrid();

    view_.txtAccountKey.setText(TrimCopy(LogicalText(Field(h, 2, 8))));
    view_.txtReference1.setText(TrimCopy(Field(h, 100, 5)));
    view_.txtCustomerName.setText(TrimCopy(LogicalText(Field(h, 10, 30))));
    view_.txtDate.setText(FormatDate(date));
    view_.txtAddress1.setText(TrimCopy(LogicalText(Field(h, 40, 30))));
    view_.txtAddress2.setText(TrimCopy(LogicalText(Field(h, 70, 30))));
    view_.txtTotalVat.setText(totalVat);
    view_.txtVatValue.setText(vatValue);
    view_.txtTotal1.setText(total1);

    DocumentHeader& dh = ctx_.doc.header;
    dh.type = h[1];
    dh.totalBeforeDiscount = before;
    dh.foreignTotal = foreignTotal;
    dh.discountPercent = discount;
    const std::string_view remarks[3] = {Trim(Field(h, 110, 48)), Trim(Field(c, 5, 48)),
                                         Trim(Field(c, 53, 48))};
    for (size_t i = 0; i < 3; ++i) {
        dh.remarksLogical[i] = LogicalText(remarks[i]);
        dh.remarksVisual[i] = VisualText(remarks[i]);
    }
    dh.customerVisual = VisualText(Trim(Field(h, 10, 30)));
    dh.address1Visual = VisualText(Trim(Field(h, 40, 30)));
    dh.address2Visual = VisualText(Trim(Field(h, 70, 30)));
    dh.warehouse = c[138];
    view_.PubPrevLocation = view_.PubACTLocation;
}

void StockScan::nothingFound() {
    for (TextBox* box : {&view_.txtAccountKey, &view_.txtReference1, &view_.txtCustomerName,
                         &view_.txtDate, &view_.txtAddress1, &view_.txtAddress2, &view_.txtTotalVat,
                         &view_.txtVatValue, &view_.txtTotal1})
        box->setText({});
    view_.InitDocLines();
    ctx_.doc.lineCount = 0;
}

} // namespace

int32_t ReadStock(DocumentView& view, const StockContext& context, const Path& pCompPath,
                  int16_t pWizFile, const std::string& pSearchBy, const Variant& pSearchValue,
                  const std::string& pStartFrom, const std::string& pFromDate) {
    try {
        StockScan scan(view, context, pSearchBy, pSearchValue);
        return scan.run(pCompPath, pWizFile, pStartFrom, pFromDate);
    } catch (const std::exception& e) {
        view.ProgressFill.setWidth(0);
        context.messages.show(MsgIcon::Critical, MsgButtons::Ok, FromUtf8("שגיאה"),
                              FromUtf8(e.what()));
        return 0;
    }
}

} // namespace dovrel
