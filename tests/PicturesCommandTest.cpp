// `dovrel pictures`: the picture ranges without the desktop.

#include "app/cli/PicturesCommand.h"
#include "TestCompany.h"
#include "platform/Error.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

namespace dovrel {
namespace {

using ::testing::HasSubstr;

const std::string kHeader = "RangeID\tFromItemKey\tToItemKey\tFromCatCode\tToCatCode\tPicFile\n";

struct Result {
    int code;
    std::string out, err;
};

class PicturesCommandTest : public ::testing::Test {
protected:
    Result run(const std::string& action, std::vector<std::string> args = {}, bool useDb = true) {
        PicturesOptions options;
        options.db = useDb ? dir.str() : "";
        options.action = action;
        options.args = std::move(args);
        options.json = json;
        options.force = force;
        std::ostringstream out, err;
        int code = PicturesCommand(options, store).run(out, err);
        return {code, out.str(), err.str()};
    }
    std::string failure(const std::string& action, std::vector<std::string> args = {}) {
        try {
            run(action, std::move(args));
            return "";
        } catch (const Error& e) {
            return e.what();
        }
    }

    test::TempDir dir;
    std::string file = dir.str() + "/Dovrel.def";
    MemorySettingsStore store;
    bool json = false, force = false;
};

TEST_F(PicturesCommandTest, AddsListsFindsAndDeletesRanges) {
    EXPECT_EQ(run("list").err,
              "There is no picture database at " + file + " (dovrel pictures init makes one)\n");
    EXPECT_EQ(run("init").out, "Created an empty picture database at " + file + "\n");
    EXPECT_EQ(run("add", {"", "תתתתתתתתתתתת", "", "999", "pic001.jpg"}).out, "Added range 1\n");
    EXPECT_EQ(run("add", {"100", "199", "b.jpg"}).out, "Added range 2\n");
    EXPECT_THAT(failure("add", {"100", "", "c.jpg"}), HasSubstr("ToItemKey) is empty"));
    EXPECT_EQ(run("list").out,
              kHeader + "1\t\tתתתתתתתתתתתת\t\t999\tpic001.jpg\n2\t100\t199\t\t\tb.jpg\n");
    json = true;
    nlohmann::json listed = nlohmann::json::parse(run("list").out);
    EXPECT_EQ(listed[0]["FromItemKey"], nullptr);
    EXPECT_EQ(listed[1]["PicFile"], "b.jpg");
    EXPECT_EQ(listed[1]["RangeID"], 2);

    EXPECT_EQ(run("which", {"150", "010"}).out, "b.jpg\n");
    EXPECT_EQ(run("which", {"250", "10"}).out, "pic001.jpg\n");
    Result none = run("which", {"150", ""});
    EXPECT_EQ(std::to_string(none.code) + " " + none.err,
              "3 No picture for item 150 with category code \"\"\n");

    EXPECT_EQ(run("delete", {"1"}).code, 0);
    EXPECT_EQ(run("delete", {"1"}).err, "No range 1 in " + file + "\n");
    EXPECT_THAT(failure("delete", {"x1"}), HasSubstr("Not a range number: x1"));
    EXPECT_EQ(run("add", {"c", "d", "q.jpg"}).out, "Added range 3\n"); // numbers are not reused
    EXPECT_EQ(run("which", {"250", "10"}).code, 3);
}

TEST_F(PicturesCommandTest, ImportReplacesEveryRangeOrNothing) {
    run("init");
    run("add", {"a", "b", "keep.jpg"});
    std::string csv = dir.str() + "/ranges.csv", copy = dir.str() + "/copy.csv";
    std::ofstream(csv) << ",z,,999,\"a,b.jpg\"\r\n10,20,1,2,\"say \"\"x\"\".jpg\"\r\n";
    EXPECT_EQ(run("import", {csv}).out, "Imported 2 picture ranges\n");
    const std::string imported = run("list").out;
    EXPECT_EQ(imported, kHeader + "1\t\tz\t\t999\ta,b.jpg\n2\t10\t20\t1\t2\tsay \"x\".jpg\n");
    run("export", {copy});
    EXPECT_EQ(test::ReadAll(copy), "FromItemKey,ToItemKey,FromCatCode,ToCatCode,PicFile\r\n"
                                   ",z,,999,\"a,b.jpg\"\r\n"
                                   "10,20,1,2,\"say \"\"x\"\".jpg\"\r\n");

    const std::vector<std::pair<std::string, std::string>> refused = {
        {"FromItemKey,ToItemKey,FromCatCode,ToCatCode,PicFile\n,z,,999,y.jpg\n10,20,1,2,x.jpg\n"
         "10,1234567890123,1,2,bad.jpg\n",
         "row 3: the highest item key (ToItemKey) is longer than 12"},
        {"1,2,3\n", "record 1 has 3 fields, not 5"},
        {"1,2,3,4,\"5\n", "ends inside a quoted field"}};
    for (const auto& [text, reason] : refused) {
        SCOPED_TRACE(reason);
        std::ofstream(csv, std::ios::trunc) << text;
        EXPECT_THAT(failure("import", {csv}), HasSubstr(reason));
        EXPECT_EQ(run("list").out, imported);
    }
}

TEST_F(PicturesCommandTest, TheFolderComesFromTheSettingsAndAForeignFileIsKept) {
    Result unset = run("list", {}, false);
    EXPECT_EQ(unset.code, 1);
    EXPECT_THAT(unset.err, HasSubstr("No picture folder is set"));
    store.SaveSetting("Dovrel", "Params", "DBPath", FromUtf8(Utf8(dir.str() + "/")));
    EXPECT_EQ(run("init", {}, false).code, 0);
    EXPECT_EQ(run("add", {"a", "b", "p.jpg"}, false).out, "Added range 1\n");

    std::ofstream(file, std::ios::trunc) << "not a database at all, but someone's file";
    EXPECT_THAT(failure("list"), HasSubstr("not a picture database: it is not an SQLite database"));
    EXPECT_THAT(failure("init"), HasSubstr("Give --force to replace it"));
    EXPECT_EQ(test::ReadAll(file), "not a database at all, but someone's file");
    force = true;
    EXPECT_EQ(run("init").code, 0);
    EXPECT_EQ(run("list").out, kHeader);
}

} // namespace
} // namespace dovrel
