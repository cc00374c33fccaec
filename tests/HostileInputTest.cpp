// Odd and hostile input: company paths of every shape, things that are not
// regular files where a data file should be, huge counts and every byte value
// in every text field.

#include "TestCompany.h"
#include "app/session/StateJson.h"
#include "control/Card.h"
#include "platform/Error.h"

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
using test::U;
using test::W;
using ::testing::HasSubstr;

constexpr int16_t kDeliveryRow = 13; // type 20, ISHP.FIX
const char* const kMissing = "קבצי מסמכים לא נמצאו";

json OneDocument(const std::string& reference) {
    json company = json::parse(R"({"documents": [{"type": 20, "customer": "משה \"כהן\" & בנו",
                                                  "lines": [{"key": "A1", "price": 1}]}]})");
    company["documents"][0]["reference"] = reference;
    return company;
}

class HostileInputTest : public ::testing::Test {
protected:
    // Reads the first delivery note of the company path (UTF-8).
    int32_t read(const std::string& compPath, std::string direction = "First") {
        int16_t row = kDeliveryRow;
        std::string fromDate;
        return card.ReadStock(W(compPath), row, card.PubSearchBy, card.PubSearchValue, direction,
                              fromDate);
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

    for (const std::string& path : {(good / "ISHP.FIX").string(), // a file, not a directory
                                    fifo.string(), device.string(), loop.string(), folder.string(),
                                    (root.path() / "none").string(), std::string(),
                                    good.string() + std::string(1, '\0') + "x",
                                    good.string() + "\x01\x7f\n", std::string(5000, 'x')}) {
        // Refused: result 0, one message that no document files were found, the
        // document shown before kept.
        SCOPED_TRACE(std::to_string(path.size()) + " " + path);
        EXPECT_EQ(read(path), 0);
        std::vector<RecordedMessages::Shown> shown = messages.take();
        ASSERT_EQ(shown.size(), 1u);
        EXPECT_EQ(U(shown[0].title), "שגיאה");
        EXPECT_THAT(U(shown[0].text), HasSubstr(kMissing));
        EXPECT_EQ(U(card.txtReference1.Text()), "shown");
    }

    // The readers without a check of their own refuse such files too.
    for (const auto& [dir, target] :
         {std::pair{fifo, fifo / "ISHP.FIX"}, std::pair{device, fs::path("/dev/zero")}}) {
        fs::create_symlink(target, dir / "ITM.fix");
        fs::create_symlink(target, dir / "ACT.fix");
        std::string path = W(dir.string());
        for (auto reader : {&Card::ReadITM, &Card::ReadACT})
            EXPECT_THAT([&] { (card.*reader)(path); },
                        ::testing::ThrowsMessage<Error>(HasSubstr("not a regular file")))
                << dir;
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
    constexpr int kDocs = 52; // 52 × 5 bytes of the reference cover 256 values
    const std::pair<const char*, int> lineFields[] = {
        {"key", 12}, {"description", 40}, {"details", 8}};
    const std::pair<const char*, int> docFields[] = {
        {"account", 8},   {"customer", 30}, {"address1", 30}, {"address2", 30},
        {"reference", 5}, {"remarks", 48},  {"remarks", 48},  {"remarks", 48}};
    json documents = json::array();
    for (int d = 0; d < kDocs; ++d) {
        json line = json::parse(R"({"price": 1, "quantity": 2})"), doc = {{"type", 20}};
        int salt = 1;
        for (const auto& [field, width] : lineFields)
            line[field] = bytes(d, width, salt++);
        for (const auto& [field, width] : docFields)
            (field == std::string("remarks") ? doc[field].emplace_back() : doc[field]) =
                bytes(d, width, salt++);
        doc["lines"] = {line};
        if (d == kDocs - 1)
            doc["lineCount"] = 255;
        documents.push_back(doc);
    }
    test::TestCompany company(json{{"documents", documents}}.dump());
    std::string path = company.path().string();

    // dump() is strict: it throws on bad UTF-8.
    auto stateIsUtf8 = [&] { EXPECT_NO_THROW(json::parse(StateJson::Build(card).dump())); };
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
        for (const auto& [by, value] :
             {std::pair{"AccountKey", account}, std::pair{"CustomerName", customer}}) {
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
}

} // namespace
} // namespace dovrel
