// Building the printed pages of a 40-line document: the Hebrew page and the
// English page, each built and written whole to a new file renamed into
// place, in microseconds. bench/run sets them against one scan of a 100 MiB
// document file.

#include "BenchSupport.h"

#include "pages/PageFile.h"
#include "platform/Encoding.h"
#include "tools/SampleWriter.h"

#include <nlohmann/json.hpp>

#include <filesystem>
#include <string>

#include <unistd.h>

namespace dovrel::bench {
namespace {

constexpr int kLines = 40;

// A company of one delivery note with 40 lines of Hebrew descriptions in a
// private folder; its path.
std::string WriteCompany() {
    nlohmann::json lines = nlohmann::json::array();
    for (int k = 1; k <= kLines; ++k) {
        // Appended rather than added to a literal: g++ 12 warns wrongly on
        // "literal" + std::string at -O2.
        std::string number = std::to_string(k), key = "K-", description = "בורג פלדה ";
        key += number;
        description += number;
        lines.push_back({{"key", key},
                         {"description", description},
                         {"details", number},
                         {"price", 12.5 * k},
                         {"quantity", k},
                         {"discount", k % 3 == 0 ? 5.0 : 0.0}});
    }
    nlohmann::json doc = {{"type", 20},
                          {"reference", "4101"},
                          {"customer", "כהן שיפוצים ובניה"},
                          {"address1", "רח' הרצל 45"},
                          {"address2", "נתניה"},
                          {"remarks", {"הערה ראשונה", "שנייה", ""}},
                          {"lines", lines}};
    std::string dir = PrivatePageDir().native() + "/bench-company";
    sample::WriteCompany(nlohmann::json{{"documents", {doc}}}.dump(), dir);
    return dir;
}

// Where the pages are written: a folder in memory (/dev/shm) when there is
// one, as the scans they are set against read from the page cache; a disk
// folder adds the file system's cost of creating and renaming a file.
std::string PageFolder() {
    std::string folder = "/dev/shm/dovrel-bench-" + std::to_string(getuid());
    if (std::filesystem::is_directory("/dev/shm") &&
        (std::filesystem::create_directory(folder) || std::filesystem::is_directory(folder)))
        return folder;
    return PrivatePageDir().native();
}

void RegisterPages() {
    static const std::string company = WriteCompany();
    static const std::string page = FromUtf8(Utf8(PageFolder() + "/bench-page.htm"));
    auto show = [](BenchCard& bench) {
        Card& card = bench.card();
        card.UserControl_InitProperties(nullptr);
        card.ChkWithDrawing.setValue(1);
        card.chkLineDisc.setValue(1);
        int16_t type = 20;
        int32_t start = 2;
        card.ShowDoc(FromUtf8(Utf8(company)), type, start);
        return card.DocLines.Rows() == kLines + 2 && bench.messages() == 0;
    };
    Register("Page/Hebrew40Lines", [show](benchmark::State& state) {
        BenchCard bench;
        if (!show(bench))
            state.SkipWithError("the 40-line document was not shown");
        std::string path = page;
        int16_t format = 0;
        for (auto _ : state)
            bench.card().CreateHTML(path, format);
    });
    Register("Page/English40Lines", [show](benchmark::State& state) {
        BenchCard bench;
        if (!show(bench))
            state.SkipWithError("the 40-line document was not shown");
        std::string path = page;
        bool useForeignNames = true;
        for (auto _ : state)
            bench.card().CreateHTMLEng(path, useForeignNames);
    });
}

} // namespace
} // namespace dovrel::bench

int main(int argc, char** argv) {
    if (!dovrel::bench::Init(argc, argv))
        return 2;
    dovrel::bench::RegisterPages();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
