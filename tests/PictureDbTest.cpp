// The picture database: its text order, its schema's rules, the range lookup,
// re-creation, and the failures that must leave a stored file as it was.

#include "pictures/PictureDb.h"
#include "ChildFailure.h"
#include "TestCompany.h"
#include "fixfiles/CurrentDocument.h"
#include "pictures/PictureCache.h"
#include "pictures/PictureCollation.h"
#include "pictures/PictureLookup.h"
#include "platform/Error.h"
#include "platform/Messages.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sqlite3.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <functional>

#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

namespace dovrel {
namespace {

using test::FailureOf;
using test::U;
using test::W;
using ::testing::HasSubstr;
using Range = PictureRange;
using Text = std::optional<std::string>;

Range R(Text fromKey, Text toKey, Text fromCode, Text toCode, Text pic) {
    return {0, fromKey, toKey, fromCode, toCode, pic};
}

// The failure of work in a child process as user "nobody" (when run as root)
// and with a file size limit when one is given.
std::string FailureInChild(const std::function<void()>& work, rlim_t sizeLimit = 0) {
    return test::FailureInChild(
        [sizeLimit] {
            rlimit limit{sizeLimit, sizeLimit};
            return test::BecomeNobody() &&
                   (sizeLimit == 0 ||
                    (signal(SIGXFSZ, SIG_IGN) != SIG_ERR && setrlimit(RLIMIT_FSIZE, &limit) == 0));
        },
        work);
}

class PictureDbTest : public ::testing::Test {
protected:
    void SetUp() override {
        chmod(dir.path().c_str(), 0777); // the children run as "nobody"
        db.setBusyTimeout(std::chrono::milliseconds(50));
    }
    // The document lines (item key, category code), pictures looked up.
    std::vector<std::string>
    pictures(const std::vector<std::pair<std::string, std::string>>& lines) {
        CurrentDocument doc;
        doc.lineCount = static_cast<int16_t>(lines.size());
        for (size_t i = 0; i < lines.size(); ++i) {
            doc.lines[i + 1].itemKey = W(lines[i].first);
            doc.lines[i + 1].catCode = W(lines[i].second);
        }
        FillPictures(dbName(), doc, cache);
        std::vector<std::string> shown;
        for (size_t i = 1; i <= lines.size(); ++i) {
            EXPECT_EQ(doc.lines[i].picFile.size(), 50u);
            std::string pic = U(doc.lines[i].picFile);
            shown.push_back(pic.substr(0, pic.find_last_not_of(' ') + 1));
        }
        return shown;
    }
    std::string dbName() const { return FromUtf8(Utf8(file.string())); }
    // Runs SQL on a plain connection, as another program would.
    void otherProgram(const char* sql) {
        sqlite3* raw = nullptr;
        ASSERT_EQ(sqlite3_open(file.c_str(), &raw), SQLITE_OK);
        PictureCollation::instance().registerWith(raw);
        EXPECT_EQ(sqlite3_exec(raw, sql, nullptr, nullptr, nullptr), SQLITE_OK) << sql;
        sqlite3_close(raw);
    }
    // The stored ranges are as they were and no other file (journal, new copy) is left.
    void expectKept(const std::vector<Range>& before) {
        EXPECT_EQ(db.rangesById(), before);
        EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);
    }

