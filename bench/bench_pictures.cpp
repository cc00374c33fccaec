// FillPicPath giving a 40-line document its pictures from a picture database
// of 1,000 ranges, against reading those ranges alone. Needs no data
// directories: the database is made in a private temporary directory.

#include "BenchSupport.h"

#include "pictures/PictureDb.h"
#include "platform/Encoding.h"

#include <cstdio>
#include <filesystem>
#include <random>
#include <string>

namespace dovrel::bench {
namespace {

constexpr int kRanges = 1000;
constexpr int kLines = 40;

std::string Padded(int number, int width) {
    std::string text = std::to_string(number);
    return std::string(static_cast<size_t>(width) - text.size(), '0') + text;
}

// Ranges of ten item keys each, over category codes 001 to 500 or open, and
// one open range under all of them.
std::vector<PictureRange> Ranges() {
    std::vector<PictureRange> ranges;
    ranges.push_back({0, std::nullopt, "ZZZZZZZZZZZZ", std::nullopt, "999", "default.jpg"});
    for (int i = 1; i < kRanges; ++i) {
        PictureRange range{
            0,     "K" + Padded(i * 10, 6),      "K" + Padded(i * 10 + 9, 6), std::nullopt,
            "500", "pic" + Padded(i, 4) + ".jpg"};
        if (i % 3 == 0)
            range.FromCatCode = "001";
        ranges.push_back(range);
    }
    return ranges;
}

class PictureData {
public:
    PictureData() {
        dir_ = std::filesystem::temp_directory_path() /
               ("dovrel-bench-pictures-" + std::to_string(std::random_device()()));
        std::filesystem::create_directories(dir_);
        dbName_ = FromUtf8(Utf8((dir_ / PictureDb::kFileName).string()));
        PictureDb db(dbName_);
        db.create(false);
        db.replaceAll(Ranges());
    }
    ~PictureData() {
        std::error_code ec;
        std::filesystem::remove_all(dir_, ec);
    }
    const std::string& dbName() const { return dbName_; }

private:
    std::filesystem::path dir_;
    std::string dbName_;
};

// Forty lines spread over the ranges, one in eight without a category code.
void FillDocument(CurrentDocument& doc) {
    doc.clearLines();
    for (int k = 1; k <= kLines; ++k) {
        DocumentLine& line = doc.lines[static_cast<size_t>(k)];
        line.itemKey = "K" + Padded(k * 247 % (kRanges * 10), 6);
        line.itemKey.resize(12, ' ');
        line.catCode = k % 8 == 0 ? "   " : Padded(k * 13 % 600, 3);
    }
    doc.lineCount = kLines;
}

void RegisterPictures(const PictureData& data) {
    Register("PictureRanges/Read1000", [&data](benchmark::State& state) {
        PictureDb db(data.dbName());
        for (auto _ : state)
            benchmark::DoNotOptimize(db.rangesInLookupOrder());
    })->Unit(benchmark::kMicrosecond);
    Register("FillPicPath/1000Ranges/40Lines", [&data](benchmark::State& state) {
        BenchCard bench;
        CurrentDocument& doc = bench.card().shared().Doc;
        std::string dbName = data.dbName();
        for (auto _ : state) {
            state.PauseTiming();
            FillDocument(doc);
            state.ResumeTiming();
            bench.card().FillPicPath(dbName);
        }
        if (doc.lines[1].picFile == std::string(50, ' '))
            state.SkipWithError("the first line got no picture");
    })->Unit(benchmark::kMicrosecond);
}

} // namespace
} // namespace dovrel::bench

int main(int argc, char** argv) {
    benchmark::Initialize(&argc, argv); // data directories, when given, are not needed
    dovrel::bench::PictureData data;
    dovrel::bench::RegisterPictures(data);
    benchmark::RunSpecifiedBenchmarks();
    benchmark::Shutdown();
    return 0;
}
