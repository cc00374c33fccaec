#include "app/cli/PrintCommand.h"

#include "platform/Ascii.h"

#include "app/cli/CompanyDir.h"
#include "app/cli/ExitCode.h"
#include "control/Card.h"
#include "fixfiles/DocTypes.h"
#include "fixfiles/TextDecoding.h"
#include "pages/PageFile.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/TerminalText.h"

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <ostream>
#include <set>

namespace dovrel {

namespace fs = std::filesystem;

namespace {

// The page files of a run of several documents: unique names in a folder.
class PageNames {
public:
    explicit PageNames(fs::path folder) : folder_(std::move(folder)) {}
    std::string next(const std::string& reference) {
        std::string base = PrintCommand::PageName(reference);
        std::string name = base + ".htm";
        for (int n = 2; !used_.insert(name).second; ++n)
            name = base + "-" + std::to_string(n) + ".htm";
        return (folder_ / name).string();
    }

private:
    fs::path folder_;
    std::set<std::string> used_;
};

} // namespace

PrintCommand::PrintCommand(PrintOptions options, SettingsStore& settings, Browser& browser,
                           ModuleState& shared)
    : options_(std::move(options)), settings_(settings), browser_(browser), shared_(shared) {}

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

std::string PrintCommand::PageName(const std::string& reference) {
    std::string name;
    for (char c : Trim(reference)) {
        bool plain = IsAsciiAlnum(c) || c == '-' || c == '_';
        name += plain ? c : '_';
    }
    return name.empty() ? "document" : name;
}

int PrintCommand::run(std::ostream& out, std::ostream& err) {
    if (options_.count < 1)
        throw Error("The count must be 1 or more");
    std::string compPath = shared_.Paths.text(Path(options_.compDir));
    CheckCompanyDir(Path(options_.compDir));
    std::error_code ec;
    bool several = options_.count > 1;
    if (several && (options_.out.empty() || !fs::is_directory(options_.out, ec)))
        throw Error("Several pages need --out with an existing folder to write them in");

    RecordedMessages messages;
    ClosingFormPresenter forms;
    MemoryClipboard clipboard;
    SettableClock clock;
    if (options_.today)
        clock.fix(*options_.today);
    CardServices services{messages, settings_, forms, clipboard, browser_, clock};
    Card card(services, shared_);
    card.UserControl_InitProperties(nullptr);
    if (options_.lang)
        card.CmbDocLang.setListIndex(*options_.lang);
    if (card.CmbDocLang.ListIndex() < 0 || card.CmbDocLang.ListIndex() > 2)
        throw Error("No page language is chosen; give one with --lang");

    int16_t type = options_.type;
    int32_t start = options_.start;
    card.ShowDoc(compPath, type, start);
    auto report = [&messages, &err] {
        bool any = false;
        for (const auto& message : messages.take()) {
            err << "dovrel: " << ToTerminal(message.title) << ": " << ToTerminal(message.text)
                << '\n';
            any = true;
        }
        return any;
    };
    if (report())
        return 1;
    if (card.PubPrevLocation == 0) {
        err << "dovrel: no document of type " << options_.type << " at or after record "
            << options_.start << '\n';
        return kExitNotFound;
    }

    if (!several) {
        Path path = options_.out.empty() ? PrintFilePath() : Path(options_.out);
        card.WritePage(path);
        out << path.shown() << '\n';
        if (options_.open)
            browser_.Open(path);
        return 0;
    }

    PageNames names(options_.out);
    int32_t written = 0;
    int32_t row = card.cmbDocType.ListIndex();
    while (true) {
        std::string path = names.next(card.txtReference1.Text());
        card.WritePage(Path(path));
        out << path << '\n' << std::flush;
        if (++written == options_.count)
            break;
        int32_t shown = card.PubPrevLocation;
        std::string next = "Next", fromDate = card.txtFromDate.Text();
        int16_t typeRow = static_cast<int16_t>(row);
        card.ReadStock(compPath, typeRow, card.PubSearchBy, card.PubSearchValue, next, fromDate);
        if (report())
            return 1;
        if (card.PubPrevLocation == shown)
            break;
    }
    err << "dovrel: " << written << (written == 1 ? " page" : " pages") << " written\n";
    return 0;
}

} // namespace dovrel