    test::TempDir dir;
    std::filesystem::path file = dir.path() / "Dovrel.def";
    PictureDb db{FromUtf8(Utf8(file.string()))};
    PictureCache cache;
};

TEST(PictureCollationTest, OrdersSpaceDigitsLatinHebrewIgnoringCase) {
    const PictureCollation& order = PictureCollation::instance();
    const std::vector<std::string> ascending = {" ", "0", "1",  "10", "100", "1A", "2",  "2A", "5",
                                                "9", "a", "AB", "b",  "z",   "א",  "אב", "ת"};
    for (size_t i = 0; i + 1 < ascending.size(); ++i) {
        std::string a = W(ascending[i]), b = W(ascending[i + 1]);
        EXPECT_LT(order.compare(a, b), 0) << ascending[i] << " before " << ascending[i + 1];
        EXPECT_GT(order.compare(b, a), 0);
        EXPECT_LT(order.sortKey(a), order.sortKey(b)) << ascending[i];
    }
    EXPECT_EQ(order.compare("abc", "ABC"), 0);
    EXPECT_EQ(order.sortKey("Pic"), order.sortKey("pIC"));
    EXPECT_LT(order.compare("01 ", "010"), 0); // a space counts inside a text too
}

TEST_F(PictureDbTest, TheSchemaHoldsEveryWriterToItsRules) {
    db.create(false);
    EXPECT_EQ(db.inspect().kind, PictureDb::FileKind::Pictures);
    // A plain connection, as another program would open the file.
    sqlite3* raw = nullptr;
    ASSERT_EQ(sqlite3_open(file.c_str(), &raw), SQLITE_OK);
    auto run = [&](const std::string& sql) {
        return sqlite3_exec(raw, sql.c_str(), nullptr, nullptr, nullptr);
    };
    const char* insert = "INSERT INTO tItemPicture VALUES ";
    // Without the text order a program cannot write the table at all.
    EXPECT_NE(run(insert + std::string("(1, NULL, NULL, NULL, NULL, NULL)")), SQLITE_OK);
    EXPECT_THAT(sqlite3_errmsg(raw), HasSubstr("no such collation sequence: HEBREW_NOCASE"));
    PictureCollation::instance().registerWith(raw);
    EXPECT_EQ(run(insert + std::string("(1, NULL, NULL, NULL, NULL, NULL)")), SQLITE_OK);
    EXPECT_EQ(run(insert + std::string("(2, 'אאאאאאאאאאאא', 'b', 'ג', 'ddd', 'x.jpg')")),
              SQLITE_OK); // twelve Hebrew letters are twelve characters
    for (const char* refused :
         {"(3, '', 'b', NULL, NULL, 'p')", "(3, 'a', '', NULL, NULL, 'p')",
          "(3, NULL, NULL, '', NULL, 'p')", "(3, NULL, NULL, NULL, '', 'p')",
          "(3, NULL, NULL, NULL, NULL, '')", "(3, 'aaaaaaaaaaaaa', NULL, NULL, NULL, 'p')",
          "(3, NULL, NULL, 'aaaa', NULL, 'p')", "(3, NULL, NULL, NULL, NULL, x'00')",
          "(2147483648, NULL, NULL, NULL, NULL, 'p')", "(1, 'a', 'b', 'c', 'd', 'e')",
          "('x', NULL, NULL, NULL, NULL, 'p')"})
        EXPECT_NE(run(insert + std::string(refused)), SQLITE_OK) << refused;
    EXPECT_EQ(run(insert + std::string("(-2147483648, NULL, NULL, NULL, NULL, 'p')")), SQLITE_OK);
    sqlite3_close(raw);

    std::vector<Range> byId = db.rangesById();
    ASSERT_EQ(byId.size(), 3u);
    EXPECT_EQ(byId[0].RangeID, -2147483648);
    EXPECT_EQ(byId[2].FromItemKey, W("אאאאאאאאאאאא"));
    EXPECT_EQ(byId[1], (Range{1, {}, {}, {}, {}, {}}));
}

TEST_F(PictureDbTest, TheLastRangeInTheLookupOrderGivesTheLinePicture) {
    db.create(false);
    db.replaceAll({R("b", "z", {}, {}, "1"), R({}, "z", "5", {}, "2"),
                   R(W("א"), W("ת"), {}, {}, "3"), R("10", "z", {}, {}, "4"),
                   R("5", "z", {}, {}, "5"), R("B", "z", "1", {}, "6"), R({}, "z", {}, {}, "7")});
    std::vector<std::string> order;
    for (const Range& range : db.rangesInLookupOrder())
        order.push_back(*range.PicFile);
    EXPECT_EQ(order, (std::vector<std::string>{"7", "2", "4", "5", "1", "6", "3"}));

    // The last range in lookup order gives the line picture.
    // Range A is open below and range B sorts after it, so B wins where both hold.
    db.replaceAll(
        {R({}, W("תתתתתתתתתתתת"), {}, "999", "pic001.jpg"), R("100", "199", {}, {}, "b.jpg")});
    EXPECT_EQ(pictures({{"150", "010"}, {"250", "010"}, {"150", "   "}, {"  150       ", "010"}}),
              (std::vector<std::string>{"b.jpg", "pic001.jpg", "", "b.jpg"}));

    db.replaceAll({R("10", "20", {}, {}, "in.jpg")});
    EXPECT_EQ(
        pictures({{"100", "1"}, {"1A", "1"}, {"1a", "1"}, {"3", "1"}, {"2A", "1"}, {"20", "1"}}),
        (std::vector<std::string>{"in.jpg", "in.jpg", "in.jpg", "", "", "in.jpg"}));

    // Codes keep their spaces: " 5 " sorts before "5" and "05" after "0".
    db.replaceAll({R({}, {}, "5", "7", "code.jpg"), R({}, {}, {}, {}, "all.jpg"),
                   R("zz", {}, {}, {}, "late.jpg")});
    EXPECT_EQ(pictures({{"a", "6  "}, {"a", " 6 "}, {"a", "8"}, {"zzz", "1"}, {"b", ""}}),
              (std::vector<std::string>{"code.jpg", "all.jpg", "all.jpg", "late.jpg", ""}));
}

TEST_F(PictureDbTest, TheLookupLeavesLinesAloneWithoutDatabaseOrRangeAndFailsOnANullPicture) {
    CurrentDocument doc;
    doc.lineCount = 2;
    doc.lines[1].catCode = "001";
    doc.lines[1].picFile = "old.jpg" + std::string(43, ' ');
    FillPictures(dbName(), doc, cache); // no file: nothing happens
    EXPECT_EQ(doc.lines[1].picFile.substr(0, 7), "old.jpg");
    db.create(false);
    db.replaceAll({R("x", "y", {}, {}, "xy.jpg")});
    FillPictures(dbName(), doc, cache);
    EXPECT_EQ(doc.lines[1].picFile.substr(0, 7), "old.jpg");

    db.replaceAll({R({}, {}, {}, {}, std::string(50, 'p'))});
    FillPictures(dbName(), doc, cache);
    EXPECT_EQ(doc.lines[1].picFile, std::string(50, 'p'));
    EXPECT_EQ(doc.lines[2].picFile, std::string(50, ' ')); // no code, no picture

    db.replaceAll({R({}, {}, {}, {}, "p")});
    otherProgram("UPDATE tItemPicture SET PicFile = NULL");
    EXPECT_THAT(FailureOf([&] { FillPictures(dbName(), doc, cache); }),
                HasSubstr("The picture range 1 has no picture file"));
}

TEST_F(PictureDbTest, ASaveIsWholeOrNothingAndNamesTheRefusedRow) {
    db.create(false);
    db.replaceAll({R("1", "1", {}, {}, "a"), R("2", "2", {}, {}, "b"), R("3", "3", {}, {}, "c"),
                   R("4", "4", {}, {}, "d"), R("5", "5", {}, {}, "e")});
    const std::vector<Range> before = db.rangesById();
    EXPECT_THAT(FailureOf([&] {
                    db.replaceAll({R("1", "9", {}, {}, "x"), R("2", "", {}, {}, "y")});
                }),
                HasSubstr("row 2: the highest item key (ToItemKey) is empty; nothing was changed"));
    EXPECT_THAT(FailureOf([&] {
                    db.replaceAll({R("1", "9", {}, {}, "x"), R({}, "9", {}, "1234", "y")});
                }),
                HasSubstr("row 2: the highest category code (ToCatCode) is longer than 3"));
    EXPECT_EQ(db.rangesById(), before);

    db.replaceAll({R({}, "9", {}, "1", "x"), R("2", "3", "4", "5", "y")});
    std::vector<Range> after = db.rangesById();
    ASSERT_EQ(after.size(), 2u);
    EXPECT_EQ(after[0], (Range{1, {}, "9", {}, "1", "x"}));
    EXPECT_EQ(after[1], (Range{2, "2", "3", "4", "5", "y"}));
    db.replaceAll({});
    EXPECT_TRUE(db.rangesById().empty());
}

TEST_F(PictureDbTest, ReCreatingReplacesTheFileOnlyWhenTheNewOneIsComplete) {
    db.create(false);
    db.replaceAll({R("a", "b", {}, {}, "p")});
    db.create(false);
    expectKept({});

    // A file limit too small for the new database: the old one stays.
    chmod(file.c_str(), 0644); // the child may run as another user; a re-made file keeps this
    db.replaceAll({R("a", "b", {}, {}, "p")});
    const std::vector<Range> before = db.rangesById();
    EXPECT_THAT(FailureInChild([&] { db.create(false); }, 1024),
                HasSubstr("Cannot create the picture database " + file.string()));
    expectKept(before);

    // A directory that cannot be written: the same.
    chmod(dir.path().c_str(), 0555);
    EXPECT_THAT(FailureInChild([&] { db.create(false); }),
                HasSubstr("cannot create a file beside it: Permission denied"));
    expectKept(before);
    chmod(dir.path().c_str(), 0777);

    std::string missingDir = FromUtf8(Utf8((dir.path() / "no" / "Dovrel.def").string()));
    RecordedMessages messages;
    EXPECT_EQ(CreatePicDB(missingDir, messages), "");
    ASSERT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown()[0].title), "תקלה");
    EXPECT_THAT(messages.shown()[0].text.str(), HasSubstr("Cannot create the picture database"));
    EXPECT_EQ(CreatePicDB(dbName(), messages), dbName());
}

