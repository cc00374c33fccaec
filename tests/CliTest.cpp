#include "RunCli.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <cstdlib>
#include <sstream>
#include <string>
#include <tuple>
#include <vector>

namespace dovrel {
namespace {

using test::RunCli;

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

// The host keeps its settings in the user's store: what one host saves, the
// next one loads, and a refused value stops the load where it stands.
TEST(CliTest, HostSettingsSurviveFromOneHostToTheNext) {
    test::TempDir config;
    std::string saved = getenv("XDG_CONFIG_HOME") ? getenv("XDG_CONFIG_HOME") : "";
    setenv("XDG_CONFIG_HOME", config.str().c_str(), 1);
    auto lastState = [](const std::string& requests) {
        auto [code, out, err] = RunCli({"host"}, requests + "\n[\"state\"]\n");
        EXPECT_EQ(code, 0) << err;
        std::string line, last;
        for (std::istringstream lines(out); std::getline(lines, line);)
            last = line;
        return nlohmann::json::parse(last)["state"];
    };
    // The controls the settings fill, as the last state shows them.
    auto shown = [&](const std::string& requests) {
        nlohmann::json controls = lastState(requests)["controls"];
        return nlohmann::json({controls["txtCompPath"], controls["cmbDocType"],
                               controls["txtTitle"], controls["CmbDocLang"], controls["cmbRules"]});
    };
    EXPECT_EQ(shown(R"(["set", "txtTitle", "כותרת"]
                       ["set", "cmbRules", 2]
                       ["click", "cmdSaveDef"])"),
              nlohmann::json({"c:\\comp02", 1, "כותרת", 1, 2}));
    EXPECT_EQ(shown(""), nlohmann::json({"c:\\comp02", 1, "כותרת", 1, 2}));
    nlohmann::json numbered = lastState(R"(["new", {"SettingID": "3"}])");
    EXPECT_EQ(nlohmann::json({numbered["AppName"], numbered["controls"]["txtTitle"]}),
              nlohmann::json({"Dovrel3", ""}));

    EXPECT_EQ(RunCli({"settings", "set", "DocType", "30"}).code, 0);
    EXPECT_EQ(shown(""), nlohmann::json({"c:\\comp02", 0, "חשבונית מס", 0, -1}));
    if (saved.empty())
        unsetenv("XDG_CONFIG_HOME");
    else
        setenv("XDG_CONFIG_HOME", saved.c_str(), 1);
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
