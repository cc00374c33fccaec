// The company scan: the stored-name conversion, the chooser's sort, the scan
// of a main directory, and the drive list and directory tree it works with.
#include "forms/Companies.h"

#include "TestCompany.h"
#include "platform/Error.h"
#include "platform/ListControls.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace dovrel {
namespace {

using nlohmann::json;
using test::TempDir;
using test::U;
using test::W;

void WriteNamed(const std::filesystem::path& dir, const json& name) {
    sample::WriteCompany(json{{"company", {{"name", name}}}}, dir);
}

std::vector<std::string> Paths(const std::vector<CompanyEntry>& table) {
    std::vector<std::string> paths;
    for (const CompanyEntry& entry : table)
        paths.push_back(entry.path);
    return paths;
}

TEST(CompaniesTest, StoredNamesComeOutInLogicalOrder) {
    EXPECT_EQ(U(WAsc2Heb("\x80\x81\x82")), "גבא");
    EXPECT_EQ(U(WAsc2Heb("12 \x82\x81\x80")), "אבג 12");
    EXPECT_EQ(WAsc2Heb("AB C"), " ABC");
    EXPECT_EQ(WAsc2Heb(""), "");
    // Bytes above the letters are neutral and go to the front like a space.
    EXPECT_EQ(WAsc2Heb(std::string("a\x9B\xFF\x9A", 4)), "\xFA\xFF\x9B"
                                                         "a");
    for (const char* name : {"דמו בע\"מ", "חברה 12", "אלפא-בטא"})
        EXPECT_EQ(U(WAsc2Heb(sample::DosVisual(name))), name) << name;
}

TEST(CompaniesTest, TheSortOrdersByCodePointAndLeavesEqualNamesWhereItPutsThem) {
    auto entry = [](const std::string& name, const std::string& path) {
        std::string field = name;
        field.resize(kCompanyNameField, ' ');
        return CompanyEntry{path, field, {}, {}};
    };
    // Code points, not bytes: the euro sign (byte 0x80) comes after alef (0xE0);
    // a blank name comes first. (Equal names: the scan below.)
    std::vector<CompanyEntry> table = {entry("\x80", "euro"), entry("\xE0", "alef"),
                                       entry("", "blank"), entry("z", "z")};
    SortCompanies(table, 0, 3);
    EXPECT_EQ(Paths(table), (std::vector<std::string>{"blank", "z", "alef", "euro"}));

    // Only the given positions move.
    table = {entry("z", "0"), entry("b", "1"), entry("a", "2"), entry("c", "3")};
    SortCompanies(table, 1, 2);
    EXPECT_EQ(Paths(table), (std::vector<std::string>{"0", "2", "1", "3"}));
    EXPECT_THROW(SortCompanies(table, 0, 4), Error);
}

TEST(CompaniesTest, ScanFindsTheCompanyDirectoriesJustBelowTheMainDirectory) {
    TempDir main;
    const auto& root = main.path();
    WriteNamed(root / "comp02", "אלפא");
    WriteNamed(root / "comp01", "בטא");
    WriteNamed(root / "deep" / "inner", "עמוק");
    WriteNamed(root / ".hidden", "נסתר");
    WriteNamed(root / "blank", ""); // kept in the table but not listed
    std::filesystem::create_directories(root / "empty");
    std::filesystem::create_directories(root / "upper");
    std::filesystem::copy_file(root / "comp01" / "adf.fix", root / "upper" / "ADF.FIX");
    std::filesystem::create_directories(root / "short");
    std::ofstream(root / "short" / "Adf.Fix", std::ios::binary) << "AB";
    std::ofstream(root / "ADF.FIX") << "not a company directory";

    std::string base = FromUtf8(Utf8(root.string()));
    std::vector<CompanyEntry> table = FindCompanies(base);
    ASSERT_EQ(table.size(), 5u);
    // Whole paths, however long, and names filled to 20 bytes.
    EXPECT_GT(base.size(), 30u);
    // comp01 and upper share a name; the sort leaves them in this order.
    EXPECT_EQ(Paths(table),
              (std::vector<std::string>{base + "/blank", base + "/short", base + "/comp02",
                                        base + "/upper", base + "/comp01"}));
    EXPECT_EQ(table[0].name, std::string(20, ' '));
    EXPECT_EQ(table[1].name, "AB" + std::string(18, ' '));
    EXPECT_EQ(ListedName(table[0]), "");
    EXPECT_EQ(U(ListedName(table[2])), "אלפא");
    EXPECT_EQ(U(ListedName(table[4])), "בטא");

    // A separator at the end is not doubled; a missing directory is an error.
    EXPECT_EQ(Paths(FindCompanies(base + "/")), Paths(table));
    EXPECT_EQ(FindCompanies(base + "/empty").size(), 0u);
    EXPECT_THAT([&] { FindCompanies(base + "/missing"); },
                ::testing::ThrowsMessage<Error>(::testing::HasSubstr("missing")));
}

TEST(CompaniesTest, DrivesAreTheMountPointsWithTheRootFirst) {
    std::string table = "sysfs /sys sysfs rw 0 0\n"
                        "/dev/sdb1 /mnt/data ext4 rw 0 0\n"
                        "/dev/sda1 / ext4 rw 0 0\n"
                        "proc /proc proc rw 0 0\n"
                        "/dev/sdc1 /media/my\\040disk vfat rw 0 0\n"
                        "/dev/sdb1 /mnt/data ext4 rw 0 0\n"
                        "garbage\n"
                        "/dev/sdd1 /mnt/\xd7\x90 ext4 rw 0 0\n";
    EXPECT_EQ(MountPoints(table),
              (std::vector<std::string>{"/", "/media/my disk", "/mnt/data", W("/mnt/א")}));
    EXPECT_EQ(MountPoints(""), std::vector<std::string>{"/"});
    EXPECT_EQ(SystemMountPoints().front(), "/");

    DriveListBox drives("PathDrive", {"/", "/mnt/data"});
    EXPECT_EQ(drives.Drive(), "/");
    drives.setDrive("/mnt/data");
    EXPECT_EQ(drives.ListIndex(), 1);
    EXPECT_THROW(drives.setDrive("c:"), Error);
    EXPECT_EQ(drives.Drive(), "/mnt/data");
}

TEST(CompaniesTest, TheDirectoryTreeShowsOnlyDirectoriesThatExist) {
    TempDir dir;
    std::ofstream(dir.path() / "file") << "x";
    DirListBox tree("MainDir");
    int changes = 0;
    Connection watching = tree.changed.connect([&] { ++changes; });
    tree.setPath(FromUtf8(Utf8(dir.str())));
    tree.setPath(FromUtf8(Utf8(dir.str())));
    EXPECT_EQ(changes, 1);
    for (std::string bad : {std::string(), dir.str() + "/missing", dir.str() + "/file"})
        EXPECT_THROW(tree.setPath(FromUtf8(Utf8(bad))), Error) << bad;
    EXPECT_EQ(tree.Path(), FromUtf8(Utf8(dir.str())));
}

} // namespace
} // namespace dovrel
