#include "TestCompany.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <sys/wait.h>

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

namespace dovrel {
namespace {

// Runs the built command by the shell; its streams go through files, as a pipe could fill up.
auto RunCli(const std::vector<std::string>& args, const std::string& input = "") {
    test::TempDir dir;
    std::ofstream(dir.path() / "in", std::ios::binary) << input;
    std::string command = "cd '" + dir.str() + "' && '" DOVREL_CLI "'";
    for (const std::string& arg : args)
        command += " '" + arg + "'";
    int status = std::system((command + " <in >out 2>err").c_str());
    std::ostringstream out, err;
    out << std::ifstream(dir.path() / "out", std::ios::binary).rdbuf();
    err << std::ifstream(dir.path() / "err", std::ios::binary).rdbuf();
    return std::tuple{WIFEXITED(status) ? WEXITSTATUS(status) : -1, out.str(), err.str()};
}

TEST(CliTest, ShowPrintsADocumentOfTheDemoCompany) {
    auto [code, out, err] = RunCli({"show", DOVREL_DEMO_DIR, "--type", "21", "--start", "2"});
    EXPECT_EQ(code, 0);
    EXPECT_EQ(err, "");
    EXPECT_NE(out.find("(21)"), std::string::npos) << out;
    EXPECT_NE(out.find("סה\"כ כולל מע\"מ:"), std::string::npos) << out;
}

TEST(CliTest, HostAnswersOneLinePerRequest) {
    auto [code, out, err] =
        RunCli({"host"},
               nlohmann::json({"ReadAdf", DOVREL_DEMO_DIR}).dump() + "\nnot json\n" +
                   nlohmann::json({"ReadStock", DOVREL_DEMO_DIR, 13, "", "", "First", ""}).dump());
    EXPECT_EQ(code, 0) << err;
    std::istringstream lines(out);
    std::string adf, bad, read;
    std::getline(std::getline(std::getline(lines, adf), bad), read);
    EXPECT_EQ(nlohmann::json::parse(adf)["result"], true);
    EXPECT_EQ(nlohmann::json::parse(bad)["ok"], false);
    EXPECT_NE(nlohmann::json::parse(read)["state"]["controls"]["txtDate"], "");
    EXPECT_FALSE(std::getline(lines, read)) << out;
}

TEST(CliTest, FailuresAndUsageErrorsExitWithTheirCodes) {
    const std::tuple<std::vector<std::string>, int, std::string> cases[] = {
        {{"show", "/no/such/dir"}, 1, "dovrel: Company directory not found: /no/such/dir\n"},
        {{"frobnicate"}, 2, ""},
        {{"show"}, 2, ""},
        {{"show", DOVREL_DEMO_DIR, "--start", "0"}, 2, ""}};
    for (const auto& [args, expected, message] : cases) {
        auto [code, out, err] = RunCli(args);
        EXPECT_EQ(code, expected) << ::testing::PrintToString(args);
        EXPECT_EQ(out, "");
        EXPECT_TRUE(message.empty() ? !err.empty() : err == message) << err;
    }
}

} // namespace
} // namespace dovrel
