#pragma once

#include "control/ModuleState.h"
#include "platform/Browser.h"
#include "platform/Clock.h"
#include "platform/SettingsStore.h"

#include <cstdint>
#include <iosfwd>
#include <optional>
#include <string>

namespace dovrel {

struct PrintOptions {
    std::string compDir;         // UTF-8, as typed
    int16_t type = 20;           // document type code
    int32_t start = 2;           // first record to look at
    int32_t count = 1;           // documents to print, from the first found on
    std::optional<int32_t> lang; // 0 Hebrew, 1 English, 2 Hebrew without amounts
    std::string out;             // a page file, or a folder for several pages
    bool open = true;            // open a single page in the browser
    std::optional<CivilDate> today;
};

// `dovrel print`: the print button from the command line. The control
// starts with the user's saved settings (language, options, logo and
// picture settings), shows the first document of the type at or after the
// start record and writes its page; with a count, the following documents
// too, one page each, into a folder.
class PrintCommand {
public:
    PrintCommand(PrintOptions options, SettingsStore& settings, Browser& browser,
                 ModuleState& shared);

    // Exit code: 0 when every page was written, 1 when none could be, 3 when
    // there is no such document.
    int run(std::ostream& out, std::ostream& err);

    // "YYYY-MM-DD", a day of the calendar; an error for anything else.
    static CivilDate ParseDay(const std::string& text);
    // A file name for a document's page from its reference: letters, digits,
    // "-" and "_" kept, anything else "_"; "document" when nothing is left.
    static std::string PageName(const std::string& reference);

private:
    PrintOptions options_;
    SettingsStore& settings_;
    Browser& browser_;
    ModuleState& shared_;
};

} // namespace dovrel
