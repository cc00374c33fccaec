#include "app/cli/ExportCommand.h"

#include "app/cli/CompanyDir.h"
#include "app/cli/ExitCode.h"
#include "platform/Error.h"
#include "platform/TerminalText.h"

#include <chrono>
#include <cstdio>
#include <fstream>
#include <ostream>

namespace dovrel {

Date ExportCommand::ParseDate(const std::string& text) {
    int day = 0, month = 0, year = 0;
    char tail = 0;
    namespace chr = std::chrono;
    if (std::sscanf(text.c_str(), "%2d/%2d/%4d%c", &day, &month, &year, &tail) != 3 || year < 100 ||
        month < 1 || day < 1 ||
        !chr::year_month_day(chr::year(year), chr::month(static_cast<unsigned>(month)),
                             chr::day(static_cast<unsigned>(day)))
             .ok())
        throw CommandError(kExitUsage, "Not a date (DD/MM/YYYY): " + text);
    return DateSerial(year, month, day);
}

ExportOptions ExportCommand::exportOptions() const {
    ExportOptions options;
    for (int16_t type : options_.types)
        if (type >= 0 && type < 256)
            options.types.set(static_cast<size_t>(type));
    if (!options_.fromDate.empty())
        options.from = ParseDate(options_.fromDate);
    if (!options_.toDate.empty())
        options.to = ParseDate(options_.toDate);
    if (options_.format == "csv")
        options.format = ExportOptions::Format::Csv;
    else if (options_.format != "jsonl")
        throw CommandError(kExitUsage, "The format is jsonl or csv, not " + options_.format);
    options.bom = options_.bom;
    return options;
}

int ExportCommand::run(std::ostream& out, std::ostream& err) {
    ExportOptions options = exportOptions();
    Path compDir(options_.compDir);
    CheckCompanyDir(compDir);
    DocumentExport exporter(options);
    int shown = -1;
    if (progress_)
        exporter.setProgress([this, &shown](int64_t done, int64_t total) {
            int percent = total > 0 ? static_cast<int>(done * 100 / total) : 100;
            if (percent != shown)
                *progress_ << "\rexport: " << percent << '%' << std::flush;
            shown = percent;
        });
    ExportSummary summary;
    if (options_.output.empty()) {
        summary = exporter.run(compDir, out);
    } else {
        std::ofstream file(options_.output, std::ios::binary | std::ios::trunc);
        if (!file)
            throw Error("Cannot write " + Path(options_.output).shown().str());
        summary = exporter.run(compDir, file);
        file.close();
        if (!file)
            throw Error("Cannot write " + Path(options_.output).shown().str());
    }
    if (progress_)
        *progress_ << "\r            \r" << std::flush;
    report(summary, err);
    if (summary.missingFiles.size() == 4)
        return kExitNotFound;
    return summary.skippedCount > 0 ? kExitSkipped : kExitDone;
}

void ExportCommand::report(const ExportSummary& summary, std::ostream& err) const {
    for (const std::string& name : summary.missingFiles)
        err << "dovrel: the company has no " << name << '\n';
    for (const SkippedDocument& skipped : summary.skipped)
        err << "dovrel: skipped a damaged document: " << skipped.file << " record "
            << skipped.record << " (type " << skipped.type
            << "): " << TerminalText(Utf8(skipped.error)) << '\n';
    if (summary.skippedCount > static_cast<int64_t>(summary.skipped.size()))
        err << "dovrel: and " << summary.skippedCount - static_cast<int64_t>(summary.skipped.size())
            << " more damaged documents\n";
    err << "dovrel: exported " << summary.documents
        << (summary.documents == 1 ? " document, " : " documents, ") << summary.lines
        << (summary.lines == 1 ? " line" : " lines");
    if (summary.skippedCount > 0)
        err << "; skipped " << summary.skippedCount << " damaged";
    err << '\n';
}

} // namespace dovrel
