#include "RunCli.h"
#include "TestCompany.h"

#include <gtest/gtest.h>


#include <cstdlib>
#include <fstream>
#include <string>
#include <vector>

namespace dovrel {
namespace {

struct Step {
    std::vector<std::string> args;
    int code;
    std::string out, err;
};

// Runs `dovrel settings ...` without a shell, with XDG_CONFIG_HOME pointing at a private
// directory; the streams go through files.
class SettingsCommandTest : public ::testing::Test {
protected:
    test::TempDir config, streams;

    Step run(const std::vector<std::string>& args) {
        setenv("XDG_CONFIG_HOME", config.str().c_str(), 1);
        std::vector<std::string> words{"settings"};
        words.insert(words.end(), args.begin(), args.end());
        test::CliResult result = test::RunCli(words);
        return {args, result.code, result.out, result.err};
    }

    void expect(const Step& step) {
        Step result = run(step.args);
        std::string command = ::testing::PrintToString(step.args);
        EXPECT_EQ(result.code, step.code) << command << " " << result.err;
        EXPECT_EQ(result.out, step.out) << command;
        EXPECT_EQ(result.err, step.err) << command;
    }
};

// Names match without case; another application name (Dovrel7) neither sees
// nor changes the settings of Dovrel.
TEST_F(SettingsCommandTest, SetGetListAndUnsetEachApplicationApart) {
    const Step steps[] = {
        {{"list"}, 0, "", ""},
        {{"get", "CompPath"}, 1, "", "No setting \"CompPath\" under Dovrel\n"},
        {{"set", "CompPath", "c:\\comp02"}, 0, "", ""},
        {{"--app", "Dovrel7", "set", "CompPath", "c:\\comp07"}, 0, "", ""},
        {{"--app", "Dovrel7", "set", "DocType", "3"}, 0, "", ""},
        {{"list"}, 0, "CompPath=c:\\comp02\n", ""},
        {{"list", "--app", "dovrel7"}, 0, "CompPath=c:\\comp07\nDocType=3\n", ""},
        {{"--app", "Dovrel8", "get", "CompPath"}, 1, "", "No setting \"CompPath\" under Dovrel8\n"},
        {{"set", "Title", "חשבונית מס"}, 0, "", ""},
        {{"set", "COMPPATH", "d:\\חברה"}, 0, "", ""},
        {{"get", "comppath"}, 0, "d:\\חברה\n", ""},
        {{"list"}, 0, "CompPath=d:\\חברה\nTitle=חשבונית מס\n", ""},
        {{"unset", "title"}, 0, "", ""},
        {{"unset", "Title"}, 1, "", "No setting \"Title\" under Dovrel\n"},
        {{"list"}, 0, "CompPath=d:\\חברה\n", ""},
    };
    for (const Step& step : steps)
        expect(step);
    EXPECT_TRUE(std::filesystem::is_regular_file(config.path() / "dovrel" / "settings.db"));
}

TEST_F(SettingsCommandTest, UsageErrorsAndADamagedStoreExitWithTheirCodes) {
    for (const auto& args : std::vector<std::vector<std::string>>{
             {}, {"get"}, {"set", "CompPath"}, {"frobnicate"}, {"list", "extra"}}) {
        Step result = run(args);
        EXPECT_EQ(result.code, 2) << ::testing::PrintToString(args);
        EXPECT_NE(result.err, "");
    }
    std::filesystem::create_directories(config.path() / "dovrel");
    std::string file = (config.path() / "dovrel" / "settings.db").string();
    std::ofstream(file, std::ios::binary) << std::string(2000, '#');
    const std::string said = "Cannot read setting \"CompPath\" from " + file;
    expect({{"get", "CompPath"}, 1, "", "dovrel: " + said + ": file is not a database\n"});
}

} // namespace
} // namespace dovrel
