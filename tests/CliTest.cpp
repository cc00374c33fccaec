#include "RunCli.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

namespace dovrel {
namespace {

using test::RunCli;

// Folder names that code page 1255 cannot hold reach the files as they are.
TEST(CliTest, ShowAndPrintWorkInFoldersOfAnyName) {
    test::TempDir temp;
    std::filesystem::path company = temp.path() / "Документы" / "demo";
    std::filesystem::create_directories(company.parent_path());
    std::filesystem::copy(DOVREL_DEMO_DIR, company);
    std::filesystem::path pages = temp.path() / "Временные";
    std::filesystem::create_directories(pages);

    auto shown = RunCli({"show", company.string(), "--type", "21", "--start", "2"});
    EXPECT_EQ(shown.code, 0) << shown.err;
    EXPECT_NE(shown.out.find("(21)"), std::string::npos) << shown.out;

    test::ScopedEnv tmp("TMPDIR", pages.string());
    auto printed = RunCli({"print", company.string(), "--type", "21", "--start", "2"});
    ASSERT_EQ(printed.code, 0) << printed.err;
    std::string page = printed.out.substr(0, printed.out.find('\n'));
    EXPECT_EQ(page.rfind(pages.string(), 0), 0u) << page;
    EXPECT_TRUE(std::filesystem::is_regular_file(page)) << page;
}

// The host keeps its settings in the user's store: what one host saves, the
// next one loads.
TEST(CliTest, HostSettingsSurviveFromOneHostToTheNext) {
    test::TempDir config;
    test::ScopedEnv home("XDG_CONFIG_HOME", config.str());
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
}

} // namespace
} // namespace dovrel
