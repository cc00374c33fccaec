#include "platform/FileReach.h"
#include "TestCompany.h"
#include "forms/Companies.h"
#include "platform/FileSystem.h"
#include "platform/ListControls.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

namespace fs = std::filesystem;

// A thread held to one folder reaches what lies in it, by any spelling, and
// nothing else: not by "..", not through a link out, not by an absolute path.
TEST(FileReachTest, AThreadHeldToAFolderReachesOnlyWhatLiesInIt) {
    test::TempDir temp;
    fs::path root = temp.path() / "root", outside = temp.path() / "outside";
    fs::create_directories(root / "co");
    fs::create_directories(outside);
    std::ofstream(root / "co" / "ITM.FIX") << "x";
    std::ofstream(outside / "ITM.FIX") << "x";
    fs::create_directory_symlink(outside, root / "link");

    FileReach::Limit({root.string()});
    EXPECT_TRUE(FileExists(Path((root / "co" / "itm.fix").string())));
    // A file still to be made inside the folder is judged by the folder.
    EXPECT_EQ(ResolvePath(Path((root / "co" / "NEW.FIX").string())).native(),
              (root / "co" / "NEW.FIX").string());
    for (const fs::path& refused :
         {outside / "ITM.FIX", root / ".." / "outside" / "ITM.FIX", root / "link" / "ITM.FIX",
          root / "missing" / ".." / ".." / "outside" / "ITM.FIX", fs::path("ITM.FIX")}) {
        EXPECT_FALSE(FileExists(Path(refused.string()))) << refused;
        EXPECT_EQ(ResolvePath(Path(refused.string())).native(), FileReach::kOutside) << refused;
    }
    // The chooser's scan does not name a company behind a link out.
    sample::WriteCompany(R"({"company": {"title": "in"}})", root / "co");
    sample::WriteCompany(R"({"company": {"title": "out"}})", outside);
    EXPECT_EQ(FindCompanies(Path(root.string())).size(), 1u);

    std::vector<std::string> drives = SystemMountPoints();
    ASSERT_EQ(drives.size(), 1u);
    EXPECT_EQ(drives[0], fs::canonical(root).string());

    FileReach::Limit({});
    EXPECT_TRUE(FileExists(Path((outside / "ITM.FIX").string())));
    EXPECT_NE(SystemMountPoints(), drives);
}

} // namespace
} // namespace dovrel
