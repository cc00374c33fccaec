// `dovrel print` over many documents: --all, the page choices of one run,
// documents passed over, and PDF files made by Chromium.

#include "RunCli.h"
#include "TestCompany.h"
#include "app/cli/ChromiumPdf.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <set>

namespace dovrel {
namespace {

using nlohmann::json;
using test::ReadAll;
using test::RunCli;
using testing::HasSubstr;
namespace fs = std::filesystem;

class PrintRunTest : public ::testing::Test {
protected:
    void SetUp() override { setenv("XDG_CONFIG_HOME", (temp.path() / "config").c_str(), 1); }
    void TearDown() override { unsetenv("XDG_CONFIG_HOME"); }

    std::set<std::string> filesIn(const fs::path& folder) const {
        std::set<std::string> names;
        for (const auto& entry : fs::directory_iterator(folder))
            names.insert(entry.path().filename().string());
        return names;
    }

    test::TempDir temp;
};

// The references of the demo's documents of a type, dated on or after a day.
std::set<std::string> DemoPages(int type, const std::string& from, const std::string& ext) {
    json demo = json::parse(ReadAll(std::string(DOVREL_SOURCE_DIR) + "/samples/demo.json"));
    std::set<std::string> names;
    for (const json& document : demo["documents"])
        if (document.value("type", 0) == type && document["date"] >= from)
            names.insert(std::to_string(type) + "-" + document["reference"].get<std::string>() +
                         ext);
    return names;
}

TEST_F(PrintRunTest, AllDeliveryNotesOfTheDemoWithTheRunsOwnChoices) {
    fs::path folder = temp.path() / "pages";
    auto run = RunCli({"print", DOVREL_DEMO_DIR, "--all", "--lang", "he", "--out", folder.string(),
                       "--rules", "none", "--title", "העתק", "--no-details"});
    ASSERT_EQ(run.code, 0) << run.err;
    EXPECT_EQ(filesIn(folder), DemoPages(20, "", ".htm"));
    EXPECT_THAT(run.err, HasSubstr("5 pages written"));
    std::string page = ReadAll(folder / "20-4101.htm");
    EXPECT_THAT(page, HasSubstr("rules='none'"));
    EXPECT_THAT(page, HasSubstr(FromUtf8(Utf8("4101&nbsp;העתק"))));
    EXPECT_THAT(page, testing::Not(HasSubstr(FromUtf8(Utf8(">פרטים<")))));
    // The run's choices were for that run only.
    EXPECT_EQ(RunCli({"settings", "list"}).out, "");

    fs::path later = temp.path() / "later";
    run = RunCli({"print", DOVREL_DEMO_DIR, "--all", "--lang", "2", "--out", later.string(),
                  "--from-date", "01/01/2024", "--type", "21"});
    ASSERT_EQ(run.code, 0) << run.err;
    EXPECT_EQ(filesIn(later), DemoPages(21, "2024-01-01", ".htm"));
}

// A document that cannot be printed is named and passed over; the pages of
// the others are written, and the exit code tells.
TEST_F(PrintRunTest, DocumentsThatCannotBePrintedArePassedOver) {
    json tooMany = json::array();
    for (int i = 0; i < 41; ++i)
        tooMany.push_back(test::Line("K", "x"));
    json nan = test::Line("B", "y");
    nan["price"] = {{"hex", "00 00 00 00 00 00 F8 7F"}};
    test::TestCompany company(
        json{{"documents",
              {test::Doc(20, "1", "A", {test::Line("A", "x")}), test::Doc(20, "2", "B", tooMany),
               test::Doc(20, "3", "C", {nan}), test::Doc(20, "4", "D")}}}
            .dump());
    fs::path folder = temp.path() / "pages";
    auto run = RunCli(
        {"print", company.path().string(), "--all", "--lang", "en", "--out", folder.string()});
    EXPECT_EQ(run.code, 4) << run.err;
    EXPECT_EQ(filesIn(folder), (std::set<std::string>{"20-1.htm", "20-4.htm"}));
    EXPECT_THAT(run.err, HasSubstr("record 5: The document has more than 40 lines"));
    EXPECT_THAT(run.err, HasSubstr("record 48: Overflow"));
    EXPECT_THAT(run.err, HasSubstr("2 pages written, 2 documents passed over"));
}

// The text of a PDF as poppler reads it, without spaces and direction marks:
// the Hebrew page sets some texts a character at a time.
std::string Squeezed(const std::string& text) {
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == ' ' || text[i] == '\n' || text[i] == '\f')
            continue;
        // U+200E, U+200F and U+202A to U+202E.
        if (text.compare(i, 2, "\xE2\x80") == 0 && i + 2 < text.size()) {
            auto third = static_cast<unsigned char>(text[i + 2]);
            if (third == 0x8E || third == 0x8F || (third >= 0xAA && third <= 0xAE)) {
                i += 2;
                continue;
            }
        }
        out += text[i];
    }
    return out;
}

