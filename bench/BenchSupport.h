#pragma once

// What the benchmark programs share: the data directories bench/run makes,
// the baselines that read a file without decoding it, and a control to run
// the readers on.

#include "control/Card.h"
#include "control/ModuleState.h"
#include "platform/Messages.h"

#include <benchmark/benchmark.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <utility>

namespace dovrel::bench {

// The company directories, as given on the command line by bench/run:
// a document file of 100 MiB and one of 1 GiB with 200,000 items.
struct DataSets {
    std::string medium;
    std::string big;
};
const DataSets& Data();

// Reads the command line: Google Benchmark's flags, then MEDIUM_DIR BIG_DIR.
// False (after a message) when the directories are not given.
bool Init(int argc, char** argv);

// Every benchmark is repeated and reported by its fastest run, the figure
// least disturbed by other work on the machine.
benchmark::internal::Benchmark*
Register(const std::string& name, std::function<void(benchmark::State&)> body, int repetitions = 5);

// Two kinds of work measured in turn, in alternating order, so that both
// meet the same conditions on the machine: the pair's figure is the ratio of
// their fastest CPU times, reported in milliseconds as the counters
// "first_ms" and "second_ms". make builds both (once the data is known); a
// work returns false when it went wrong.
using Work = std::function<bool()>;
benchmark::internal::Benchmark*
RegisterPair(const std::string& name, std::function<std::pair<Work, Work>()> make, int rounds = 8);

// A control on a module state of its own, with message boxes nobody sees.
class BenchCard {
public:
    BenchCard();
    Card& card() { return *card_; }
    // The reader as the control's buttons call it; pWizFile is a row of the
    // document-type table.
    int32_t read(const std::string& compPath, int16_t row, const std::string& direction,
                 const std::string& fromDate = std::string());
    void search(const std::string& by, const std::string& utf8Value);
    // The messages shown so far (a benchmark that meets one has gone wrong).
    size_t messages() const { return messages_.shown().size(); }

private:
    ModuleState state_;
    RecordedMessages messages_;
    std::unique_ptr<Card> card_;
};

// The baselines: the whole file read with pread in blocks of the readers'
// size and one byte of every record touched; or one pread per record.
// Both return a sum of the touched bytes, so the reads cannot be left out.
uint64_t PlainBlockRead(const std::string& path, size_t recordLength);
uint64_t ReadPerRecord(const std::string& path, size_t recordLength);

int64_t FileBytes(const std::string& path);

// Resident memory of a child process that ran work: what it held when it
// started (inherited from this process) and its peak (VmHWM), in bytes; -1
// when it could not be measured.
struct ResidentMemory {
    int64_t atStart = -1;
    int64_t peak = -1;
};
ResidentMemory MeasureInChild(const std::function<void()>& work);

} // namespace dovrel::bench
