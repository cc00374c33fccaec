#pragma once

#include "control/Card.h"
#include "control/ModuleState.h"

#include <cstdint>
#include <iosfwd>
#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

struct ShowOptions {
    std::string compDir; // UTF-8, as typed
    int16_t type = 20;   // document type code
    int32_t start = 2;   // first record to look at, 1 or more
    bool json = false;
};

// `dovrel show`: reads the first document of a type at or after a record, as
// the control's ShowDoc does, and prints the document the control shows for a
// person (UTF-8, reading order) or as JSON, one record of `dovrel export`.
class ShowCommand {
public:
    ShowCommand(ShowOptions options, ModuleState& shared);

    // Exit code: 0 when the document was printed, 1 when the reader showed a
    // message box (printed on err), 3 when there is no such document.
    int run(std::ostream& out, std::ostream& err);
    // Shows the progress of the file scan on a terminal ("\r" and a percentage).
    void setProgress(std::ostream* terminal) { progress_ = terminal; }

    // Display width of UTF-8 text in a terminal: its code points.
    static size_t DisplayWidth(std::string_view utf8);

private:
    void read(Card& card);
    void watchProgress(Card& card);
    void printJson(Document document, const Path& compDir, std::ostream& out) const;
    void printDocument(const Card& card, std::ostream& out) const;
    void printHeader(const Document& document, std::ostream& out) const;
    void printLines(const Grid& grid, const Document& document, std::ostream& out) const;
    void printTotals(const Document& document, std::ostream& out) const;
    void printRemarks(const Document& document, std::ostream& out) const;

    ShowOptions options_;
    ModuleState& shared_;
    std::string compPath_;
    int16_t row_ = 0;
    std::ostream* progress_ = nullptr;
    Connection progressShown_;
};

} // namespace dovrel
