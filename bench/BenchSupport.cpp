#include "BenchSupport.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <ctime>
#include <fstream>
#include <iostream>
#include <vector>

namespace dovrel::bench {
namespace {

DataSets g_data;

// The readers' block is 256 KiB; the baseline reads whole records, so it uses
// the largest multiple of the record length that fits.
size_t BlockFor(size_t recordLength) {
    return (size_t{256} * 1024 / recordLength) * recordLength;
}

class Fd {
public:
    explicit Fd(const std::string& path) : fd_(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {
        if (fd_ < 0)
            ThrowSystemError("Cannot open", path, errno);
    }
    ~Fd() { ::close(fd_); }
    Fd(const Fd&) = delete;
    Fd& operator=(const Fd&) = delete;
    int get() const { return fd_; }

private:
    int fd_;
};

// A field of /proc/self/status in bytes ("VmHWM:   1234 kB"), or -1.
int64_t StatusBytes(const std::string& field) {
    std::ifstream status("/proc/self/status");
    std::string line;
    while (std::getline(status, line)) {
        if (line.rfind(field + ":", 0) == 0)
            return std::stoll(line.substr(field.size() + 1)) * 1024;
    }
    return -1;
}

} // namespace

const DataSets& Data() {
    return g_data;
}

bool Init(int argc, char** argv) {
    benchmark::Initialize(&argc, argv);
    if (argc != 3) {
        std::cerr << "usage: " << argv[0] << " [benchmark flags] MEDIUM_DIR BIG_DIR\n"
                  << "Run through bench/run, which makes the data.\n";
        return false;
    }
    g_data = {argv[1], argv[2]};
    return true;
}

benchmark::internal::Benchmark*
Register(const std::string& name, std::function<void(benchmark::State&)> body, int repetitions) {
    auto fastest = [](const std::vector<double>& runs) {
        return *std::min_element(runs.begin(), runs.end());
    };
    return benchmark::RegisterBenchmark(name.c_str(), std::move(body))
        ->Repetitions(repetitions)
        ->ComputeStatistics("min", fastest)
        ->ReportAggregatesOnly(true)
        ->Unit(benchmark::kMillisecond);
}

namespace {

double CpuMilliseconds() {
    timespec now{};
    ::clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) * 1e3 + static_cast<double>(now.tv_nsec) / 1e6;
}

} // namespace

benchmark::internal::Benchmark*
RegisterPair(const std::string& name, std::function<std::pair<Work, Work>()> make, int rounds) {
    auto body = [make](benchmark::State& state) {
        std::pair<Work, Work> works = make();
        const Work* both[2] = {&works.first, &works.second};
        double fastest[2] = {1e300, 1e300};
        int round = 0;
        for (auto _ : state) {
            for (int k = 0; k < 2; ++k) {
                int which = (round + k) % 2;
                double start = CpuMilliseconds();
                if (!(*both[which])()) {
                    state.SkipWithError("a work of the pair went wrong");
                    return;
                }
                fastest[which] = std::min(fastest[which], CpuMilliseconds() - start);
            }
            ++round;
        }
        state.counters["first_ms"] = fastest[0];
        state.counters["second_ms"] = fastest[1];
    };
    return benchmark::RegisterBenchmark(name.c_str(), std::move(body))
        ->Iterations(rounds)
        ->Unit(benchmark::kMillisecond);
}

BenchCard::BenchCard() : card_(std::make_unique<Card>(messages_, state_)) {}

int32_t BenchCard::read(const std::string& compPath, int16_t row, const std::string& direction,
                        const std::string& fromDate) {
    int16_t wizFile = row;
    std::string start = direction;
    std::string from = fromDate;
    return card_->ReadStock(FromUtf8(Utf8(compPath)), wizFile, card_->PubSearchBy,
                            card_->PubSearchValue, start, from);
}

void BenchCard::search(const std::string& by, const std::string& utf8Value) {
    card_->PubSearchBy = by;
    card_->PubSearchValue = Variant(FromUtf8(Utf8(utf8Value)));
}

uint64_t PlainBlockRead(const std::string& path, size_t recordLength) {
    Fd fd(path);
    std::vector<unsigned char> block(BlockFor(recordLength));
    uint64_t sum = 0;
    off_t offset = 0;
    for (;;) {
        ssize_t got = ::pread(fd.get(), block.data(), block.size(), offset);
        if (got <= 0)
            break;
        for (size_t at = 0; at + recordLength <= static_cast<size_t>(got); at += recordLength)
            sum += block[at];
        offset += got;
    }
    return sum;
}

uint64_t ReadPerRecord(const std::string& path, size_t recordLength) {
    Fd fd(path);
    std::vector<unsigned char> record(recordLength);
    uint64_t sum = 0;
    off_t offset = 0;
    while (::pread(fd.get(), record.data(), recordLength, offset) ==
           static_cast<ssize_t>(recordLength)) {
        sum += record[0];
        offset += static_cast<off_t>(recordLength);
    }
    return sum;
}

int64_t FileBytes(const std::string& path) {
    struct stat st;
    return ::stat(path.c_str(), &st) == 0 ? st.st_size : -1;
}

ResidentMemory MeasureInChild(const std::function<void()>& work) {
    int pipeFds[2];
    if (::pipe(pipeFds) != 0)
        return {};
    pid_t child = ::fork();
    if (child == 0) {
        ::close(pipeFds[0]);
        ResidentMemory measured;
        measured.atStart = StatusBytes("VmRSS");
        // Starts the peak afresh at what the child holds now ("5" resets it).
        std::ofstream("/proc/self/clear_refs") << "5";
        try {
            work();
            measured.peak = StatusBytes("VmHWM");
        } catch (...) {
        }
        ssize_t ignored = ::write(pipeFds[1], &measured, sizeof measured);
        (void)ignored;
        ::_exit(0);
    }
    ::close(pipeFds[1]);
    ResidentMemory measured;
    if (child < 0 || ::read(pipeFds[0], &measured, sizeof measured) != sizeof measured)
        measured = {};
    ::close(pipeFds[0]);
    if (child > 0)
        ::waitpid(child, nullptr, 0);
    return measured;
}

} // namespace dovrel::bench
