// The document reader walking a whole document file without finding
// anything, against reading the same file without decoding it.

#include "BenchSupport.h"

#include "platform/Encoding.h"

#include <cstdint>
#include <memory>
#include <string>
#include <utility>

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

// A control set up for one kind of walk over a whole file.
class Walker {
public:
    Walker(std::string dir, int16_t row, std::string direction, std::string fromDate = {})
        : dir_(std::move(dir)), row_(row), direction_(std::move(direction)),
          fromDate_(std::move(fromDate)) {}

    BenchCard& bench() { return bench_; }

    // One walk. Forward it stops after the last record, backward before
    // record 2; anything else means it found a document or failed.
    bool once() {
        bool backward = direction_ == "Last" || direction_ == "Previous";
        if (direction_ == "Previous")
            bench_.card().PubACTLocation = static_cast<int32_t>(Records(dir_) + 1);
        int32_t stopped = bench_.read(dir_, row_, direction_, fromDate_);
        return stopped == (backward ? 1 : Records(dir_) + 1) && bench_.messages() == 0;
    }

    void run(benchmark::State& state) {
        for (auto _ : state) {
            if (!once()) {
                state.SkipWithError("the walk did not cover the whole file without a find");
                return;
            }
        }
        state.SetBytesProcessed(state.iterations() * FileBytes(DocFile(dir_)));
    }

private:
    BenchCard bench_;
    std::string dir_;
    int16_t row_;
    std::string direction_;
    std::string fromDate_;
};

std::shared_ptr<Walker> CustomerWalk(const std::string& dir, const std::string& direction) {
    auto walker = std::make_shared<Walker>(dir, kInvoiceRow, direction);
    walker->bench().search("CustomerName", kNoCustomer);
    return walker;
}

std::shared_ptr<Walker> ItemKeyWalk(const std::string& dir, const std::string& direction) {
    auto walker = std::make_shared<Walker>(dir, kInvoiceRow, direction);
    walker->bench().search("ItemKey", kNoItem);
    walker->bench().card().txtItemKey.setText(FromUtf8(Utf8(kNoItem)));
    return walker;
}

Work Once(std::shared_ptr<Walker> walker) {
    return [walker] { return walker->once(); };
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
        Walker(Data().big, kBondedExitRow, "First").run(state);
    });
    Register("Scan/CustomerName/1GiB",
             [](benchmark::State& state) { CustomerWalk(Data().big, "First")->run(state); });
    Register("Scan/CustomerName/100MiB",
             [](benchmark::State& state) { CustomerWalk(Data().medium, "First")->run(state); });
    Register("Scan/ItemKey/1GiB",
             [](benchmark::State& state) { ItemKeyWalk(Data().big, "First")->run(state); });
}

// Backward walks against the same walks forward, in turn.
void RegisterBackward() {
    RegisterPair("Pair/LastVsFirst/CustomerName/1GiB", [] {
        return std::pair{Once(CustomerWalk(Data().big, "Last")),
                         Once(CustomerWalk(Data().big, "First"))};
    });
    RegisterPair("Pair/LastVsFirst/ItemKey/1GiB", [] {
        return std::pair{Once(ItemKeyWalk(Data().big, "Last")),
                         Once(ItemKeyWalk(Data().big, "First"))};
    });
    RegisterPair("Pair/PreviousVsFirst/FromDate/1GiB", [] {
        return std::pair{
            Once(std::make_shared<Walker>(Data().big, kInvoiceRow, "Previous", kAfterAll)),
            Once(std::make_shared<Walker>(Data().big, kInvoiceRow, "First", kAfterAll))};
    });
}

// Progress on: a full frame and a listener that counts its calls. Off:
// nothing listens and the frame has no width, so the bar never changes. The
// two differ by little, so they take more rounds than the other pairs.
void RegisterProgress() {
    constexpr int kProgressRounds = 16;
    RegisterPair(
        "Pair/ProgressOnVsOff/1GiB",
        [] {
            auto on = std::make_shared<Walker>(Data().big, kBondedExitRow, "First");
            auto calls = std::make_shared<int64_t>(0);
            auto listening = std::make_shared<Connection>(
                on->bench().card().ProgressFill.changed.connect([calls] { ++*calls; }));
            auto off = std::make_shared<Walker>(Data().big, kBondedExitRow, "First");
            off->bench().card().ProgressFrame.setWidth(0);
            Work counted = [on, calls, listening] { return on->once() && *calls > 0; };
            return std::pair{counted, Once(off)};
        },
        kProgressRounds);
}

void RegisterMemory() {
    for (const auto& [name, dir] :
         {std::pair{"100MiB", &DataSets::medium}, std::pair{"1GiB", &DataSets::big}}) {
        auto peak = [dir](benchmark::State& state) {
            ResidentMemory memory;
            for (auto _ : state) {
                memory = MeasureInChild([dir] { ItemKeyWalk(Data().*dir, "First")->once(); });
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
