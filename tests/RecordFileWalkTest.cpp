// The block reader under the walks the document reader makes: backward, with
// looks ahead at each document's later records, over blocks that records
// straddle.

#include "fixfiles/RecordFile.h"

#include "TestCompany.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace dovrel {
namespace {

TEST(RecordFileWalkTest, BackwardWalksThatLookAheadReadEveryRecordRight) {
    test::TempDir dir;
    std::filesystem::path path = dir.path() / "DATA.FIX";
    test::WriteNumbered(path, 300, 7);
    for (size_t blockSize : {7, 20, 50, 64, 1000}) {
        RecordFile file(path.string(), 7, blockSize);
        for (int r = 300; r >= 1; --r) {
            // As a header at r: its continuation and a few lines after it.
            for (int ahead = r; ahead <= std::min(300, r + (r % 5)); ++ahead) {
                const char* rec = reinterpret_cast<const char*>(file.record(ahead));
                ASSERT_NE(rec, nullptr) << blockSize << " " << r << " " << ahead;
                ASSERT_EQ(std::string(rec, 7), std::string(7, static_cast<char>(ahead % 251)))
                    << blockSize << " " << r << " " << ahead;
            }
        }
        EXPECT_EQ(file.record(301), nullptr);
    }
}

TEST(RecordFileWalkTest, AShortenedFileHidesRecordsThatAnOlderBlockStillHolds) {
    test::TempDir dir;
    std::filesystem::path path = dir.path() / "DATA.FIX";
    test::WriteNumbered(path, 100, 10);
    RecordFile file(path.string(), 10, 100);
    ASSERT_NE(file.record(1), nullptr);  // a block of records 1 to 10
    ASSERT_NE(file.record(50), nullptr); // and after it, 50 to 59
    std::filesystem::resize_file(path, 55);
    EXPECT_EQ(file.record(70), nullptr); // read afresh: the end of the file is met
    EXPECT_EQ(file.record(8), nullptr);  // so the older block no longer counts
    ASSERT_NE(file.record(5), nullptr);
    EXPECT_EQ(file.record(5)[0], 5);
    EXPECT_EQ(file.record(6), nullptr);
}

} // namespace
} // namespace dovrel