TEST_F(PictureDbTest, ChangesThatFailLeaveTheStoredRangesAsTheyWere) {
    db.create(false);
    db.replaceAll({R("a", "b", {}, {}, "p"), R("c", "d", {}, {}, "q")});
    const std::vector<Range> before = db.rangesById();
    std::vector<Range> many(300,
                            R("aaaaaaaaaaaa", "bbbbbbbbbbbb", "ccc", "ddd", std::string(50, 'x')));

    // A full disk: the file may not grow beyond its size.
    rlim_t size = static_cast<rlim_t>(std::filesystem::file_size(file));
    EXPECT_THAT(FailureInChild([&] { db.replaceAll(many); }, size),
                HasSubstr("Cannot save the picture ranges to " + file.string()));
    expectKept(before);

    // A directory where no journal can be made, the file itself writable.
    chmod(file.c_str(), 0666);
    chmod(dir.path().c_str(), 0555);
    EXPECT_THAT(FailureInChild([&] { db.replaceAll({}); }),
                HasSubstr("Cannot save the picture ranges to " + file.string()));
    EXPECT_EQ(FailureInChild([&] { db.rangesById(); }), ""); // reading needs no journal
    chmod(dir.path().c_str(), 0777);
    expectKept(before);

    // Another program holds the file locked.
    sqlite3* other = nullptr;
    ASSERT_EQ(sqlite3_open(file.c_str(), &other), SQLITE_OK);
    ASSERT_EQ(sqlite3_exec(other, "BEGIN EXCLUSIVE", nullptr, nullptr, nullptr), SQLITE_OK);
    EXPECT_THAT(FailureOf([&] { db.replaceAll({}); }), HasSubstr("database is locked"));
    EXPECT_THAT(FailureOf([&] { db.remove(1); }), HasSubstr("database is locked"));
    EXPECT_THAT(FailureOf([&] { db.create(false); }), HasSubstr("database is locked"));
    sqlite3_exec(other, "ROLLBACK", nullptr, nullptr, nullptr);
    sqlite3_close(other);
    expectKept(before);
}

