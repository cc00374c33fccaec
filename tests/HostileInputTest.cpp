// Odd and hostile input: company paths of every shape, things that are not
// regular files where a data file should be, huge counts and every byte value
// in every text field.

#include "app/cli/ShowCommand.h"
#include "app/cli/StateJson.h"
#include "control/Card.h"
#include "platform/Error.h"
#include "RunCli.h"
#include "TestCompany.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <tuple>

namespace dovrel {
namespace {

namespace fs = std::filesystem;
using nlohmann::json;
using ::testing::HasSubstr;
using test::U;
using test::W;

constexpr int16_t kDeliveryRow = 13;  // type 20, ISHP.FIX
const char* const kMissing = "קבצי מסמכים לא נמצאו";

json OneDocument(const std::string& reference) {
    return {{"documents",
             {{{"type", 20}, {"reference", reference}, {"customer", "משה \"כהן\" & בנו"},
               {"lines", {{{"key", "A1"}, {"description", "a & b"}, {"price", 1},
                           {"quantity", 1}}}}}}}};
}

// A command that hangs on a hostile path is killed after 30 seconds (-2).
test::CliResult RunCli(const std::vector<std::string>& args) {
    return test::RunCli(args, "", 30);
}

class HostileInputTest : public ::testing::Test {
protected:
    // Reads the first delivery note of the company path (UTF-8).
    int32_t read(const std::string& compPath, const std::string& direction = "First") {
        int16_t row = kDeliveryRow;
        std::string dir = direction;
        std::string fromDate;
        return card.ReadStock(W(compPath), row, card.PubSearchBy, card.PubSearchValue, dir,
                              fromDate);
    }
    // A refused path: result 0, one message saying no document files were
    // found, the document shown before kept.
    ::testing::AssertionResult refused(const std::string& compPath) {
        messages.take();
        int32_t result = read(compPath);
        std::vector<RecordedMessages::Shown> shown = messages.take();
        if (result != 0 || shown.size() != 1)
            return ::testing::AssertionFailure() << "result " << result << ", " << shown.size()
                                                 << " messages";
        if (U(shown[0].title) != "שגיאה" || U(shown[0].text).find(kMissing) == std::string::npos)
            return ::testing::AssertionFailure() << U(shown[0].title) << ": " << U(shown[0].text);
        if (U(card.txtReference1.Text()) != "shown")
            return ::testing::AssertionFailure() << "the shown document was replaced";
        return ::testing::AssertionSuccess();
    }

