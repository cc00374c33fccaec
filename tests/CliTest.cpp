#include "TestCompany.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>

#include <fstream>
#include <iterator>
#include <sstream>
#include <string>
#include <vector>

extern char** environ;

namespace dovrel {
namespace {

using nlohmann::json;
using ::testing::HasSubstr;
using ::testing::StartsWith;

struct ChildRun {
    int code = -1;
    std::string out;
    std::string err;
};

std::string ReadAll(const std::filesystem::path& path) {
    std::ifstream in(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
}

// Runs the built command without a shell; input, output and errors go
// through files so that no pipe can fill up.
ChildRun RunCli(const std::vector<std::string>& args, const std::string& input = "") {
    test::TempDir dir;
    std::filesystem::path in = dir.path() / "in", out = dir.path() / "out",
                          err = dir.path() / "err";
    std::ofstream(in, std::ios::binary) << input;
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(&actions, 0, in.c_str(), O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 1, out.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    posix_spawn_file_actions_addopen(&actions, 2, err.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    std::vector<std::string> all = {DOVREL_CLI};
    all.insert(all.end(), args.begin(), args.end());
    std::vector<char*> argv;
    for (std::string& arg : all)
        argv.push_back(arg.data());
    argv.push_back(nullptr);
    pid_t pid = 0;
    int spawned = posix_spawn(&pid, DOVREL_CLI, &actions, nullptr, argv.data(), environ);
    posix_spawn_file_actions_destroy(&actions);
    ChildRun run;
    if (spawned != 0) {
        ADD_FAILURE() << "cannot start " << DOVREL_CLI;
        return run;
    }
    int status = 0;
    waitpid(pid, &status, 0);
    run.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    run.out = ReadAll(out);
    run.err = ReadAll(err);
    return run;
}

std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}

TEST(CliTest, ShowPrintsADocumentOfTheDemoCompany) {
    ChildRun run = RunCli({"show", DOVREL_DEMO_DIR});
    EXPECT_EQ(run.code, 0) << run.err;
    EXPECT_EQ(run.err, "");
    EXPECT_THAT(run.out, HasSubstr("תעודת משלוח (20)"));
    EXPECT_THAT(run.out, HasSubstr("שורה"));
    EXPECT_THAT(run.out, HasSubstr("סה\"כ כולל מע\"מ:"));

    ChildRun asJson = RunCli({"show", DOVREL_DEMO_DIR, "--json", "--type", "20", "--start", "2"});
    EXPECT_EQ(asJson.code, 0) << asJson.err;
    json state = json::parse(asJson.out);
    EXPECT_EQ(state["CompDir"], DOVREL_DEMO_DIR);
    EXPECT_EQ(state["doc"]["header"]["type"], 20);
    EXPECT_GT(state["doc"]["lineCount"].get<int>(), 0);
}

TEST(CliTest, HostAnswersOneLinePerRequest) {
    std::string demo = DOVREL_DEMO_DIR;
    std::string input = json({"ReadAdf", demo}).dump() + "\nthis is not json\n" +
                        json({"ReadStock", demo, 13, "", "", "First", "01/01/1980"}).dump() + "\n";
    ChildRun run = RunCli({"host"}, input);
    EXPECT_EQ(run.code, 0) << run.err;
    std::vector<std::string> lines = Lines(run.out);
    ASSERT_EQ(lines.size(), 3u) << run.out;
    EXPECT_EQ(json::parse(lines[0])["result"], true);
    EXPECT_EQ(json::parse(lines[1])["ok"], false);
    json read = json::parse(lines[2]);
    EXPECT_EQ(read["ok"], true);
    EXPECT_GT(read["result"].get<int>(), 0);
    EXPECT_NE(read["state"]["controls"]["txtDate"], "");
}

TEST(CliTest, FailuresAndUsageErrors) {
    ChildRun missing = RunCli({"show", "/no/such/company/dir"});
    EXPECT_EQ(missing.code, 1);
    EXPECT_EQ(missing.out, "");
    EXPECT_THAT(missing.err, StartsWith("dovrel: "));
    EXPECT_THAT(missing.err, HasSubstr("/no/such/company/dir"));
    EXPECT_EQ(Lines(missing.err).size(), 1u);

    for (std::vector<std::string> args : {std::vector<std::string>{},
                                          {"show"},
                                          {"show", DOVREL_DEMO_DIR, "--start", "0"},
                                          {"show", DOVREL_DEMO_DIR, "--type", "x"},
                                          {"frobnicate"}}) {
        ChildRun usage = RunCli(args);
        EXPECT_EQ(usage.code, 2) << ::testing::PrintToString(args);
        EXPECT_FALSE(usage.err.empty());
    }
}

} // namespace
} // namespace dovrel
