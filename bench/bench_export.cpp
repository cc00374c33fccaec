// `dovrel export` of a whole company to JSON Lines, against the forward scan
// of its 1 GiB document file, and the memory the export holds.

#include "BenchSupport.h"

#include "app/export/DocumentExport.h"

#include <cstdint>
#include <fstream>
#include <memory>
#include <string>
#include <utility>

namespace dovrel::bench {
namespace {

constexpr int16_t kBondedExitRow = 12; // type 19, which bench/run leaves out of the data

// Every document of the company to /dev/null; false when any was skipped or
// none was written.
bool ExportAll(const std::string& dir) {
    std::ofstream out("/dev/null", std::ios::binary);
    DocumentExport exporter(ExportOptions{});
    ExportSummary summary = exporter.run(Path(dir), out);
    return summary.documents > 0 && summary.skippedCount == 0;
}

void RegisterExport() {
    RegisterPair(
        "Pair/ExportVsScan/1GiB",
        [] {
            auto scan = std::make_shared<BenchCard>();
            Work exportAll = [] { return ExportAll(Data().big); };
            Work forward = [scan] {
                return scan->read(Data().big, kBondedExitRow, "First") > 0 && scan->messages() == 0;
            };
            return std::pair{exportAll, forward};
        },
        3);
}

void RegisterMemory() {
    for (const auto& [name, dir] :
         {std::pair{"100MiB", &DataSets::medium}, std::pair{"1GiB", &DataSets::big}}) {
        auto peak = [dir](benchmark::State& state) {
            ResidentMemory memory;
            for (auto _ : state)
                memory = MeasureInChild([dir] { ExportAll(Data().*dir); });
            if (memory.peak < 0)
                state.SkipWithError("the peak resident memory could not be measured");
            state.counters["peak_rss_bytes"] = static_cast<double>(memory.peak);
            state.counters["start_rss_bytes"] = static_cast<double>(memory.atStart);
        };
        Register(std::string("PeakRss/Export/") + name, peak, 1)->Iterations(1);
    }
}

} // namespace
} // namespace dovrel::bench

int main(int argc, char** argv) {
    using namespace dovrel::bench;
    if (!Init(argc, argv))
        return 2;
    RegisterExport();
    RegisterMemory();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
