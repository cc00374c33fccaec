#include "app/cli/PrintCommand.h"

#include "app/cli/ChromiumPdf.h"
#include "app/cli/CompanyDir.h"
#include "app/cli/ExitCode.h"
#include "control/Card.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/ReadStock.h"
#include "fixfiles/TextDecoding.h"
#include "pages/PageFile.h"
#include "platform/Ascii.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/TerminalText.h"

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <ostream>
#include <set>
#include <thread>

namespace dovrel {

namespace fs = std::filesystem;

namespace {

// The page files of a run of several documents: unique names in a folder.
class PageNames {
public:
    PageNames(fs::path folder, std::string extension)
        : folder_(std::move(folder)), extension_(std::move(extension)) {}
    Path next(int type, const std::string& reference) {
        std::string base = PrintCommand::PageName(type, reference);
        std::string name = base + extension_;
        for (int n = 2; !used_.insert(name).second; ++n)
            name = base + "-" + std::to_string(n) + extension_;
        return Path((folder_ / name).string());
    }

private:
    fs::path folder_;
    std::string extension_;
    std::set<std::string> used_;
};

void ReportMessages(RecordedMessages& messages, std::ostream& err, bool& any) {
    for (const auto& message : messages.take()) {
        err << "dovrel: " << TerminalText(message.title) << ": " << TerminalText(message.text)
            << '\n';
        any = true;
    }
}

// The run's choice of a check box, when it makes one.
void Choose(CheckBox& box, const std::optional<bool>& on) {
    if (on)
        box.setValue(*on ? 1 : 0);
}

} // namespace

PrintCommand::PrintCommand(PrintOptions options, SettingsStore& settings, Browser& browser,
                           ModuleState& shared)
    : options_(std::move(options)), settings_(settings), browser_(browser), shared_(shared) {}

PrintCommand::~PrintCommand() = default;

CivilDate PrintCommand::ParseDay(const std::string& text) {
    int year = 0, month = 0, day = 0;
    char tail = 0;
    if (text.size() != 10 ||
        std::sscanf(text.c_str(), "%4d-%2d-%2d%c", &year, &month, &day, &tail) != 3 || month < 1 ||
        month > 12 || day < 1 || day > 31 || year < 100)
        throw Error("Not a date (YYYY-MM-DD): " + text);
    namespace chr = std::chrono;
    if (!chr::year_month_day(chr::year(year), chr::month(static_cast<unsigned>(month)),
                             chr::day(static_cast<unsigned>(day)))
             .ok())
        throw Error("Not a day of the calendar: " + text);
    return {year, month, day};
}

std::string PrintCommand::PageName(int type, const std::string& reference) {
    std::string name(Trim(reference));
    for (char& c : name) {
        auto byte = static_cast<unsigned char>(c);
        if (c == '/' || byte < 0x20 || byte == 0x7F)
            c = '_';
    }
    if (!name.empty() && name[0] == '.')
        name[0] = '_';
    return std::to_string(type) + "-" + (name.empty() ? "document" : name);
}

void PrintCommand::applyChoices(Card& card) const {
    if (options_.lang)
        card.CmbDocLang.setListIndex(*options_.lang);
    Choose(card.ChkWithDrawing, options_.drawings);
    Choose(card.chkLineDisc, options_.lineDiscount);
    Choose(card.ChkShowDetails, options_.details);
    Choose(card.ChkShowTotalFC, options_.totalFc);
    Choose(card.ChkUseFName, options_.foreignNames);
    if (options_.rules)
        card.cmbRules.setListIndex(*options_.rules);
    if (options_.title)
        card.txtTitle.setText(FromUtf8(Utf8(*options_.title)));
    if (!options_.fromDate.empty())
        card.txtFromDate.setText(FromUtf8(Utf8(options_.fromDate)));
}

int PrintCommand::run(std::ostream& out, std::ostream& err) {
    if (options_.count < 1)
        throw Error("The count must be 1 or more");
    compPath_ = shared_.Paths.text(Path(options_.compDir));
    CheckCompanyDir(Path(options_.compDir));
    if (options_.pdf) {
        std::optional<std::string> chromium = ChromiumPdf::Find();
        if (!chromium)
            throw Error("PDF files are made with Chromium, which is not installed (the Debian "
                        "package chromium); nothing was written");
        pdf_ = std::make_unique<ChromiumPdf>(*chromium,
                                             std::max(1u, std::thread::hardware_concurrency()));
    }

    bool several = options_.all || options_.count > 1;
    std::error_code ec;
    if (several && options_.out.empty())
        throw Error("Several pages need --out with a folder to write them in");
    if (several && !fs::is_directory(options_.out, ec) && !fs::create_directory(options_.out, ec))
        throw Error("Cannot make the folder " + Path(options_.out).shown().str() + ": " +
                    ec.message());
    ClosingFormPresenter forms;
    MemoryClipboard clipboard;
    SettableClock clock;
    if (options_.today)
        clock.fix(*options_.today);
    CardServices services{messages_, settings_, forms, clipboard, browser_, clock};
    Card card(services, shared_);
    card.UserControl_InitProperties(nullptr);
    applyChoices(card);
    if (card.CmbDocLang.ListIndex() < 0 || card.CmbDocLang.ListIndex() > 2)
        throw Error("No page language is chosen; give one with --lang");
    int code = several ? printRun(card, out, err) : printOne(card, out, err);
    bool any = false;
    ReportMessages(messages_, err, any);
    return code;
}

// Writes the page of the document the control shows at path, as HTML or,
// with --pdf, queued for Chromium.
bool PrintCommand::writeOne(Card& card, const Path& path) {
    if (!pdf_)
        return card.WritePage(path);
    Path page = pdf_->pagePath();
    if (!card.WritePage(page))
        return false;
    pdf_->print(page, path);
    return true;
}

int PrintCommand::printOne(Card& card, std::ostream& out, std::ostream& err) {
    int16_t type = options_.type;
    int32_t start = options_.start;
    card.ShowDoc(compPath_, type, start);
    bool failed = false;
    ReportMessages(messages_, err, failed);
    if (failed)
        return kExitFailed;
    if (card.PubPrevLocation == 0) {
        err << "dovrel: no document of type " << options_.type << " at or after record "
            << options_.start << '\n';
        return kExitNotFound;
    }
    Path path(options_.out);
    if (options_.out.empty()) {
        path = PrintFilePath();
        if (options_.pdf)
            path = Path(fs::path(path.native()).replace_extension(".pdf").string());
    }
    writeOne(card, path);
    if (pdf_) {
        ChromiumPdf::Outcome made = pdf_->finish();
        for (const std::string& failure : made.failures)
            err << "dovrel: " << TerminalText(Utf8(failure)) << '\n';
        if (!made.failures.empty())
            return kExitFailed;
    }
    out << path.shown().str() << '\n';
    if (options_.open)
        browser_.Open(path);
    return kExitDone;
}

void PrintCommand::showProgress(int64_t position, int64_t records, int32_t written) const {
    if (progress_ == nullptr)
        return;
    int64_t percent = records > 0 ? std::min<int64_t>(100, position * 100 / records) : 100;
    *progress_ << "\rprint: " << percent << "%, " << written << (written == 1 ? " page" : " pages")
               << std::flush;
}

// The documents from the start record on, found by the reader's walk over
// the type's file; one that cannot be read or printed is named and passed
// over, and the run goes on.
int PrintCommand::printRun(Card& card, std::ostream& out, std::ostream& err) {
    int16_t row = DocTypeIndex(shared_.DocTypes, options_.type);
    const DocTypeRow& type = shared_.DocTypes[static_cast<size_t>(row)];
    card.cmbDocType.setListIndex(row);
    card.txtCompPath.setText(compPath_);
    shared_.CompDir = compPath_;
    Path file = shared_.Paths.native(compPath_).plus(
        shared_.DocFiles[static_cast<size_t>(type.fileNumber)]);
    if (type.fileNumber < 1 || !FileExists(file)) {
        err << "dovrel: " << TerminalText(Utf8("שגיאה")) << ": "
            << TerminalText(Utf8("קבצי מסמכים לא נמצאו")) << '\n';
        return kExitFailed;
    }
    std::string fromText = card.txtFromDate.Text();
    std::optional<Date> from;
    if (fromText.size() >= 6)
        from = TextToDate(fromText);
    ReadAdf(shared_.Paths.native(compPath_), shared_.Company);
    DocumentWalk::Types types;
    types.set(static_cast<size_t>(type.code));
    DocumentWalk walk(ResolvePath(file), types, shared_.Company, from, std::nullopt,
                      options_.start);
    PageNames names(options_.out, options_.pdf ? ".pdf" : ".htm");
    int32_t written = 0, skipped = 0;
    for (DocumentWalk::Step step = walk.next(); step.kind != DocumentWalk::Step::Kind::End;
         step = walk.next()) {
        std::string failure = step.error;
        if (step.kind == DocumentWalk::Step::Kind::Document) {
            Path path = names.next(type.code, ToUtf8(step.document->reference.reading).str());
            try {
                shared_.Doc = ToCurrentDocument(*step.document);
                card.PubACTLocation = card.PubPrevLocation = step.record;
                card.showDocument(std::move(*step.document));
                writeOne(card, path);
                if (!pdf_)
                    out << path.shown().str() << '\n' << std::flush;
                ++written;
            } catch (const std::exception& e) {
                failure = e.what();
            }
        }
        if (!failure.empty()) {
            ++skipped;
            err << (progress_ ? "\r" : "") << "dovrel: passed over the document at record "
                << step.record << ": " << TerminalText(Utf8(failure)) << '\n';
        }
        showProgress(walk.position(), walk.records(), written);
        if (!options_.all && written == options_.count)
            break;
    }
    if (pdf_) {
        ChromiumPdf::Outcome made = pdf_->finish();
        for (const Path& path : made.made)
            out << path.shown().str() << '\n';
        for (const std::string& failure : made.failures)
            err << "dovrel: " << TerminalText(Utf8(failure)) << '\n';
        skipped += static_cast<int32_t>(made.failures.size());
        written -= static_cast<int32_t>(made.failures.size());
    }
    if (progress_)
        *progress_ << "\r" << std::string(30, ' ') << '\r' << std::flush;
    if (written == 0 && skipped == 0) {
        err << "dovrel: no document of type " << options_.type << " at or after record "
            << options_.start << '\n';
        return kExitNotFound;
    }
    err << "dovrel: " << written << (written == 1 ? " page" : " pages") << " written";
    if (skipped > 0)
        err << ", " << skipped << (skipped == 1 ? " document" : " documents") << " passed over";
    err << '\n';
    return skipped > 0 ? (written > 0 ? kExitSkipped : kExitFailed) : kExitDone;
}

} // namespace dovrel
