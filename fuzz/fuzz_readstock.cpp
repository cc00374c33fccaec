// The document reader on an arbitrary document file. The input starts with
// control bytes, then the file's bytes:
//   row      1 byte: below 0xF0 one of the four types kept in ISHP.FIX;
//            from 0xF0 a row from 30 upward (empty rows, then rows outside
//            the table)
//   search   1 byte: which search (none, the five kinds, an unknown name,
//            a Null value)
//   value    1 byte length (0 to 15), then the search text
//   fromDate 1 byte: one of a few dates, or (from 8) the next 10 bytes
//   position 4 bytes, little-endian: PubACTLocation before each walk
// The rest is written as ISHP.FIX in a private directory.

#include "FuzzSupport.h"

#include "control/Card.h"
#include "control/ModuleState.h"
#include "platform/Messages.h"

using namespace dovrel;
using dovrel::fuzz::Bytes;
using dovrel::fuzz::Require;

namespace {

constexpr int16_t kFirstShipRow = 13; // types 20 to 23 live in ISHP.FIX

struct Request {
    int16_t row = kFirstShipRow;
    std::string searchBy;
    Variant searchValue = Variant(std::string());
    std::string fromDate;
    int32_t position = 2;
};

int16_t PickRow(uint8_t b) {
    if (b < 0xF0)
        return static_cast<int16_t>(kFirstShipRow + b % 4);
    return static_cast<int16_t>(30 + (b - 0xF0));
}

std::string PickFromDate(uint8_t b, Bytes& in) {
    static const char* const dates[] = {"",           "01/01/1980", "15/03/2024", "1/1/99",
                                        "31/12/2155", "0/0/0",      "32/13/2024", "a/b/c"};
    if (b < 8)
        return dates[b];
    return in.text(10);
}

Request ReadRequest(Bytes& in) {
    static const char* const searches[] = {"",        "AccountKey", "Reference1", "CustomerName",
                                           "ItemKey", "Details",    "Nothing",    "AccountKey"};
    Request r;
    r.row = PickRow(in.byte());
    uint8_t search = in.byte() % 8;
    r.searchBy = searches[search];
    std::string value = in.text(in.byte() % 16);
    r.searchValue = search == 7 ? Variant::Null() : Variant(value);
    r.fromDate = PickFromDate(in.byte(), in);
    r.position = in.int32();
    return r;
}

void Walk(Card& card, const std::string& dir, const Request& r, const std::string& direction,
          bool fromInput) {
    if (fromInput)
        card.PubACTLocation = r.position;
    int16_t row = r.row;
    std::string searchBy = r.searchBy;
    Variant searchValue = r.searchValue;
    std::string startFrom = direction;
    std::string fromDate = r.fromDate;
    card.ReadStock(dir, row, searchBy, searchValue, startFrom, fromDate);
    Require(card.ProgressFill.Width() == 0, "the progress bar is empty after a read");
    int16_t lines = card.shared().Doc.lineCount;
    Require(lines >= 0 && lines <= 40, "a document has 0 to 40 lines");
    Require(card.DocLines.Rows() >= 1 && card.DocLines.Cols() == 8,
            "the lines grid keeps its shape");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    Bytes in(data, size);
    Request request = ReadRequest(in);
    const std::string& dir = fuzz::PrivateDir();
    fuzz::WriteFile(dir + "/ISHP.FIX", in.rest());

    ModuleState shared;
    RecordedMessages messages;
    Card card(messages, shared);
    card.txtItemKey.setText(request.searchValue.isNull() ? "" : request.searchValue.toText());
    card.txtDetails.setText(card.txtItemKey.Text());
    const char* const walks[] = {"First", "Next", "Previous", "Last", "Next", "Previous", "Up"};
    for (size_t i = 0; i < std::size(walks); ++i)
        Walk(card, dir, request, walks[i], i < 4);
    return 0;
}
