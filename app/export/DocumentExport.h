#pragma once

#include "fixfiles/DateSerial.h"
#include "fixfiles/ReadStock.h"
#include "platform/Path.h"

#include <cstdint>
#include <functional>
#include <iosfwd>
#include <optional>
#include <string>
#include <vector>

namespace dovrel {

struct ExportOptions {
    enum class Format { JsonLines, Csv };
    DocumentWalk::Types types; // the document type codes; none chosen takes every type
    std::optional<Date> from;
    std::optional<Date> to;
    Format format = Format::JsonLines;
    bool bom = true; // CSV only: a byte-order mark, so that spreadsheets read UTF-8
};

// A document that could not be read, and why.
struct SkippedDocument {
    std::string file; // the document file's name, UTF-8
    int32_t record = 0;
    int type = 0;
    std::string error; // UTF-8
};

struct ExportSummary {
    int64_t documents = 0;
    int64_t lines = 0;
    int64_t skippedCount = 0;
    std::vector<SkippedDocument> skipped;  // the first kMaxListed of them
    std::vector<std::string> missingFiles; // document files the company lacks, UTF-8

    static constexpr size_t kMaxListed = 1000;
};

// Writes every document of the chosen types of a company, file by file in
// the order of the files, as JSON Lines (one ExportRecord a line) or CSV (a
// header, then one row a document line). One document is held at a time. A
// damaged document is listed in the summary and left out; the rest goes on.
// A failure to write is an error.
class DocumentExport {
public:
    // Records walked so far and records of all the files to walk.
    using Progress = std::function<void(int64_t done, int64_t total)>;

    explicit DocumentExport(ExportOptions options) : options_(std::move(options)) {}
    void setProgress(Progress progress) { progress_ = std::move(progress); }

    ExportSummary run(const Path& compDir, std::ostream& out);

private:
    void writeHeader(std::ostream& out) const;
    void write(const Document& document, std::ostream& out, ExportSummary& summary) const;

    ExportOptions options_;
    Progress progress_;
};

} // namespace dovrel
