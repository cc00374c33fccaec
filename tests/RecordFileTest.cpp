// The block reader under the document and item scans, and path resolution.

#include "fixfiles/RecordFile.h"
#include "TestCompany.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

namespace fs = std::filesystem;

using test::WriteNumbered;

// The walks the document reader makes: backward, with looks ahead at each
// document's later records, over blocks that records straddle.
TEST(RecordFileTest, BackwardWalksThatLookAheadReadEveryRecordRight) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 300, 7, 3);
    for (size_t blockSize : {7, 20, 50, 64, 1000}) {
        RecordFile file(Path(path.string()), 7, blockSize);
        EXPECT_EQ(file.length(), 2103);
        for (int r = 300; r >= 1; --r) {
            // As a header at r: its continuation and a few lines after it.
            for (int ahead = r; ahead <= std::min(300, r + (r % 5)); ++ahead) {
                const char* rec = reinterpret_cast<const char*>(file.record(ahead));
                ASSERT_NE(rec, nullptr) << blockSize << " " << r << " " << ahead;
                ASSERT_EQ(std::string(rec, 7), std::string(7, static_cast<char>(ahead % 251)))
                    << blockSize << " " << r << " " << ahead;
            }
        }
        for (int64_t past : {int64_t{301}, int64_t{1000000}, INT64_MAX}) // 301: three bytes
            EXPECT_EQ(file.record(past), nullptr) << past;
        EXPECT_THROW(file.record(0), Error);
        EXPECT_THROW(file.record(-7), Error);
    }
}

TEST(RecordFileTest, AFileThatShrinksWhileReadIsReadAsItIsNow) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 1000, 10);
    RecordFile file(Path(path.string()), 10, 100);
    ASSERT_NE(file.record(50), nullptr); // the blocks of records 50 to 59
    ASSERT_NE(file.record(1), nullptr);  // and 1 to 10 are kept
    fs::resize_file(path, 55);           // five and a half records left
    EXPECT_EQ(file.record(1)[0], 1);     // still in the block read before
    // Read afresh, the end of the file is met: the older blocks no longer count.
    EXPECT_EQ(file.record(500), nullptr);
    for (int r = 999; r > 5; --r)
        EXPECT_EQ(file.record(r), nullptr) << r;
    ASSERT_NE(file.record(5), nullptr);
    EXPECT_EQ(file.record(5)[0], 5);
    EXPECT_EQ(file.record(6), nullptr); // half of it is in the block just read
}

TEST(RecordFileTest, RefusesWhatIsNotARegularFile) {
    test::TempDir dir;
    EXPECT_THROW(RecordFile(Path((dir.path() / "missing").string()), 10), Error);
    EXPECT_THROW(RecordFile(Path(dir.str()), 10), Error);
    fs::path fifo = dir.path() / "PIPE.FIX";
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    // Must not wait for a writer.
    EXPECT_THAT([&] { RecordFile(Path(fifo.string()), 10); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("not a regular file")));
}

TEST(FileSystemTest, ResolvesDosPathsWithoutRegardToCase) {
    test::TempDir dir;
    fs::create_directories(dir.path() / "Comp02");
    std::ofstream(dir.path() / "Comp02" / "ITM.FIX") << "x";
    std::ofstream(dir.path() / "Comp02" / "adf.fix") << "x";
    std::string base = FromUtf8(Utf8(dir.str()));

    // Hebrew names travel as code page 1255 in the core and UTF-8 on disk.
    fs::create_directories(dir.path() / "חברה");
    std::ofstream(dir.path() / "חברה" / "ISHP.FIX") << "x";
    // A directory is not a file; what matches nothing is kept as written.
    for (const auto& [path, exists] : {std::pair{"\\COMP02\\itm.fix", true},
                                       {"\\COMP02", false},
                                       {"\\COMP02\\ACT.fix", false},
                                       {"\\חברה\\ISHP.FIX", true}})
        EXPECT_EQ(FileExists(PathFromCp1255(base + FromUtf8(Utf8(path)))), exists) << path;
    EXPECT_FALSE(FileExists(Path()));
    EXPECT_EQ(ResolvePath(PathFromCp1255(base + "\\nothing\\ITM.fix")).native(),
              dir.str() + "/nothing/ITM.fix");

    // Two names that differ only in case: the exact one wins, else the first in order.
    std::ofstream(dir.path() / "Comp02" / "itm.fix") << "y";
    for (const auto& [path, resolved] : {std::pair{"\\comp02\\ITM.fix", "/Comp02/ITM.FIX"},
                                         {"/COMP02/ADF.FIX", "/Comp02/adf.fix"},
                                         {"/Comp02/itm.fix", "/Comp02/itm.fix"},
                                         {"/Comp02/Itm.Fix", "/Comp02/ITM.FIX"}})
        EXPECT_EQ(ResolvePath(PathFromCp1255(base + path)).native(), dir.str() + resolved) << path;
}

} // namespace
} // namespace dovrel