TEST_F(PictureDbTest, AFileThatIsNotAPictureDatabaseIsNamedAndKept) {
    auto writeFile = [&](const std::string& bytes) {
        std::ofstream(file, std::ios::binary | std::ios::trunc) << bytes;
    };
    const std::string jet = std::string("\0\1\0\0Standard Jet DB\0", 20) + std::string(2000, '\7');
    writeFile(jet);
    PictureDb::Inspection seen = db.inspect();
    EXPECT_EQ(seen.kind, PictureDb::FileKind::Foreign);
    EXPECT_THAT(seen.reason, HasSubstr("Access (Jet) database"));
    EXPECT_THAT(FailureOf([&] { db.rangesById(); }), HasSubstr("not a picture database"));
    EXPECT_THAT(FailureOf([&] { db.replaceAll({}); }), HasSubstr("not a picture database"));
    EXPECT_THAT(FailureOf([&] { db.create(false); }), HasSubstr("it was left as it is"));
    EXPECT_EQ(test::ReadAll(file), jet);
    db.create(true);
    EXPECT_EQ(db.inspect().kind, PictureDb::FileKind::Pictures);

    writeFile("");
    EXPECT_EQ(db.inspect().reason, "the file is empty");
    writeFile(std::string(3000, 'x'));
    EXPECT_EQ(db.inspect().reason, "it is not an SQLite database");

    std::filesystem::remove(file);
    otherProgram("CREATE TABLE other (x)");
    EXPECT_EQ(db.inspect().reason, "it has no table tItemPicture");
    EXPECT_THAT(
        FailureOf([&] { FillPictures(dbName(), *std::make_unique<CurrentDocument>(), cache); }),
        HasSubstr("it has no table tItemPicture"));
}

TEST_F(PictureDbTest, ADamagedFileIsAnErrorUntilReCreated) {
    db.create(false);
    db.replaceAll({R("a", "b", {}, {}, "p")});
    {
        std::fstream damage(file, std::ios::in | std::ios::out | std::ios::binary);
        damage.seekp(4096); // the table's first page
        damage << std::string(4096, '\xff');
    }
    std::string failure = FailureOf([&] { db.rangesById(); });
    EXPECT_THAT(failure, HasSubstr("Cannot read the picture database " + file.string()));
    EXPECT_THAT(failure, HasSubstr("malformed"));
    EXPECT_THAT(db.inspect().reason, HasSubstr("it is damaged"));
    EXPECT_THAT(FailureOf([&] { db.create(false); }), HasSubstr("it was left as it is"));
    db.create(true);
    EXPECT_TRUE(db.rangesById().empty());
}

} // namespace
} // namespace dovrel
