#include "RunCli.h"
#include "TestCompany.h"

#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

namespace dovrel {
namespace {

using Args = std::vector<std::string>;

// Runs `dovrel settings ...` with XDG_CONFIG_HOME pointing at a private
// directory; answers the exit code and both streams.
class SettingsCommandTest : public ::testing::Test {
protected:
    test::TempDir config;
    test::ScopedEnv home{"XDG_CONFIG_HOME", config.str()};

    std::tuple<int, std::string, std::string> run(const Args& args) {
        Args words{"settings"};
        words.insert(words.end(), args.begin(), args.end());
        test::CliResult result = test::RunCli(words);
        return {result.code, result.out, result.err};
    }
};

// Names match without case; another application name (Dovrel7) neither sees
// nor changes the settings of Dovrel.
TEST_F(SettingsCommandTest, SetGetListAndUnsetEachApplicationApart) {
    const std::pair<Args, std::tuple<int, std::string, std::string>> steps[] = {
        {{"list"}, {0, "", ""}},
        {{"get", "CompPath"}, {3, "", "No setting \"CompPath\" under Dovrel\n"}},
        {{"set", "CompPath", "c:\\comp02"}, {0, "", ""}},
        {{"--app", "Dovrel7", "set", "CompPath", "c:\\comp07"}, {0, "", ""}},
        {{"--app", "Dovrel7", "set", "DocType", "3"}, {0, "", ""}},
        {{"list"}, {0, "CompPath=c:\\comp02\n", ""}},
        {{"list", "--app", "dovrel7"}, {0, "CompPath=c:\\comp07\nDocType=3\n", ""}},
        {{"--app", "Dovrel8", "get", "CompPath"},
         {3, "", "No setting \"CompPath\" under Dovrel8\n"}},
        {{"set", "Title", "חשבונית מס"}, {0, "", ""}},
        {{"get", "title"}, {0, "חשבונית מס\n", ""}},
        {{"unset", "title"}, {0, "", ""}},
        {{"unset", "Title"}, {3, "", "No setting \"Title\" under Dovrel\n"}},
        {{"list"}, {0, "CompPath=c:\\comp02\n", ""}},
    };
    for (const auto& [args, expected] : steps)
        EXPECT_EQ(run(args), expected) << ::testing::PrintToString(args);
    EXPECT_TRUE(std::filesystem::is_regular_file(config.path() / "dovrel" / "settings.db"));
}

TEST_F(SettingsCommandTest, ADamagedStoreIsAFailureThatNamesTheFile) {
    std::filesystem::create_directories(config.path() / "dovrel");
    std::string file = (config.path() / "dovrel" / "settings.db").string();
    std::ofstream(file, std::ios::binary) << std::string(2000, '#');
    const std::string said = "Cannot read setting \"CompPath\" from " + file;
    EXPECT_EQ(run({"get", "CompPath"}),
              std::make_tuple(1, "", "dovrel: " + said + ": file is not a database\n"));
}

} // namespace
} // namespace dovrel
