#include "app/cli/PicturesCommand.h"

#include "app/cli/ExitCode.h"
#include "app/session/StateJson.h"
#include "pictures/PictureLookup.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/SafeFile.h"
#include "platform/TerminalText.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <charconv>
#include <ostream>
#include <sstream>
#include <utility>

namespace dovrel {

namespace {

// A CSV file of the most ranges the settings can list, every field quoted and
// of the longest UTF-8, is below this.
constexpr size_t kMaxCsvBytes = 32 * 1024 * 1024;

constexpr const char* kFields[] = {"FromItemKey", "ToItemKey", "FromCatCode", "ToCatCode",
                                   "PicFile"};

std::optional<std::string> PictureRange::*const kMembers[] = {
    &PictureRange::FromItemKey, &PictureRange::ToItemKey, &PictureRange::FromCatCode,
    &PictureRange::ToCatCode, &PictureRange::PicFile};

std::optional<std::string> NullWhenEmpty(const std::string& text) {
    return text.empty() ? std::nullopt : std::optional<std::string>(text);
}

// A range from the five texts as the settings form takes its cells: an empty
// lower bound is open, the rest is kept as typed (so an empty one is refused).
PictureRange RangeOfCells(const std::vector<std::string>& utf8) {
    PictureRange range;
    for (size_t i = 0; i < 5; ++i)
        range.*kMembers[i] = FromUtf8(Utf8(utf8[i]));
    range.FromItemKey = NullWhenEmpty(*range.FromItemKey);
    range.FromCatCode = NullWhenEmpty(*range.FromCatCode);
    return range;
}

// A range from the five cells of a CSV record: an empty cell is no value
// (Null), as an export writes it.
PictureRange RangeOfRecord(const std::vector<std::string>& utf8) {
    PictureRange range;
    for (size_t i = 0; i < 5; ++i)
        range.*kMembers[i] = NullWhenEmpty(FromUtf8(Utf8(utf8[i])));
    return range;
}

// Where each of the five fields is in the records: by the heading's names
// when the first record is a heading (which is then removed), else in the
// export's order.
std::vector<size_t> TakeColumns(std::vector<std::vector<std::string>>& records,
                                const std::string& file) {
    std::vector<size_t> columns = {0, 1, 2, 3, 4};
    if (records.empty())
        return columns;
    const std::vector<std::string>& heading = records.front();
    auto named = [&](size_t field) {
        return std::find(heading.begin(), heading.end(), kFields[field]) - heading.begin();
    };
    bool isHeading = false;
    for (size_t field = 0; field < 5; ++field)
        isHeading = isHeading || static_cast<size_t>(named(field)) < heading.size();
    if (!isHeading)
        return columns;
    for (size_t field = 0; field < 5; ++field) {
        columns[field] = static_cast<size_t>(named(field));
        if (columns[field] >= heading.size())
            throw Error(file + ": the heading has no column " + kFields[field] +
                        "; nothing was changed");
    }
    if (heading.size() != 5)
        throw Error(file + ": the heading has " + std::to_string(heading.size()) +
                    " columns, not the five picture fields; nothing was changed");
    records.erase(records.begin());
    return columns;
}

std::string CsvField(const std::string& utf8) {
    if (utf8.find_first_of(",\"\r\n") == std::string::npos)
        return utf8;
    std::string quoted = "\"";
    for (char c : utf8)
        quoted += c == '"' ? std::string("\"\"") : std::string(1, c);
    return quoted + '"';
}

// The records of a CSV text: fields separated by commas, quoted with '"' when
// they hold commas, quotes or line ends; CR LF or LF ends a record.
std::vector<std::vector<std::string>> ParseCsv(const std::string& text) {
    std::vector<std::vector<std::string>> records(1, std::vector<std::string>(1));
    bool quoted = false;
    for (size_t i = 0; i < text.size(); ++i) {
        char c = text[i];
        std::string& field = records.back().back();
        if (quoted) {
            if (c == '"' && i + 1 < text.size() && text[i + 1] == '"')
                field += text[++i];
            else if (c == '"')
                quoted = false;
            else
                field += c;
        } else if (c == '"') {
            quoted = true;
        } else if (c == ',') {
            records.back().emplace_back();
        } else if (c == '\n' || (c == '\r' && i + 1 < text.size() && text[i + 1] == '\n')) {
            i += c == '\r' ? 1 : 0;
            records.emplace_back(1);
        } else {
            field += c;
        }
    }
    if (quoted)
        throw Error("The CSV text ends inside a quoted field");
    if (records.back() == std::vector<std::string>(1))
        records.pop_back(); // the final line end
    return records;
}

int32_t ParseRangeId(const std::string& text) {
    int32_t value = 0;
    auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (ec != std::errc() || end != text.data() + text.size())
        throw Error("Not a range number: " + text);
    return value;
}

} // namespace

PicturesCommand::PicturesCommand(PicturesOptions options, SettingsStore& store)
    : options_(std::move(options)), store_(store) {}

// A folder given with --db is the system's own name and stays as it is; the
// saved DBPath setting is the control's text.
Path PicturesCommand::dbName(std::ostream& err) {
    if (!options_.db.empty())
        return Path(JoinFolder(options_.db, PictureDb::kFileName));
    std::string dir = store_.GetSetting(FromUtf8(Utf8(options_.app)), "Params", "DBPath", "c:\\");
    if (dir.empty() || SettingsStore::FoldCase(dir) == "c:\\") {
        err << "No picture folder is set: give one with --db DIR, or save DBPath in the picture "
               "settings (dovrel settings set DBPath DIR/)\n";
        return Path();
    }
    return PathFromCp1255(JoinFolder(dir, PictureDb::kFileName));
}

int PicturesCommand::run(std::ostream& out, std::ostream& err) {
    Path name = dbName(err);
    if (name.empty())
        return kExitFailed;
    PictureDb db(name);
    const std::string& action = options_.action;
    if (action == "init")
        return init(db, out);
    if (action != "import" && !FileExists(name)) {
        err << "There is no picture database at " << ResolvePath(name).shown().str()
            << " (dovrel pictures init makes one)\n";
        return 1;
    }
    if (action == "list")
        return list(db, out);
    if (action == "add")
        return add(db, out);
    if (action == "delete")
        return remove(db, err);
    if (action == "which")
        return which(db, out, err);
    if (action == "export")
        return exportTo(db, out);
    if (action == "import")
        return importFrom(db, out);
    throw Error("Unknown pictures action: " + action);
}

void PicturesCommand::needArgs(size_t count, const char* usage) const {
    if (options_.args.size() != count)
        throw CommandError(kExitUsage, std::string("Usage: dovrel pictures ") + usage);
}

int PicturesCommand::init(const PictureDb& db, std::ostream& out) {
    PictureDb::Inspection old = db.inspect();
    if (old.kind == PictureDb::FileKind::Foreign && !options_.force)
        throw Error("The file " + ResolvePath(db.file()).shown().str() +
                    " is not a picture database (" + old.reason +
                    "); it was left as it is. Give --force to replace it");
    if (old.kind == PictureDb::FileKind::Pictures && !options_.force) {
        if (size_t held = db.rangesById().size(); held > 0)
            throw Error("The picture database " + ResolvePath(db.file()).shown().str() + " holds " +
                        std::to_string(held) +
                        " ranges; it was left as it is. Give --force to empty it");
    }
    db.create(options_.force);
    out << "Created an empty picture database at " << ResolvePath(db.file()).shown().str() << '\n';
    return 0;
}

int PicturesCommand::list(const PictureDb& db, std::ostream& out) const {
    std::vector<PictureRange> ranges = db.rangesById();
    if (options_.json) {
        nlohmann::json all = nlohmann::json::array();
        for (const PictureRange& range : ranges) {
            nlohmann::json row = {{"RangeID", range.RangeID}};
            for (size_t i = 0; i < 5; ++i) {
                const std::optional<std::string>& value = range.*kMembers[i];
                row[kFields[i]] = value ? StateJson::Text(*value) : nlohmann::json();
            }
            all.push_back(row);
        }
        out << all.dump(2) << '\n';
        return 0;
    }
    out << "RangeID\tFromItemKey\tToItemKey\tFromCatCode\tToCatCode\tPicFile\n";
    for (const PictureRange& range : ranges) {
        out << range.RangeID;
        for (auto member : kMembers)
            out << '\t' << ToTerminal((range.*member).value_or(""));
        out << '\n';
    }
    return 0;
}

int PicturesCommand::add(const PictureDb& db, std::ostream& out) const {
    const std::vector<std::string>& a = options_.args;
    if (a.size() != 3 && a.size() != 5)
        throw CommandError(kExitUsage,
                           "Usage: dovrel pictures add FROMKEY TOKEY [FROMCAT TOCAT] PICFILE");
    PictureRange range = a.size() == 5 ? RangeOfCells(a) : RangeOfCells({a[0], a[1], "", "", a[2]});
    if (a.size() == 3)
        range.ToCatCode.reset(); // no category bounds at all
    int32_t added = db.add(range);
    out << "Added range " << added << '\n';
    return 0;
}

int PicturesCommand::remove(const PictureDb& db, std::ostream& err) const {
    needArgs(1, "delete RANGEID");
    int32_t rangeId = ParseRangeId(options_.args[0]);
    if (db.remove(rangeId))
        return 0;
    err << "No range " << rangeId << " in " << ResolvePath(db.file()).shown().str() << '\n';
    return kExitNotFound;
}

// A line's category code is three characters, as stored.
int PicturesCommand::which(const PictureDb& db, std::ostream& out, std::ostream& err) const {
    needArgs(2, "which ITEMKEY CATCODE");
    std::string key = FromUtf8(Utf8(options_.args[0]));
    std::string code = FromUtf8(Utf8(options_.args[1])).substr(0, PictureDb::kCodeSize);
    code.resize(PictureDb::kCodeSize, ' ');
    PictureLookup lookup(db.rangesInLookupOrder());
    if (const std::string* picture = lookup.pictureFor(key, code)) {
        out << ToTerminal(*picture) << '\n';
        return kExitDone;
    }
    err << "No picture for item " << TerminalText(ValidUtf8(options_.args[0]))
        << " with category code \"" << TerminalText(ValidUtf8(options_.args[1])) << "\"\n";
    return kExitNotFound;
}

int PicturesCommand::exportTo(const PictureDb& db, std::ostream& out) const {
    needArgs(1, "export FILE.csv");
    std::ostringstream csv;
    csv << "FromItemKey,ToItemKey,FromCatCode,ToCatCode,PicFile\r\n";
    for (const PictureRange& range : db.rangesById()) {
        for (size_t i = 0; i < 5; ++i)
            csv << (i ? "," : "") << CsvField(ToUtf8((range.*kMembers[i]).value_or("")).str());
        csv << "\r\n";
    }
    WriteFileAtomically(Path(options_.args[0]), csv.str(), "the picture ranges");
    out << "Wrote the picture ranges to " << options_.args[0] << '\n';
    return 0;
}

int PicturesCommand::importFrom(const PictureDb& db, std::ostream& out) const {
    needArgs(1, "import FILE.csv");
    const std::string& file = options_.args[0];
    std::string text = ReadWholeFile(Path(file), kMaxCsvBytes, "the picture ranges");
    if (text.starts_with("\xEF\xBB\xBF"))
        text.erase(0, 3); // a byte-order mark
    std::vector<std::vector<std::string>> records = ParseCsv(text);
    std::vector<size_t> columns = TakeColumns(records, file);
    if (records.size() > PictureDb::kMaxRanges)
        throw Error(file + " holds " + std::to_string(records.size()) + " ranges, more than the " +
                    std::to_string(PictureDb::kMaxRanges) +
                    " the picture settings can list; nothing was changed");
    if (records.empty() && !options_.force)
        throw Error(file + " holds no picture ranges; importing it would delete every range of " +
                    ResolvePath(db.file()).shown().str() + ". Give --force to do that");
    std::vector<PictureRange> ranges;
    for (size_t i = 0; i < records.size(); ++i) {
        if (records[i].size() != 5)
            throw Error(file + ": record " + std::to_string(i + 1) + " has " +
                        std::to_string(records[i].size()) + " fields, not 5; nothing was changed");
        std::vector<std::string> cells;
        for (size_t column : columns)
            cells.push_back(records[i][column]);
        ranges.push_back(RangeOfRecord(cells));
    }
    db.replaceAll(ranges);
    out << "Imported " << ranges.size() << " picture ranges\n";
    return kExitDone;
}

} // namespace dovrel