std::string Output(const std::string& command) {
    std::string text;
    if (FILE* pipe = popen(("timeout 60 " + command).c_str(), "r")) {
        char buffer[4096];
        for (size_t n; (n = fread(buffer, 1, sizeof buffer, pipe)) > 0;)
            text.append(buffer, n);
        pclose(pipe);
    }
    return text;
}

TEST_F(PrintRunTest, PdfOfADeliveryNoteIsOneA4PageWithItsTexts) {
    bool ci = std::getenv("CI") != nullptr;
    if (!ChromiumPdf::Find() && !ci)
        GTEST_SKIP() << "chromium is not installed (scripts/install-deps --test installs it)";
    std::string pdf = (temp.path() / "note.pdf").string();
    auto run = RunCli({"print", DOVREL_DEMO_DIR, "--lang", "he", "--pdf", "--out", pdf, "--no-open",
                       "--today", "2026-01-01"},
                      "", 150);
    ASSERT_EQ(run.code, 0) << run.err;
    std::string info = Output("pdfinfo " + pdf);
    EXPECT_THAT(info, testing::ContainsRegex("Pages: +1\n"));
    EXPECT_THAT(info, HasSubstr("(A4)"));
    std::string text = Squeezed(Output("pdftotext " + pdf + " -"));
    EXPECT_THAT(text, HasSubstr("4101"));
    EXPECT_THAT(text, HasSubstr("כהןשיפוציםובניה"));

    fs::path folder = temp.path() / "english";
    run = RunCli({"print", DOVREL_DEMO_DIR, "--lang", "en", "--pdf", "--count", "2", "--out",
                  folder.string()},
                 "", 150);
    ASSERT_EQ(run.code, 0) << run.err;
    EXPECT_EQ(filesIn(folder), (std::set<std::string>{"20-4101.pdf", "20-4102.pdf"}));
    std::string english = Output("pdftotext " + (folder / "20-4102.pdf").string() + " -");
    for (const char* label : {"Delivery Note", "Date Produced:", "Description", "Final Total:"})
        EXPECT_THAT(english, HasSubstr(label));
    EXPECT_THAT(english, HasSubstr("4102"));
}

// Without Chromium the command says so and writes nothing.
TEST_F(PrintRunTest, PdfWithoutChromiumWritesNothing) {
    std::string path = std::getenv("PATH") ? std::getenv("PATH") : "";
    setenv("PATH", (temp.path() / "empty").c_str(), 1);
    fs::path folder = temp.path() / "pdf";
    auto run = RunCli(
        {"print", DOVREL_DEMO_DIR, "--all", "--pdf", "--lang", "he", "--out", folder.string()});
    setenv("PATH", path.c_str(), 1);
    EXPECT_EQ(run.code, 1);
    EXPECT_THAT(run.err, HasSubstr("Chromium, which is not installed"));
    EXPECT_FALSE(fs::exists(folder));
}

} // namespace
} // namespace dovrel
