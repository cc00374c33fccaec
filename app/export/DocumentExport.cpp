#include "app/export/DocumentExport.h"

#include "app/export/Csv.h"
#include "app/export/ExportRecord.h"
#include "app/export/ItemCategories.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/DocTypes.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <ostream>

#include <sys/stat.h>

namespace dovrel {

namespace {

// The files to walk: those holding a chosen type, each with its chosen types.
struct FileToWalk {
    Path path;
    std::string name; // as in the file table, UTF-8
    DocumentWalk::Types types;
};

std::vector<FileToWalk> FilesToWalk(const Path& compDir, const DocumentWalk::Types& chosen) {
    DocTypeTable types;
    DocFileTable files;
    InitDocTypes(types, files);
    std::vector<FileToWalk> walks;
    for (size_t number = 1; number < files.size(); ++number) {
        FileToWalk walk{compDir.plus(files[number]), files[number].substr(1), {}};
        for (const DocTypeRow& row : types)
            if (row.fileNumber == static_cast<int16_t>(number) && !row.hebrewTitle.empty() &&
                (chosen.none() || chosen.test(static_cast<size_t>(row.code))))
                walk.types.set(static_cast<size_t>(row.code));
        if (walk.types.any())
            walks.push_back(std::move(walk));
    }
    return walks;
}

int64_t RecordsOf(const Path& path) {
    struct stat info {};
    if (::stat(path.c_str(), &info) != 0)
        return 0;
    return static_cast<int64_t>(info.st_size) / static_cast<int64_t>(kDocRecordLength);
}

void CheckWritten(const std::ostream& out) {
    if (!out)
        throw Error("Cannot write the export");
}

} // namespace

ExportSummary DocumentExport::run(const Path& compDir, std::ostream& out) {
    ExportSummary summary;
    CompanyRecord company;
    ReadAdf(compDir, company);
    ItemCategories categories(compDir);
    std::vector<FileToWalk> walks = FilesToWalk(compDir, options_.types);
    int64_t total = 0;
    for (FileToWalk& walk : walks) {
        if (!FileExists(walk.path)) {
            summary.missingFiles.push_back(walk.name);
            walk.types.reset();
            continue;
        }
        walk.path = ResolvePath(walk.path);
        total += RecordsOf(walk.path);
    }
    writeHeader(out);
    int64_t done = 0;
    for (const FileToWalk& file : walks) {
        if (file.types.none())
            continue;
        DocumentWalk walk(file.path, file.types, company, options_.from, options_.to);
        for (DocumentWalk::Step step = walk.next(); step.kind != DocumentWalk::Step::Kind::End;
             step = walk.next()) {
            if (step.kind == DocumentWalk::Step::Kind::Damaged) {
                if (summary.skipped.size() < ExportSummary::kMaxListed)
                    summary.skipped.push_back({file.name, step.record, step.type, step.error});
                ++summary.skippedCount;
            } else {
                categories.apply(*step.document);
                write(*step.document, out, summary);
            }
            if (progress_)
                progress_(done + std::min(walk.position(), walk.records()), total);
        }
        done += walk.records();
    }
    out.flush();
    CheckWritten(out);
    if (progress_)
        progress_(total, total);
    return summary;
}

void DocumentExport::writeHeader(std::ostream& out) const {
    if (options_.format != ExportOptions::Format::Csv)
        return;
    if (options_.bom)
        out << "\xEF\xBB\xBF";
    out << CsvLine(ExportRecord::CsvColumns());
    CheckWritten(out);
}

void DocumentExport::write(const Document& document, std::ostream& out,
                           ExportSummary& summary) const {
    nlohmann::ordered_json record = ExportRecord::Json(document);
    if (options_.format == ExportOptions::Format::Csv) {
        for (const auto& row : ExportRecord::CsvRows(record))
            out << CsvLine(row);
    } else {
        out << record.dump() << '\n';
    }
    CheckWritten(out);
    ++summary.documents;
    summary.lines += static_cast<int64_t>(document.lines.size());
}

} // namespace dovrel
