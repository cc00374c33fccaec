// The block reader under the document and item scans, and path resolution.

#include "fixfiles/RecordFile.h"
#include "TestCompany.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

namespace fs = std::filesystem;

using test::WriteNumbered;

TEST(RecordFileTest, ReadsRecordsForwardAndBackwardAcrossBlocks) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 100, 7, 3);
    RecordFile file(path.string(), 7, 50); // blocks of 50 bytes: records straddle them
    EXPECT_EQ(file.length(), 703);
    for (int i = 1; i <= 200; ++i) {
        int r = i <= 100 ? i : 201 - i; // forward, then backward
        const char* rec = reinterpret_cast<const char*>(file.record(r));
        ASSERT_NE(rec, nullptr) << r;
        EXPECT_EQ(std::string(rec, 7), std::string(7, static_cast<char>(r))) << r;
    }
    for (int64_t past : {int64_t{101}, int64_t{1000000}, INT64_MAX}) // 101: three bytes
        EXPECT_EQ(file.record(past), nullptr) << past;
    EXPECT_THROW(file.record(0), Error);
    EXPECT_THROW(file.record(-7), Error);
}

TEST(RecordFileTest, AFileThatShrinksOrGrowsWhileReadIsReadAsItIsNow) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 1000, 10);
    RecordFile file(path.string(), 10, 100);
    ASSERT_NE(file.record(1), nullptr);
    fs::resize_file(path, 55);       // five and a half records left
    EXPECT_EQ(file.record(1)[0], 1); // still in the block read before
    EXPECT_EQ(file.record(500), nullptr);
    for (int r = 999; r > 5; --r)
        EXPECT_EQ(file.record(r), nullptr) << r;
    ASSERT_NE(file.record(5), nullptr);
    EXPECT_EQ(file.record(5)[0], 5);
    EXPECT_EQ(file.record(6), nullptr);

    WriteNumbered(path, 20, 10); // the file grows again
    RecordFile again(path.string(), 10, 100);
    ASSERT_NE(again.record(20), nullptr);
    EXPECT_EQ(again.record(20)[0], 20);
}

TEST(RecordFileTest, RefusesWhatIsNotARegularFile) {
    test::TempDir dir;
    EXPECT_THROW(RecordFile((dir.path() / "missing").string(), 10), Error);
    EXPECT_THROW(RecordFile(dir.str(), 10), Error);
    fs::path fifo = dir.path() / "PIPE.FIX";
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    // Must not wait for a writer.
    EXPECT_THAT([&] { RecordFile(fifo.string(), 10); },
                testing::ThrowsMessage<Error>(testing::HasSubstr("not a regular file")));
}

TEST(FileSystemTest, ResolvesDosPathsWithoutRegardToCase) {
    test::TempDir dir;
    fs::create_directories(dir.path() / "Comp02");
    std::ofstream(dir.path() / "Comp02" / "ITM.FIX") << "x";
    std::ofstream(dir.path() / "Comp02" / "adf.fix") << "x";
    std::string base = FromUtf8(dir.str());

    EXPECT_EQ(ResolvePath(base + "\\comp02\\ITM.fix"), dir.str() + "/Comp02/ITM.FIX");
    EXPECT_EQ(ResolvePath(base + "/COMP02/ADF.FIX"), dir.str() + "/Comp02/adf.fix");
    EXPECT_TRUE(FileExists(base + "\\COMP02\\itm.fix"));
    EXPECT_FALSE(FileExists(base + "\\COMP02")); // a directory is not a file
    EXPECT_FALSE(FileExists(base + "\\COMP02\\ACT.fix"));
    EXPECT_FALSE(FileExists(""));
    // What matches nothing is kept as written.
    EXPECT_EQ(ResolvePath(base + "\\nothing\\ITM.fix"), dir.str() + "/nothing/ITM.fix");

    // Two names that differ only in case: the exact one wins, else the first in order.
    std::ofstream(dir.path() / "Comp02" / "itm.fix") << "y";
    EXPECT_EQ(ResolvePath(base + "/Comp02/itm.fix"), dir.str() + "/Comp02/itm.fix");
    EXPECT_EQ(ResolvePath(base + "/Comp02/Itm.Fix"), dir.str() + "/Comp02/ITM.FIX");

    // Hebrew names travel as code page 1255 in the core and UTF-8 on disk.
    fs::create_directories(dir.path() / "חברה");
    std::ofstream(dir.path() / "חברה" / "ISHP.FIX") << "x";
    EXPECT_TRUE(FileExists(base + FromUtf8("\\חברה\\ISHP.FIX")));
}

} // namespace
} // namespace dovrel
