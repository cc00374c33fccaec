// The rules every command keeps, checked over every command that writes,
// reads, prints or exits: a command added later joins these tables.

#include "RunCli.h"
#include "TestCompany.h"
#include "fixfiles/AccountsFile.h"
#include "platform/Controls.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <sys/resource.h>
#include <sys/stat.h>

#include <filesystem>
#include <fstream>
#include <functional>

namespace dovrel {
namespace {

namespace fs = std::filesystem;
using nlohmann::json;
using test::RunCli;
using ::testing::HasSubstr;
using ::testing::Not;

// Bytes that must never reach a terminal: TAB, LF, CR, DEL, ESC and the four
// DOS bytes that become C1 controls.
const char* const kControls = "41 09 42 0A 43 0D 44 7F 45 1B 9C 9D 9E 9F";

class CommandRulesTest : public ::testing::Test {
protected:
    CommandRulesTest() {
        json hostile = {{"hex", kControls}};
        json company = {
            {"company", {{"name", hostile}, {"title", hostile}}},
            {"accounts", {{{"key", "1001"}, {"phone", hostile}, {"details", hostile}}}},
            {"documents",
             {{{"type", 20},
               {"customer", hostile},
               {"reference", "7"},
               {"remarks", {hostile}},
               {"lines", {{{"key", hostile}, {"description", hostile}, {"price", 1}}}}}}}};
        sample::WriteCompany(company.dump(), co);
        fs::create_directories(root.path() / "db");
        EXPECT_EQ(RunCli({"pictures", "--db", db(), "init"}).code, 0);
        EXPECT_EQ(RunCli({"pictures", "--db", db(), "add", "A", "B", "a\tb\x1b[2J.jpg"}).code, 0);
    }
    std::string db() const { return (root.path() / "db").string(); }
    std::string at(const std::string& name) const { return (root.path() / name).string(); }

