// The block reader under the walks the document reader makes: backward, with
// looks ahead at each document's later records, over blocks that records
// straddle. (A file shortened under it: RecordFileTest.)

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
        RecordFile file(Path(path.string()), 7, blockSize);
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

} // namespace
} // namespace dovrel