    ModuleState state;
    RecordedMessages messages;
    Card card{messages, state};
    test::TempDir root;
};

TEST_F(HostileInputTest, CompanyPathsWithSpacesQuotesDotsAndOddLetters) {
    for (const char* name : {"my company", "it's \"ours\"", "חברה 2", "a;b $(x) `y` *?"}) {
        fs::path dir = root.path() / "sub" / name;
        sample::WriteCompany(OneDocument("7"), dir);
        std::string plain = dir.string();
        std::string dotted = (root.path() / "sub" / ".." / "sub" / "." / name).string();
        std::string backslashed = plain;
        std::replace(backslashed.begin(), backslashed.end(), '/', '\\');
        for (const std::string& path : {plain, dotted, backslashed}) {
            card.txtReference1.setText("");
            EXPECT_GT(read(path), 0) << path;
            EXPECT_EQ(U(card.txtReference1.Text()), "7") << path;
            EXPECT_TRUE(messages.take().empty()) << path;
        }
        auto [code, out, err] = RunCli({"show", plain});
        EXPECT_EQ(code, 0) << err;
        EXPECT_THAT(out, HasSubstr("משה \"כהן\" & בנו"));
    }
}

TEST_F(HostileInputTest, ThingsThatAreNotACompanyOrNotARegularFileAreRefused) {
    fs::path good = root.path() / "good";
    sample::WriteCompany(OneDocument("shown"), good);
    ASSERT_GT(read(good.string()), 0);

    fs::path fifo = root.path() / "fifo", device = root.path() / "device",
             loop = root.path() / "loop", folder = root.path() / "folder";
    for (const fs::path& dir : {fifo, device, loop})
        fs::create_directories(dir);
    ASSERT_EQ(mkfifo((fifo / "ISHP.FIX").c_str(), 0600), 0);
    fs::create_symlink("/dev/zero", device / "ishp.fix");
    fs::create_symlink("ISHP.FIX", loop / "ISHP.FIX");
    fs::create_directories(folder / "ISHP.FIX");

    for (const std::string& path : {(good / "ISHP.FIX").string(),  // a file, not a directory
                                    fifo.string(), device.string(), loop.string(),
                                    folder.string(), (root.path() / "none").string(),
                                    std::string(), good.string() + std::string(1, '\0') + "x",
                                    good.string() + "\x01\x7f\n", std::string(5000, 'x')})
        EXPECT_TRUE(refused(path)) << path.size() << " " << path;

    // The readers without a check of their own refuse such files too.
    for (const auto& [dir, target] : {std::pair{fifo, fifo / "ISHP.FIX"},
                                      std::pair{device, fs::path("/dev/zero")}}) {
        fs::create_symlink(target, dir / "ITM.fix");
        fs::create_symlink(target, dir / "ACT.fix");
        std::string path = W(dir.string());
        for (auto reader : {&Card::ReadITM, &Card::ReadACT}) {
            try {
                (card.*reader)(path);
                ADD_FAILURE() << dir << " was read";
            } catch (const Error& e) {
                EXPECT_THAT(e.what(), HasSubstr("not a regular file")) << dir;
            }
        }
    }

    // The command says the same and ends, without waiting on the pipe or
    // reading the device.
    for (const fs::path& dir : {fifo, device}) {
        auto [code, out, err] = RunCli({"show", dir.string()});
        EXPECT_EQ(code, 1) << dir;
        EXPECT_EQ(err, std::string("dovrel: שגיאה: ") + kMissing + "\n");
    }
    for (const std::string& dir : {(good / "ISHP.FIX").string(), std::string()}) {
        auto [code, out, err] = RunCli({"show", dir});
        EXPECT_EQ(code, 1) << dir;
        EXPECT_THAT(err, HasSubstr("Company directory not found")) << dir;
    }
}

// Every byte value in every text field, a header that counts 255 line
// records, and searches for the odd texts they make: the reader shows each
// document and the state is valid UTF-8.
TEST_F(HostileInputTest, EveryByteValueInEveryTextFieldAndHugeLineCounts) {
    auto bytes = [](int doc, int width, int salt) {
        std::string hex;
        for (int i = 0, value; i < width; ++i) {
            value = (doc * width + i + salt) % 256;
            hex += {"0123456789ABCDEF"[value / 16], "0123456789ABCDEF"[value % 16], ' '};
        }
        return json{{"hex", hex}};
    };
    constexpr int kDocs = 52;  // 52 × 5 bytes of the reference cover 256 values
    json documents = json::array();
    for (int d = 0; d < kDocs; ++d) {
        json line = {{"key", bytes(d, 12, 1)}, {"description", bytes(d, 40, 2)},
                     {"details", bytes(d, 8, 3)}, {"price", 1}, {"quantity", 2}};
        json doc = {{"type", 20}, {"account", bytes(d, 8, 4)}, {"customer", bytes(d, 30, 5)},
                    {"address1", bytes(d, 30, 6)}, {"address2", bytes(d, 30, 7)},
                    {"reference", bytes(d, 5, 8)},
                    {"remarks", {bytes(d, 48, 9), bytes(d, 48, 10), bytes(d, 48, 11)}},
                    {"lines", {line}}};
        if (d == kDocs - 1)
            doc["lineCount"] = 255;
        documents.push_back(doc);
    }
    test::TestCompany company(json{{"documents", documents}}.dump());
    std::string path = company.path().string();

    auto stateIsUtf8 = [&] {
        std::string text;
        EXPECT_NO_THROW(text = StateJson::Build(card).dump());  // strict: throws on bad UTF-8
        EXPECT_EQ(json::parse(text), StateJson::Build(card));
    };
    int shown = 0;
    read(path, "First");
    while (card.PubPrevLocation != 0 && shown <= kDocs) {
        ++shown;
        stateIsUtf8();
        EXPECT_EQ(card.DocLines.Rows(), 3) << shown;
        card.PubPrevLocation = 0;
        read(path, "Next");
    }
    EXPECT_EQ(shown, kDocs);
    EXPECT_TRUE(messages.shown().empty()) << U(messages.shown().back().text);

    // Backward, and searches for each document's own odd texts.
    read(path, "Last");
    EXPECT_GT(card.PubPrevLocation, 0);
    for (int d = 0; d < kDocs; d += 5) {
        card.PubSearchBy = "";
        card.PubACTLocation = 2 + 3 * d - 1;
        read(path, "Next");
        std::string account = card.txtAccountKey.Text();
        std::string customer = card.txtCustomerName.Text();
        for (const auto& [by, value] : {std::pair{"AccountKey", account},
                                        std::pair{"CustomerName", customer}}) {
            card.PubSearchBy = by;
            card.PubSearchValue = Variant(value);
            card.PubPrevLocation = 0;
            read(path, "First");
            EXPECT_NE(card.PubPrevLocation, 0) << by << " " << d;
        }
        EXPECT_NE(card.txtCustomerName.Text().find(customer), std::string::npos);
        stateIsUtf8();
    }
    EXPECT_TRUE(messages.shown().empty()) << U(messages.shown().back().text);

    // A count of 255 that runs over the next documents takes their lines as
    // its own, up to the limit of 40, and then says so.
    json runOver = json::array();
    for (int d = 0; d < 45; ++d)
        runOver.push_back({{"type", 20}, {"lines", {{{"key", "K"}, {"price", 1}}}}});
    runOver[0]["lineCount"] = 255;
    test::TestCompany over(json{{"documents", runOver}}.dump());
    card.PubSearchBy.clear();
    EXPECT_EQ(read(over.path().string()), 0);
    ASSERT_EQ(messages.shown().size(), 1u);
    EXPECT_THAT(messages.take().back().text, HasSubstr("more than 40 lines"));
    EXPECT_EQ(card.ProgressFill.Width(), 0);
    stateIsUtf8();

    // The command prints them as UTF-8 too.
    auto [code, out, err] = RunCli({"show", path, "--json"});
    EXPECT_EQ(code, 0) << err;
    EXPECT_NO_THROW(json::parse(out).dump());
}

} // namespace
} // namespace dovrel
