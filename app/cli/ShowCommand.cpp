#include "app/cli/ShowCommand.h"

#include "app/cli/CompanyDir.h"
#include "app/cli/ExitCode.h"
#include "app/export/ExportRecord.h"
#include "app/export/ItemCategories.h"
#include "fixfiles/DateSerial.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/Messages.h"
#include "platform/TerminalText.h"

#include <algorithm>
#include <filesystem>
#include <ostream>
#include <utility>

namespace dovrel {

namespace {

using Field = std::pair<std::string, std::string>; // caption, value; UTF-8

const char* const kNoDocument = "לא נמצא מסמך";

std::string Pad(const std::string& text, size_t width) {
    size_t shown = ShowCommand::DisplayWidth(text);
    return shown >= width ? text : text + std::string(width - shown, ' ');
}

std::string TrimRight(std::string text) {
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

// Prints "caption: value" lines with the values in one column; a field
// without a caption continues the one above it.
void PrintFields(const std::vector<Field>& fields, std::ostream& out) {
    size_t width = 0;
    for (const auto& [caption, value] : fields)
        width = std::max(width, ShowCommand::DisplayWidth(caption) + 1);
    for (const auto& [caption, value] : fields)
        out << Pad(caption.empty() ? caption : caption + ":", width) << "  " << value << '\n';
}

std::string Utf8Trimmed(std::string_view cp1255) {
    return ToTerminal(TrimCopy(cp1255));
}

} // namespace

ShowCommand::ShowCommand(ShowOptions options, ModuleState& shared)
    : options_(std::move(options)), shared_(shared) {}

size_t ShowCommand::DisplayWidth(std::string_view utf8) {
    return static_cast<size_t>(std::count_if(utf8.begin(), utf8.end(), [](char c) {
        return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
    }));
}

int ShowCommand::run(std::ostream& out, std::ostream& err) {
    if (options_.start < 1)
        throw Error("The start record must be 1 or more");
    Path compDir(options_.compDir);
    compPath_ = shared_.Paths.text(compDir);
    CheckCompanyDir(compDir);
    RecordedMessages messages;
    Card card(messages, shared_);
    watchProgress(card);
    read(card);
    std::vector<RecordedMessages::Shown> shown = messages.take();
    for (const auto& message : shown)
        err << "dovrel: " << TerminalText(message.title) << ": " << TerminalText(message.text)
            << '\n';
    if (!shown.empty())
        return kExitFailed;
    if (!card.document()) {
        err << "dovrel: " << kNoDocument << ": no document of type " << options_.type
            << " at or after record " << options_.start << '\n';
        return kExitNotFound;
    }
    if (options_.json)
        printJson(*card.document(), compDir, out);
    else
        printDocument(card, out);
    return kExitDone;
}

// The control's own start-up and ShowDoc. The start-up's settings are its
// defaults: what the user saved is neither read nor changed.
void ShowCommand::read(Card& card) {
    card.UserControl_InitProperties(nullptr);
    row_ = DocTypeIndex(shared_.DocTypes, options_.type);
    if (shared_.DocTypes[static_cast<size_t>(row_)].code != options_.type)
        throw CommandError(kExitUsage,
                           "there is no document type " + std::to_string(options_.type));
    int16_t type = options_.type;
    int32_t start = options_.start;
    card.ShowDoc(compPath_, type, start);
}

void ShowCommand::watchProgress(Card& card) {
    if (progress_ == nullptr)
        return;
    progressShown_ = card.ProgressFill.changed.connect([this, &card] {
        int32_t frame = std::max(card.ProgressFrame.Width(), 1);
        int32_t percent = std::clamp(card.ProgressFill.Width() * 100 / frame, 0, 100);
        if (card.ProgressFill.Width() == 0)
            *progress_ << "\r     \r" << std::flush;
        else
            *progress_ << '\r' << percent << '%' << std::flush;
    });
}

// The document as one record of `dovrel export`, its lines with the
// categories of their items.
void ShowCommand::printJson(Document document, const Path& compDir, std::ostream& out) const {
    ItemCategories(compDir).apply(document);
    out << ExportRecord::Json(document).dump(2) << '\n';
}

void ShowCommand::printDocument(const Card& card, std::ostream& out) const {
    const Document& document = *card.document();
    printHeader(document, out);
    out << '\n';
    Grid lines(card.DocLines.name());
    DocumentView::FillLines(lines, &document);
    printLines(lines, document, out);
    out << '\n';
    printTotals(document, out);
    printRemarks(document, out);
}

void ShowCommand::printHeader(const Document& document, std::ostream& out) const {
    if (!document.companyTitle.reading.empty())
        out << ToTerminal(document.companyTitle.reading) << "\n\n";
    const DocTypeRow& type = shared_.DocTypes[static_cast<size_t>(row_)];
    std::vector<Field> fields = {
        {"סוג מסמך", ToTerminal(type.hebrewTitle) + " (" + std::to_string(type.code) + ")"},
        {"אסמכתא", ToTerminal(document.reference.reading)},
        {"תאריך", FormatDate(document.date)},
        {"כרטיס", ToTerminal(document.accountKey.reading)},
        {"שם", ToTerminal(document.customer.reading)},
        {"כתובת", ToTerminal(document.address1.reading)}};
    if (!document.address2.reading.empty())
        fields.push_back({"", ToTerminal(document.address2.reading)});
    PrintFields(fields, out);
}

// The grid's cells, with the texts of the lines in reading order.
void ShowCommand::printLines(const Grid& grid, const Document& document, std::ostream& out) const {
    std::vector<std::vector<std::string>> table;
    for (int32_t row = 0; row < grid.Rows(); ++row) {
        std::vector<std::string> cells;
        bool empty = true;
        for (int32_t col = 0; col < grid.Cols(); ++col) {
            cells.push_back(Utf8Trimmed(grid.TextMatrix(row, col)));
            empty = empty && cells.back().empty();
        }
        if (row >= 1 && static_cast<size_t>(row) <= document.lines.size() && cells.size() > 3) {
            const Document::Line& line = document.lines[static_cast<size_t>(row - 1)];
            if (!cells[1].empty())
                cells[1] = Utf8Trimmed(line.itemKey.reading);
            cells[2] = Utf8Trimmed(line.description.reading);
            if (!cells[3].empty())
                cells[3] = Utf8Trimmed(line.details.reading);
            if (!line.textOnly && line.currency >= 10 && line.currency <= 18 && cells.size() > 6) {
                const DocumentText& name = document.currencyNames[line.currency - 10u];
                if (!name.reading.empty())
                    cells[6] = Utf8Trimmed(name.reading);
            }
        }
        if (row == 0 || !empty)
            table.push_back(std::move(cells));
    }
    std::vector<size_t> widths(static_cast<size_t>(std::max(grid.Cols(), 0)), 0);
    for (const auto& cells : table)
        for (size_t col = 0; col < cells.size(); ++col)
            widths[col] = std::max(widths[col], DisplayWidth(cells[col]));
    for (size_t row = 0; row < table.size(); ++row) {
        std::string line;
        for (size_t col = 0; col < widths.size(); ++col)
            line += Pad(table[row][col], widths[col]) + "  ";
        out << TrimRight(line) << '\n';
        if (row == 0) {
            std::string rule;
            for (size_t width : widths)
                rule += std::string(width, '-') + "  ";
            out << TrimRight(rule) << '\n';
        }
    }
}

void ShowCommand::printTotals(const Document& document, std::ostream& out) const {
    PrintFields({{"סה\"כ", FormatAmount(document.totals.beforeVat)},
                 {"מע\"מ", FormatAmount(document.totals.vat)},
                 {"סה\"כ כולל מע\"מ", FormatAmount(document.totals.withVat)}},
                out);
}

void ShowCommand::printRemarks(const Document& document, std::ostream& out) const {
    std::vector<std::string> remarks;
    for (const DocumentText& remark : document.remarks)
        if (!Trim(remark.reading).empty())
            remarks.push_back(Utf8Trimmed(remark.reading));
    if (remarks.empty())
        return;
    out << "\nהערות:\n";
    for (const std::string& remark : remarks)
        out << "  " << remark << '\n';
}

} // namespace dovrel
