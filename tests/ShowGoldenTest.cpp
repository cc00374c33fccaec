// `dovrel show` and `show --json` on the demo company, compared byte for byte
// with the outputs kept in tests/golden. After an intended change of the
// output, run this test with DOVREL_UPDATE_GOLDEN=1 to write the files anew,
// and look at their diff before committing it.

#include "RunCli.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace dovrel {
namespace {

using test::RunCli;

const std::string kGoldenDir = std::string(DOVREL_SOURCE_DIR) + "/tests/golden/";
// Where the demo company was built differs between builds; the files say this.
const std::string kDemoMark = "@DEMO@";

std::string ReplaceAll(std::string text, const std::string& from, const std::string& to) {
    for (size_t at = 0; (at = text.find(from, at)) != std::string::npos; at += to.size())
        text.replace(at, from.size(), to);
    return text;
}

std::vector<std::string> Lines(const std::string& text) {
    std::vector<std::string> lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}

// Where two texts first differ, by line, for the failure message.
std::string FirstDifference(const std::string& expected, const std::string& actual) {
    std::vector<std::string> want = Lines(expected), got = Lines(actual);
    for (size_t i = 0; i < std::max(want.size(), got.size()); ++i) {
        std::string a = i < want.size() ? want[i] : "(no line)";
        std::string b = i < got.size() ? got[i] : "(no line)";
        if (a != b)
            return "line " + std::to_string(i + 1) + "\n  expected: " + a + "\n  actual:   " + b;
    }
    return "the line ends differ";
}

void ExpectGolden(const std::string& name, const std::vector<std::string>& args) {
    auto [code, out, err] = RunCli(args);
    ASSERT_EQ(code, 0) << err;
    EXPECT_EQ(err, "");
    std::string actual = ReplaceAll(out, DOVREL_DEMO_DIR, kDemoMark);
    std::string path = kGoldenDir + name;
    if (const char* update = std::getenv("DOVREL_UPDATE_GOLDEN"); update && *update) {
        std::ofstream(path, std::ios::binary) << actual;
        return;
    }
    std::string expected = test::ReadAll(path);
    if (expected != actual)
        ADD_FAILURE() << path << " differs from the output of dovrel; first difference at "
                      << FirstDifference(expected, actual)
                      << "\n(after an intended change: DOVREL_UPDATE_GOLDEN=1 ctest -R ShowGolden)";
}

TEST(ShowGoldenTest, ShowPrintsTheDemoDocumentsAsBefore) {
    ExpectGolden("show-20.txt", {"show", DOVREL_DEMO_DIR, "--type", "20", "--start", "2"});
    // Its lines are in the company's own currency (code 11).
    ExpectGolden("show-35.txt", {"show", DOVREL_DEMO_DIR, "--type", "35", "--start", "2"});
}

TEST(ShowGoldenTest, ShowJsonPrintsTheDemoDocumentAsBefore) {
    ExpectGolden("show-20.json",
                 {"show", DOVREL_DEMO_DIR, "--type", "20", "--start", "2", "--json"});
}

} // namespace
} // namespace dovrel
