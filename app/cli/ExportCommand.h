#pragma once

#include "app/export/DocumentExport.h"

#include <cstdint>
#include <iosfwd>
#include <string>
#include <vector>

namespace dovrel {

struct ExportCliOptions {
    std::string compDir;        // UTF-8, as typed
    std::vector<int16_t> types; // none: every type
    std::string fromDate;       // DD/MM/YYYY, or empty
    std::string toDate;
    std::string format = "jsonl"; // "jsonl" or "csv"
    std::string output;           // a file; empty for standard output
    bool bom = true;
};

// `dovrel export`: every document of the chosen types of a company as JSON
// Lines or CSV, with progress on a terminal and a summary at the end.
class ExportCommand {
public:
    explicit ExportCommand(ExportCliOptions options) : options_(std::move(options)) {}

    // Exit code: 0 when every document was written, 4 when damaged ones were
    // skipped, 3 when the company has none of the document files.
    int run(std::ostream& out, std::ostream& err);
    // Shows the progress on a terminal ("\r" and a percentage).
    void setProgress(std::ostream* terminal) { progress_ = terminal; }

    // "DD/MM/YYYY" (or D/M/YYYY), a day of the calendar; an error otherwise.
    static Date ParseDate(const std::string& text);

private:
    ExportOptions exportOptions() const;
    void report(const ExportSummary& summary, std::ostream& err) const;

    ExportCliOptions options_;
    std::ostream* progress_ = nullptr;
};

} // namespace dovrel
