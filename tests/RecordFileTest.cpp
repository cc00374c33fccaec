// The block reader under the document and item scans, and path resolution.

#include "fixfiles/RecordFile.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "TestCompany.h"

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

namespace fs = std::filesystem;

// A file of n records of length len whose record r is filled with byte r % 251.
void WriteNumbered(const fs::path& path, int n, size_t len, size_t extra = 0) {
    std::ofstream out(path, std::ios::binary);
    for (int r = 1; r <= n; ++r)
        out << std::string(len, static_cast<char>(r % 251));
    out << std::string(extra, 'x');
}

TEST(RecordFileTest, ReadsRecordsForwardAndBackwardAcrossBlocks) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 100, 7, 3);
    RecordFile file(path.string(), 7, 50);  // blocks of 50 bytes: records straddle them
    EXPECT_EQ(file.length(), 703);
    for (int r = 1; r <= 100; ++r) {
        const unsigned char* rec = file.record(r);
        ASSERT_NE(rec, nullptr) << r;
        EXPECT_EQ(rec[0], r % 251) << r;
        EXPECT_EQ(rec[6], r % 251) << r;
    }
    for (int r = 100; r >= 1; --r) {
        const unsigned char* rec = file.record(r);
        ASSERT_NE(rec, nullptr) << r;
        EXPECT_EQ(rec[3], r % 251) << r;
    }
    EXPECT_EQ(file.record(101), nullptr);  // three bytes are not a record
    EXPECT_EQ(file.record(1000000), nullptr);
    EXPECT_EQ(file.record(INT64_MAX), nullptr);
    EXPECT_THROW(file.record(0), Error);
    EXPECT_THROW(file.record(-7), Error);
}

TEST(RecordFileTest, AFileThatShrinksOrGrowsWhileReadIsReadAsItIsNow) {
    test::TempDir dir;
    fs::path path = dir.path() / "DATA.FIX";
    WriteNumbered(path, 1000, 10);
    RecordFile file(path.string(), 10, 100);
    ASSERT_NE(file.record(1), nullptr);
    fs::resize_file(path, 55);  // five and a half records left
    EXPECT_EQ(file.record(1)[0], 1);   // still in the block read before
    EXPECT_EQ(file.record(500), nullptr);
    for (int r = 999; r > 5; --r)
        EXPECT_EQ(file.record(r), nullptr) << r;
    ASSERT_NE(file.record(5), nullptr);
    EXPECT_EQ(file.record(5)[0], 5);
    EXPECT_EQ(file.record(6), nullptr);

    WriteNumbered(path, 20, 10);  // the file grows again
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
    try {
        RecordFile file(fifo.string(), 10);  // must not wait for a writer
        FAIL() << "a named pipe was opened as a record file";
    } catch (const Error& e) {
        EXPECT_NE(std::string(e.what()).find("not a regular file"), std::string::npos);
    }
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
    EXPECT_FALSE(FileExists(base + "\\COMP02"));  // a directory is not a file
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