    test::TempDir root;
    test::ScopedEnv config{"XDG_CONFIG_HOME", (root.path() / "config").string()};
    test::ScopedEnv tmp{"TMPDIR", root.str()};
    fs::path co = root.path() / "main" / "co";
};

// Every writer, over every target it must not write: nothing changes there.
TEST_F(CommandRulesTest, WhatIsWrittenIsANewRegularFileOfDovrelsOwn) {
    const std::function<std::vector<std::string>(const std::string&)> writers[] = {
        [&](const std::string& to) {
            return std::vector<std::string>{"print", co.string(), "--no-open", "--out", to};
        },
        [&](const std::string& to) {
            return std::vector<std::string>{"pictures", "--db", db(), "export", to};
        }};
    ASSERT_EQ(mkfifo(at("fifo").c_str(), 0600), 0);
    fs::create_directories(at("folder"));
    std::ofstream(at("kept")) << "kept";
    for (const auto& writer : writers) {
        for (const std::string& target :
             {at("fifo"), at("folder"), (co / "ISHP.FIX").string(), at("new.Fix")}) {
            auto [code, out, err] = RunCli(writer(target), "", 30);
            EXPECT_EQ(code, 1) << target << err;
            EXPECT_THAT(err, HasSubstr("Cannot write")) << target;
        }
        EXPECT_TRUE(fs::is_fifo(at("fifo")));
        EXPECT_FALSE(fs::exists(at("new.Fix")));
        // A link is replaced by a new file of mode 0600, never followed.
        fs::remove(at("link"));
        fs::create_symlink(at("kept"), at("link"));
        EXPECT_EQ(RunCli(writer(at("link"))).code, 0);
        EXPECT_EQ(test::ReadAll(at("kept")), "kept");
        EXPECT_EQ(fs::status(at("link")).permissions(),
                  fs::perms::owner_read | fs::perms::owner_write);
    }
    // The picture database made over a link to a device is a file of its own.
    fs::create_directories(at("devdb"));
    fs::create_symlink("/dev/zero", at("devdb/Dovrel.def"));
    EXPECT_EQ(RunCli({"pictures", "--db", at("devdb"), "init", "--force"}).code, 0);
    struct stat made {};
    ASSERT_EQ(lstat(at("devdb/Dovrel.def").c_str(), &made), 0);
    EXPECT_TRUE(S_ISREG(made.st_mode));
    EXPECT_EQ(made.st_mode & 0777, 0600u);
    // A picture folder typed without its final separator.
    EXPECT_EQ(RunCli({"settings", "set", "DBPath", at("typed")}).code, 0);
    fs::create_directories(at("typed"));
    EXPECT_EQ(RunCli({"pictures", "init"}).code, 0);
    EXPECT_TRUE(fs::exists(at("typed/Dovrel.def")));
}

TEST_F(CommandRulesTest, ThePictureDatabaseIsNeverEmptiedByAccident) {
    std::string csv = at("ranges.csv");
    auto pictures = [&](std::vector<std::string> args) {
        args.insert(args.begin(), {"pictures", "--db", db()});
        return RunCli(args);
    };
    ASSERT_EQ(pictures({"add", "C", "D", "01", "02", "p.jpg"}).code, 0);
    std::string before = pictures({"list", "--json"}).out;
    EXPECT_THAT(pictures({"init"}).err, HasSubstr("holds 2 ranges"));
    std::ofstream(at("empty.csv")) << "FromItemKey,ToItemKey,FromCatCode,ToCatCode,PicFile\n";
    EXPECT_THAT(pictures({"import", at("empty.csv")}).err, HasSubstr("--force"));
    // More ranges than the settings form lists are refused before any change.
    std::ofstream many(at("many.csv"));
    for (int i = 0; i < 32768; ++i)
        many << "A,B,,,x.jpg\n";
    many.close();
    EXPECT_THAT(pictures({"import", at("many.csv")}).err, HasSubstr("32767"));
    EXPECT_EQ(pictures({"list", "--json"}).out, before);
    // Export and import give the same ranges, empty codes included; a heading
    // with a byte-order mark and its columns in another order is taken by name.
    ASSERT_EQ(pictures({"export", csv}).code, 0);
    EXPECT_EQ(pictures({"import", csv}).code, 0);
    EXPECT_EQ(pictures({"list", "--json"}).out, before);
    std::ofstream(csv) << "\xEF\xBB\xBFPicFile,ToItemKey,FromItemKey,ToCatCode,FromCatCode\r\n"
                       << "z.jpg,Z,A,,\r\n";
    EXPECT_EQ(pictures({"import", csv}).code, 0);
    EXPECT_EQ(json::parse(pictures({"list", "--json"}).out)[0]["PicFile"], "z.jpg");
    EXPECT_EQ(pictures({"import", "--force", at("empty.csv")}).code, 0);
    EXPECT_EQ(pictures({"list", "--json"}).out, "[]\n");
}

// Every reader of a file the user names, over what is not a regular file:
// refused at once, without waiting on a pipe or reading a device.
TEST_F(CommandRulesTest, WhatIsReadIsARegularFileOfBoundedSize) {
    ASSERT_EQ(mkfifo(at("fifo.csv").c_str(), 0600), 0);
    fs::create_symlink("/dev/zero", at("zero.csv"));
    for (const std::string& source : {at("fifo.csv"), at("zero.csv")}) {
        auto [code, out, err] = RunCli({"pictures", "--db", db(), "import", source}, "", 30);
        EXPECT_EQ(code, 1) << err;
        EXPECT_THAT(err, HasSubstr("not a regular file")) << source;
    }
    // The accounts lookup holds one record at a time: a 1 GB sparse accounts
    // file is searched with the process's peak memory grown by less than
    // 250 MB, and the account in it is found. (The peak is measured rather
    // than limited, so the check holds under the sanitizers too.)
    fs::resize_file(co / "ACT.fix", 1'000'000'000);
    Shape frame("ProgressFrame", 0, 0, 1000, 100), fill("ProgressFill", 0, 0, 0, 100);
    Path comp(co.string());
    rusage before{}, after{};
    getrusage(RUSAGE_SELF, &before);
    EXPECT_TRUE(FindAccountInFile(comp, "9999", {frame, fill}).Key.empty());
    EXPECT_EQ(FindAccountInFile(comp, "1001", {frame, fill}).Key, "1001");
    getrusage(RUSAGE_SELF, &after);
    EXPECT_LT((after.ru_maxrss - before.ru_maxrss) * 1024L, 250'000'000L);
}

// Every line-oriented output: no control reaches the terminal, and a name
// cannot forge a line.
TEST_F(CommandRulesTest, WhatIsPrintedHoldsNoControlCharacters) {
    EXPECT_EQ(RunCli({"settings", "set", "Title", "a\tb\x1b]0;x\x07"}).code, 0);
    const std::vector<std::string> commands[] = {{"show", co.string()},
                                                 {"account", co.string(), "1001"},
                                                 {"companies", co.parent_path().string()},
                                                 {"settings", "list"},
                                                 {"pictures", "--db", db(), "list"},
                                                 {"pictures", "--db", db(), "which", "A", "01"}};
    for (const auto& args : commands) {
        auto [code, out, err] = RunCli(args);
        EXPECT_EQ(code, 0) << args[0] << err;
        for (size_t i = 0; i < out.size(); ++i) {
            auto c = static_cast<unsigned char>(out[i]);
            bool table = c == '\t' && (args[0] == "companies" || args.back() == "list");
            EXPECT_TRUE(c >= 0x20 || c == '\n' || table) << args[0] << " byte " << int(c);
            EXPECT_NE(c, 0x7F) << args[0];
            EXPECT_FALSE(c == 0xC2 && i + 1 < out.size() &&
                         static_cast<unsigned char>(out[i + 1]) < 0xA0)
                << args[0];
        }
        if (args[0] == "companies") {
            EXPECT_EQ(std::count(out.begin(), out.end(), '\n'), 1) << out;
        }
    }
}

// The exit codes: 0 done, 1 failed, 2 usage, 3 nothing found; the message
// on the error stream says what.
TEST_F(CommandRulesTest, EveryCommandExitsWithTheSameCodes) {
    fs::create_directories(at("nothing"));
    const std::string missing = at("missing");
    const std::tuple<std::vector<std::string>, int, std::string> cases[] = {
        {{"nosuchcmd"}, 2, "unknown command \"nosuchcmd\"; the commands are show,"},
        {{"show"}, 2, "COMPDIR"},
        {{"show", co.string(), "--start", "0"}, 2, "--start"},
        {{"show", co.string(), "--type", "abc"}, 2, "not a document type: abc"},
        {{"show", co.string(), "--type", "50"}, 2, "not a document type: 50"},
        {{"print", co.string(), "--today", "2023-02-31"}, 2, "2023-02-31"},
        {{"pictures", "--db", db(), "add", "A", "B", "01", "f"}, 2, "Usage"},
        {{"pictures", "--db", db(), "import", "a.csv", "b.csv"}, 2, ""},
        {{"settings", "get"}, 2, ""},
        {{"show", co.string(), "--start", "60"}, 3, "לא נמצא מסמך"},
        {{"show", co.string(), "--start", "60", "--json"}, 3, "לא נמצא מסמך"},
        {{"print", co.string(), "--start", "60", "--no-open"}, 3, "no document"},
        {{"account", co.string(), "99999"}, 3, ""},
        {{"companies", at("nothing")}, 3, "No companies"},
        {{"show", missing}, 3, "Company directory not found: " + missing},
        {{"settings", "get", "NoSuchKey"}, 3, "No setting"},
        {{"pictures", "--db", db(), "delete", "99"}, 3, "No range 99"},
        {{"pictures", "--db", db(), "import", missing}, 1, missing + ": No such file"},
        {{"companies", missing}, 1, missing},
        {{"pictures", "--db", db(), "add", "", "", "x"}, 1, "is empty"},
        {{"show", co.string(), "--type", "Delivery Note"}, 0, ""},
        {{"show", co.string(), "--type", "תעודת משלוח"}, 0, ""}};
    for (const auto& [args, expected, words] : cases) {
        auto [code, out, err] = RunCli(args);
        EXPECT_EQ(code, expected) << ::testing::PrintToString(args) << err;
        EXPECT_THAT(err, HasSubstr(words)) << ::testing::PrintToString(args);
        if (expected != 0 && args[0] != "account" && args.back() != "--json") {
            EXPECT_EQ(out, "") << ::testing::PrintToString(args);
        }
    }
    // Output that cannot be written is a failure.
    ASSERT_EQ(RunCli({"settings", "set", "Title", "x"}).code, 0);
    for (const std::vector<std::string>& args : {std::vector<std::string>{"show", co.string()},
                                                 {"settings", "list"},
                                                 {"companies", co.parent_path().string()},
                                                 {"pictures", "--db", db(), "list"}}) {
        auto [code, out, err] = RunCli(args, "", 60, "/dev/full");
        EXPECT_EQ(code, 1) << ::testing::PrintToString(args);
        EXPECT_THAT(err, HasSubstr("cannot write the output: No space left"))
            << ::testing::PrintToString(args);
    }
    // The help tells the codes, the types and each command's real arguments.
    const std::pair<std::vector<std::string>, std::string> helps[] = {
        {{"--help"}, "Exit codes: 0 done, 1 failed, 2 usage"},
        {{"show", "--help"}, "20  Delivery Note  תעודת משלוח"},
        {{"pictures", "add", "--help"}, "add [OPTIONS] FROMKEY TOKEY [FROMCAT TOCAT] PICFILE"},
        {{"pictures", "import", "--help"}, "import [OPTIONS] FILE\n"}};
    for (const auto& [args, words] : helps)
        EXPECT_THAT(RunCli(args).out, HasSubstr(words)) << args[0];
    EXPECT_THAT(RunCli({"print", "--help"}).out, Not(HasSubstr("{false}")));
}

} // namespace
} // namespace dovrel
