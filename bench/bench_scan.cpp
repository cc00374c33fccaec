// The document reader walking a whole document file without finding
// anything, against reading the same file without decoding it.

#include "BenchSupport.h"

#include "platform/Encoding.h"

#include <cstdint>
#include <string>

namespace dovrel::bench {
namespace {

constexpr size_t kDocRecord = 170;
constexpr int16_t kInvoiceRow = 0;     // type 1, the most common type in IMV.FIX
constexpr int16_t kBondedExitRow = 12; // type 19, which bench/run leaves out of the data
constexpr char kNoCustomer[] = "אין לקוח כזה";
constexpr char kNoItem[] = "ZZ-0";
constexpr char kAfterAll[] = "01/01/2099";

std::string DocFile(const std::string& dir) {
    return dir + "/IMV.FIX";
}

int64_t Records(const std::string& dir) {
    return (FileBytes(DocFile(dir)) + kDocRecord / 2) / kDocRecord;
}

// One whole walk: forward it stops after the last record, backward before
// record 2; anything else means it found a document or failed.
void Walk(benchmark::State& state, const std::string& dir, BenchCard& bench, int16_t row,
          const std::string& direction, const std::string& fromDate = std::string()) {
    bool backward = direction == "Last" || direction == "Previous";
    int64_t expected = backward ? 1 : Records(dir) + 1;
    for (auto _ : state) {
        if (direction == "Previous")
            bench.card().PubACTLocation = static_cast<int32_t>(Records(dir) + 1);
        int32_t stopped = bench.read(dir, row, direction, fromDate);
        if (stopped != expected || bench.messages() != 0) {
            state.SkipWithError("the walk did not cover the whole file without a find");
            return;
        }
    }
    state.SetBytesProcessed(state.iterations() * FileBytes(DocFile(dir)));
}

void RegisterBaselines() {
    Register("PlainRead/1GiB", [](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(PlainBlockRead(DocFile(Data().big), kDocRecord));
        state.SetBytesProcessed(state.iterations() * FileBytes(DocFile(Data().big)));
    });
    Register(
        "ReadPerRecord/1GiB",
        [](benchmark::State& state) {
            for (auto _ : state)
                benchmark::DoNotOptimize(ReadPerRecord(DocFile(Data().big), kDocRecord));
            state.SetBytesProcessed(state.iterations() * FileBytes(DocFile(Data().big)));
        },
        2);
}

void RegisterForward() {
    Register("Scan/WrongType/1GiB", [](benchmark::State& state) {
        BenchCard bench;
        Walk(state, Data().big, bench, kBondedExitRow, "First");
    });
    for (const auto& [name, dir] :
         {std::pair{"1GiB", &DataSets::big}, std::pair{"100MiB", &DataSets::medium}}) {
        Register(std::string("Scan/CustomerName/") + name, [dir](benchmark::State& state) {
            BenchCard bench;
            bench.search("CustomerName", kNoCustomer);
            Walk(state, Data().*dir, bench, kInvoiceRow, "First");
        });
    }
    Register("Scan/ItemKey/1GiB", [](benchmark::State& state) {
        BenchCard bench;
        bench.search("ItemKey", kNoItem);
        bench.card().txtItemKey.setText(FromUtf8(kNoItem));
        Walk(state, Data().big, bench, kInvoiceRow, "First");
    });
    Register("Scan/FromDate/1GiB", [](benchmark::State& state) {
        BenchCard bench;
        Walk(state, Data().big, bench, kInvoiceRow, "First", kAfterAll);
    });
}

void RegisterBackward() {
    Register("Backward/CustomerName/1GiB", [](benchmark::State& state) {
        BenchCard bench;
        bench.search("CustomerName", kNoCustomer);
        Walk(state, Data().big, bench, kInvoiceRow, "Last");
    });
    Register("Backward/FromDate/1GiB", [](benchmark::State& state) {
        BenchCard bench;
        Walk(state, Data().big, bench, kInvoiceRow, "Previous", kAfterAll);
    });
}

// Progress off: nothing listens and the frame has no width, so the bar never
// changes. On: a full frame and a listener that counts its calls. The two
// differ by little, so they are repeated more often than the others.
void RegisterProgress() {
    constexpr int kRepetitions = 9;
    Register(
        "Progress/Off/1GiB",
        [](benchmark::State& state) {
            BenchCard bench;
            bench.card().ProgressFrame.setWidth(0);
            Walk(state, Data().big, bench, kBondedExitRow, "First");
        },
        kRepetitions);
    Register(
        "Progress/On/1GiB",
        [](benchmark::State& state) {
            BenchCard bench;
            int64_t calls = 0;
            bench.card().ProgressFill.changed.connect([&calls] { ++calls; });
            Walk(state, Data().big, bench, kBondedExitRow, "First");
            state.counters["listener_calls"] = static_cast<double>(calls);
        },
        kRepetitions);
}

void RegisterMemory() {
    for (const auto& [name, dir] :
         {std::pair{"100MiB", &DataSets::medium}, std::pair{"1GiB", &DataSets::big}}) {
        auto peak = [dir](benchmark::State& state) {
            ResidentMemory memory;
            for (auto _ : state) {
                memory = MeasureInChild([dir] {
                    BenchCard bench;
                    bench.search("ItemKey", kNoItem);
                    bench.card().txtItemKey.setText(FromUtf8(kNoItem));
                    bench.read(Data().*dir, kInvoiceRow, "First");
                });
            }
            if (memory.peak < 0)
                state.SkipWithError("the peak resident memory could not be measured");
            state.counters["peak_rss_bytes"] = static_cast<double>(memory.peak);
            state.counters["start_rss_bytes"] = static_cast<double>(memory.atStart);
        };
        Register(std::string("PeakRss/") + name, peak, 1)->Iterations(1);
    }
}

} // namespace
} // namespace dovrel::bench

int main(int argc, char** argv) {
    using namespace dovrel::bench;
    if (!Init(argc, argv))
        return 2;
    RegisterBaselines();
    RegisterForward();
    RegisterBackward();
    RegisterProgress();
    RegisterMemory();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
