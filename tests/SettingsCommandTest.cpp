#include "TestCompany.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>

#include <cstring>
#include <fstream>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

namespace dovrel {
namespace {

struct Result {
    int code;
    std::string out, err;
};

// Runs `dovrel settings ...` without a shell, with XDG_CONFIG_HOME pointing at a private
// directory; the streams go through files.
class SettingsCommandTest : public ::testing::Test {
protected:
    test::TempDir config, streams;

    Result run(std::vector<std::string> args) {
        std::string out = (streams.path() / "out").string(),
                    err = (streams.path() / "err").string();
        posix_spawn_file_actions_t files;
        posix_spawn_file_actions_init(&files);
        posix_spawn_file_actions_addopen(&files, 0, "/dev/null", O_RDONLY, 0);
        posix_spawn_file_actions_addopen(&files, 1, out.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                         0600);
        posix_spawn_file_actions_addopen(&files, 2, err.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                         0600);
        args.insert(args.begin(), {DOVREL_CLI, "settings"});
        std::vector<std::string> env{"XDG_CONFIG_HOME=" + config.str()};
        for (char** var = environ; *var != nullptr; ++var)
            if (std::strncmp(*var, "XDG_CONFIG_HOME=", 16) != 0)
                env.emplace_back(*var);
        pid_t pid = 0;
        int status = -1;
        if (posix_spawn(&pid, DOVREL_CLI, &files, nullptr, Pointers(args).data(),
                        Pointers(env).data()) == 0)
            waitpid(pid, &status, 0);
        posix_spawn_file_actions_destroy(&files);
        return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, Read(out), Read(err)};
    }

private:
    static std::vector<char*> Pointers(std::vector<std::string>& words) {
        std::vector<char*> pointers;
        for (std::string& word : words)
            pointers.push_back(word.data());
        pointers.push_back(nullptr);
        return pointers;
    }
    static std::string Read(const std::string& path) {
        std::ostringstream text;
        text << std::ifstream(path, std::ios::binary).rdbuf();
        return text.str();
    }
};

void ExpectResult(const Result& result, int code, const std::string& out, const std::string& err) {
    EXPECT_EQ(result.code, code) << result.err;
    EXPECT_EQ(result.out, out);
    EXPECT_EQ(result.err, err);
}

TEST_F(SettingsCommandTest, SetGetListAndUnset) {
    ExpectResult(run({"list"}), 0, "", "");
    ExpectResult(run({"get", "CompPath"}), 1, "", "No setting \"CompPath\" under Dovrel\n");
    ExpectResult(run({"set", "CompPath", "c:\\comp02"}), 0, "", "");
    ExpectResult(run({"set", "Title", "חשבונית מס"}), 0, "", "");
    ExpectResult(run({"set", "COMPPATH", "d:\\חברה"}), 0, "", "");
    ExpectResult(run({"get", "comppath"}), 0, "d:\\חברה\n", "");
    ExpectResult(run({"list"}), 0, "CompPath=d:\\חברה\nTitle=חשבונית מס\n", "");
    EXPECT_TRUE(std::filesystem::is_regular_file(config.path() / "dovrel" / "settings.db"));

    ExpectResult(run({"unset", "title"}), 0, "", "");
    ExpectResult(run({"unset", "Title"}), 1, "", "No setting \"Title\" under Dovrel\n");
    ExpectResult(run({"list"}), 0, "CompPath=d:\\חברה\n", "");
}

TEST_F(SettingsCommandTest, EachApplicationNameHasItsOwnSettings) {
    ExpectResult(run({"set", "CompPath", "c:\\comp02"}), 0, "", "");
    ExpectResult(run({"--app", "Dovrel7", "set", "CompPath", "c:\\comp07"}), 0, "", "");
    ExpectResult(run({"--app", "Dovrel7", "set", "DocType", "3"}), 0, "", "");
    ExpectResult(run({"list"}), 0, "CompPath=c:\\comp02\n", "");
    ExpectResult(run({"list", "--app", "dovrel7"}), 0, "CompPath=c:\\comp07\nDocType=3\n", "");
    ExpectResult(run({"--app", "Dovrel8", "get", "CompPath"}), 1, "",
                 "No setting \"CompPath\" under Dovrel8\n");
}

TEST_F(SettingsCommandTest, UsageErrorsAndADamagedStoreExitWithTheirCodes) {
    for (const auto& args : std::vector<std::vector<std::string>>{
             {}, {"get"}, {"set", "CompPath"}, {"frobnicate"}, {"list", "extra"}}) {
        Result result = run(args);
        EXPECT_EQ(result.code, 2) << ::testing::PrintToString(args);
        EXPECT_NE(result.err, "");
    }
    std::filesystem::create_directories(config.path() / "dovrel");
    std::string file = (config.path() / "dovrel" / "settings.db").string();
    std::ofstream(file, std::ios::binary) << std::string(2000, '#');
    Result result = run({"get", "CompPath"});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.out, "");
    EXPECT_EQ(result.err, "dovrel: Cannot read setting \"CompPath\" from " + file +
                              ": file is not a database\n");
}

} // namespace
} // namespace dovrel
