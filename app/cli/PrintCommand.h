#pragma once

#include "control/ModuleState.h"
#include "fixfiles/Document.h"
#include "platform/Browser.h"
#include "platform/Clock.h"
#include "platform/Messages.h"
#include "platform/SettingsStore.h"

#include <cstdint>
#include <iosfwd>
#include <memory>
#include <optional>
#include <string>

namespace dovrel {

class Card;
class ChromiumPdf;

struct PrintOptions {
    std::string compDir;         // UTF-8, as typed
    int16_t type = 20;           // document type code
    int32_t start = 2;           // first record to look at
    int32_t count = 1;           // documents to print, from the first found on
    bool all = false;            // every document from the first found on
    std::optional<int32_t> lang; // 0 Hebrew, 1 English, 2 Hebrew without amounts
    std::string fromDate;        // DD/MM/YYYY: documents dated on or after it
    std::string out;             // a page file, or a folder for several pages
    bool open = true;            // open a single page in the browser
    bool pdf = false;            // PDF files made by Chromium instead of HTML pages
    std::optional<CivilDate> today;
    // The page choices for this run, saving nothing; none keeps the saved one.
    std::optional<bool> drawings, lineDiscount, details, totalFc, foreignNames;
    std::optional<int32_t> rules;     // 0 all, 1 none, 2 rows, 3 cols
    std::optional<std::string> title; // UTF-8
};

// `dovrel print`: the print button from the command line. The control
// starts with the user's saved settings (language, options, logo and
// picture settings), the run's own choices over them, shows the first
// document of the type at or after the start record and writes its page;
// with a count or --all, the following documents too, one page each, into
// a folder, passing over (and naming) those that cannot be printed.
class PrintCommand {
public:
    PrintCommand(PrintOptions options, SettingsStore& settings, Browser& browser,
                 ModuleState& shared);
    ~PrintCommand();

    // Exit code: 0 when every page was written, 1 when none could be, 3 when
    // there is no such document, 4 when documents were passed over.
    int run(std::ostream& out, std::ostream& err);
    // Shows the progress of a run of pages on a terminal.
    void setProgress(std::ostream* terminal) { progress_ = terminal; }

    // "YYYY-MM-DD", a day of the calendar; an error for anything else.
    static CivilDate ParseDay(const std::string& text);
    // The file name of a document's page, "TYPE-REFERENCE" (UTF-8): the
    // reference trimmed and kept readable, only "/", control characters and a
    // leading dot replaced by "_"; "TYPE-document" for an empty reference.
    static std::string PageName(int type, const std::string& reference);

private:
    void applyChoices(Card& card) const;
    int printOne(Card& card, std::ostream& out, std::ostream& err);
    int printRun(Card& card, std::ostream& out, std::ostream& err);
    bool writeOne(Card& card, const Path& path);
    void showProgress(int64_t position, int64_t records, int32_t written) const;

    PrintOptions options_;
    SettingsStore& settings_;
    Browser& browser_;
    ModuleState& shared_;
    std::string compPath_;
    RecordedMessages messages_;
    std::unique_ptr<ChromiumPdf> pdf_;
    std::ostream* progress_ = nullptr;
};

} // namespace dovrel
