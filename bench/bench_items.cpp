// ReadITM giving a 40-line document its items from a large ITM.fix, against
// reading the items file without decoding it.

#include "BenchSupport.h"

#include "fixfiles/ItemsFile.h"
#include "fixfiles/RecordFields.h"
#include "fixfiles/RecordFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Encoding.h"

#include <string>

namespace dovrel::bench {
namespace {

constexpr int kLines = 40;
constexpr int kMissing = 2; // lines whose item is not in the file

std::string ItemsFile() {
    return Data().big + "/ITM.fix";
}

// A document of 40 lines: items spread over the whole file, the last two
// lines with keys the file does not have.
void FillDocument(CurrentDocument& doc) {
    RecordFile file(Path(ItemsFile()), kItmRecordLength);
    int64_t last = LastScanRecord(file.length(), kItmRecordLength);
    doc.clearLines();
    for (int k = 1; k <= kLines; ++k) {
        std::string key = "ZZ-" + std::to_string(k);
        if (k <= kLines - kMissing) {
            const unsigned char* record = file.record(2 + (last - 2) * k / (kLines - kMissing));
            key = record ? TrimCopy(LogicalText(Field(record, 0, 12))) : key;
        }
        key.resize(12, ' ');
        doc.lines[static_cast<size_t>(k)].itemKey = key;
    }
    doc.lineCount = kLines;
}

bool AllFound(const CurrentDocument& doc) {
    for (int k = 1; k <= kLines - kMissing; ++k)
        if (doc.lines[static_cast<size_t>(k)].foreignName.empty())
            return false;
    return true;
}

void RegisterItems() {
    Register("PlainRead/Items200k", [](benchmark::State& state) {
        for (auto _ : state)
            benchmark::DoNotOptimize(PlainBlockRead(ItemsFile(), kItmRecordLength));
        state.SetBytesProcessed(state.iterations() * FileBytes(ItemsFile()));
    });
    Register("ReadITM/Items200k/40Lines", [](benchmark::State& state) {
        BenchCard bench;
        FillDocument(bench.card().shared().Doc);
        std::string compPath = FromUtf8(Utf8(Data().big));
        for (auto _ : state)
            bench.card().ReadITM(compPath);
        if (!AllFound(bench.card().shared().Doc))
            state.SkipWithError("the items of the document were not all found");
        state.SetBytesProcessed(state.iterations() * FileBytes(ItemsFile()));
    });
}

} // namespace
} // namespace dovrel::bench

int main(int argc, char** argv) {
    if (!dovrel::bench::Init(argc, argv))
        return 2;
    dovrel::bench::RegisterItems();
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
