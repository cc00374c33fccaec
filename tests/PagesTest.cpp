// The printed pages: the Hebrew page with and without amounts, the English
// page, their shared pieces, and the print button.

#include "TestCompany.h"
#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "pages/Html.h"
#include "pages/PageFile.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>

#include <sys/stat.h>
#include <unistd.h>

namespace dovrel {
namespace {

using nlohmann::json;
using test::Doc;
using test::Line;
using test::ReadAll;
using test::U;
using test::W;
namespace fs = std::filesystem;

std::vector<std::string> PageLines(const std::string& page) {
    std::vector<std::string> lines;
    size_t start = 0;
    for (size_t end; (end = page.find("\r\n", start)) != std::string::npos; start = end + 2)
        lines.push_back(page.substr(start, end - start));
    EXPECT_EQ(start, page.size()) << "the page does not end with CR LF";
    for (const std::string& line : lines)
        EXPECT_EQ(line.find_first_of("\r\n"), std::string::npos) << line;
    return lines;
}

size_t Count(const std::vector<std::string>& lines, const std::string& line) {
    return static_cast<size_t>(std::count(lines.begin(), lines.end(), line));
}

bool Has(const std::vector<std::string>& lines, const std::string& line) {
    return Count(lines, line) > 0;
}

// The lines of a page that start with a prefix, in order.
std::vector<std::string> Starting(const std::vector<std::string>& lines,
                                  const std::string& prefix) {
    std::vector<std::string> found;
    for (const std::string& line : lines)
        if (line.rfind(prefix, 0) == 0)
            found.push_back(line);
    return found;
}

TEST(PagePieces, AsIsCellsCellsAndNumbers) {
    const std::string open =
        "<table cellspacing='0' cellpadding='0' border='0' align='right' dir='rtl'><tr>";
    EXPECT_EQ(AsIsTable(""), open + "</tr></table>");
    EXPECT_EQ(AsIsTable("a c"), open + "<td>c</td><td>&nbsp;</td><td>a</td></tr></table>");
    EXPECT_EQ(AsIsTable("<&"), open + "<td>&amp;</td><td>&lt;</td></tr></table>");
    EXPECT_EQ(EscapeHtml("a<b>&\"'\xE0"), "a&lt;b&gt;&amp;&quot;&#39;\xE0");

    EXPECT_EQ(RightCell(""), "<td valign='top' align='right'>&nbsp;</td>");
    EXPECT_EQ(RightCell(" "), "<td valign='top' align='right'> </td>");

    EXPECT_EQ(FormatFixed2(0), "0.00");
    EXPECT_EQ(FormatFixed2(0.004), "0.00");
    EXPECT_EQ(FormatFixed2(-0.004), "-0.00");
    EXPECT_EQ(FormatFixed2(1234.5), "1234.50");
    EXPECT_EQ(FormatFixed2(-12.345), "-12.35");
    EXPECT_THROW(FormatFixed2(1.0 / 0.0), Error);
}

// A control with recording services on a private module state, pages going
// to a private temporary directory.
class PagesTest : public ::testing::Test, protected test::CardDesk<> {
protected:
    void SetUp() override {
        card = std::make_unique<Card>(services, state);
        card->UserControl_InitProperties(nullptr); // loads the settings form too
        state.LogoFile = W("logo 'a'.png");
        state.CompTitle = W("<b>חברת הדגמה</b>");
        state.PicX = "40";
        state.PicY = "30";
        pics().txtPicPath.setText("/pics/");
        pics().txtDBPath.setText(temp.str() + "/nodb/");
    }

    ItemPicsForm& pics() { return dynamic_cast<ItemPicsForm&>(*state.Forms.at("frmItemPics")); }

    void show(const json& documents, int16_t type = 20) {
        company = std::make_unique<test::TestCompany>(json{
            {"company", {{"name", "Demo"}, {"currencies", {"Euro", "Pound"}}}},
            {"items",
             {{{"key", "A100"}, {"name", W("x")}, {"category", "01"}, {"foreignName", "Widget"}},
              {{"key", "B200"}, {"name", W("y")}, {"category", "02"}, {"foreignName", ""}}}},
            {"documents", documents}}.dump());
        int32_t start = 2;
        ASSERT_EQ(card->ShowDoc(company->compPath(), type, start), 0);
        ASSERT_TRUE(messages.shown().empty()) << U(messages.shown().front().text);
    }
    std::vector<std::string> hebrew(int16_t mode = 0) {
        std::string path = temp.str() + "/page.htm";
        card->CreateHTML(path, mode);
        return PageLines(ReadAll(path));
    }
    std::vector<std::string> english(bool useForeignNames = false) {
        std::string path = temp.str() + "/page.htm";
        card->CreateHTMLEng(path, useForeignNames);
        return PageLines(ReadAll(path));
    }

    test::TempDir temp;
    test::ScopedEnv tmp{"TMPDIR", temp.str()};
    std::unique_ptr<Card> card;
    std::unique_ptr<test::TestCompany> company;
};

json Delivery() {
    json lines = {Line("A100", "מסמר", 10, 2), Line("B200", "בורג", 2.5, 4),
                  Line("A100", "שוב", 1, 1)};
    lines[0]["discount"] = 12.5;
    lines[0]["details"] = "D1";
    lines[1]["currency"] = 10;
    json doc = Doc(20, "1234", "משה כהן", lines);
    doc["address1"] = "רחוב הגפן 9";
    doc["warehouse"] = 0;
    doc["discountPercent"] = 10;
    doc["remarks"] = {"הערה", "", "אחרונה"};
    return json::array({doc});
}

TEST_F(PagesTest, HebrewPricedPageHasItsHeadHeadingLinesAndTotals) {
    show(Delivery());
    card->ChkWithDrawing.setValue(1);
    card->chkLineDisc.setValue(1);
    card->ChkShowDetails.setValue(1);
    state.Doc.lines[1].picFile = "a100.jpg" + std::string(42, ' ');
    std::vector<std::string> page = hebrew();

    EXPECT_EQ(page.front(), "<HTML>");
    EXPECT_EQ(page.back(), "</HTML>");
    EXPECT_TRUE(
        Has(page, "<meta http-equiv='Content-Type' content='text/html; charset=windows-1255'>"));
    EXPECT_TRUE(Has(page, "<td align='left'><img src='logo &#39;a&#39;.png'></td>"));
    EXPECT_TRUE(Has(page, W("<td align='left' class=TD1><b>חברת הדגמה</b></td>")));
    EXPECT_TRUE(Has(page, "<Font class=TD1>06/12/2026</Font>"));
    EXPECT_TRUE(Has(page, "<Font class=TD4>1234&nbsp;" + card->cmbDocType.Text() + "</Font>"));
    EXPECT_TRUE(Has(page, W("<Font class=TD3>15/03/2024&nbsp;תאריך הפקה</Font>")));
    EXPECT_TRUE(Has(page, "<TD colspan='1' align='right' class=TD1>0</TD>"));
    EXPECT_TRUE(Has(page, "<TD colspan='1' align='right' class=TD1>" +
                              AsIsTable(state.Doc.header.customerVisual) + "</TD>"));

    std::vector<std::string> heads = Starting(page, "    <td");
    std::vector<std::string> expected = {"    <td width='40' align='right' class=TD5>" +
                                         W("שרטוט") + "</td>"};
    for (const char* caption :
         {"סהכ שח", "%הנחה", "מטבע", "מחיר", "כמות", "פרטים", "תאור", "פריט", "שורה"})
        expected.push_back(W(std::string("    <td align='right' class=TD5>") + caption + "</td>"));
    EXPECT_EQ(heads, expected);

    // Three line rows after the heading row; the same item key shows the
    // first line's drawing, and a line without one shows a space.
    EXPECT_EQ(Count(page, "<tr>"), 2u + 3u); // logo and company rows, three line rows
    std::string drawing = "<td align='right'><img src='/pics/a100.jpg' width='40' height='30' "
                          "border='0' align='middle'></td>";
    EXPECT_EQ(Count(page, drawing), 2u);
    EXPECT_EQ(Count(page, "<td align='right'>&nbsp;</td>"), 1u);
    EXPECT_TRUE(Has(page, RightCell("12.50")));
    EXPECT_TRUE(Has(page, RightCell("D1")));
    EXPECT_TRUE(Has(page, RightCell(AsIsTable(state.Doc.lines[2].descriptionVisual))));

    double total = state.Doc.header.totalBeforeDiscount;
    EXPECT_TRUE(Has(page, "<TD align='right' class=TD1>" + FormatAmount(total) + "</TD>"));
    double discount = state.Doc.header.discountPercent * total / 100.0;
    EXPECT_TRUE(Has(page, "<TD align='right' class=TD1>" + FormatAmount(discount) + "</TD>"));
    EXPECT_TRUE(Has(page, W("<TD dir='ltr' align='right' class=TD5>הנחה : %10.00</TD>")));
    EXPECT_TRUE(Has(page, "<TD align='right' class=TD1>" + card->txtTotal1.Text() + "</TD>"));
    EXPECT_EQ(Count(page, "<TD align='right' class=TD1>" + AsIsTable("") + "</TD>"), 1u);
    EXPECT_TRUE(Has(page, W("<p align='center'><A HREF='https://dovrel.example/'><font size='2'>"
                            "טברין מערכות מידע</font></A></p>")));
}

TEST_F(PagesTest, PageWithoutAmountsHasCheckboxesAndNoMoney) {
    show(Delivery());
    card->txtTitle.setText("   ");
    std::vector<std::string> page = hebrew(2);
    EXPECT_TRUE(Has(page, "<Font class=TD4>1234&nbsp;   </Font>"));
    for (int r = 1; r <= 3; ++r)
        EXPECT_TRUE(Has(page, "<td align='right'><input type='checkbox' name='Sel" +
                                  std::to_string(r) + "' value='0'></td>"));
    std::vector<std::string> heads = Starting(page, "    <td");
    ASSERT_EQ(heads.size(), 6u); // checked, quantity, details, description, item, line
    EXPECT_EQ(heads[0], W("    <td align='right' class=TD5>נבדק</td>"));
    for (const std::string& line : page) {
        EXPECT_EQ(line.find(W("סהכ")), std::string::npos) << line;
        EXPECT_EQ(line.find("class=TD1f>"), std::string::npos) << line;
    }
    EXPECT_FALSE(Has(page, RightCell(card->DocLines.TextMatrix(1, 5))));
    EXPECT_EQ(Count(page, "<TR>"), 3u + 3u); // addressee rows and the three remarks
}

TEST_F(PagesTest, ForeignCurrencyTotalShowsOnlyWhenItDiffersByMoreThanOne) {
    show(Delivery());
    card->ChkShowTotalFC.setValue(1);
    auto shown = [this](double foreign, double before) {
        state.Doc.header.foreignTotal = foreign;
        state.Doc.header.totalBeforeDiscount = before;
        return Has(hebrew(), "<TD align='right' class=TD1f>" + FormatAmount(foreign) + "</TD>");
    };
    EXPECT_FALSE(shown(1000.0, 1000.5));
    EXPECT_TRUE(shown(1002.0, 1000.0));
    EXPECT_FALSE(shown(1001.0, 1000.0));
    EXPECT_FALSE(shown(0.01, 5.0));
    card->ChkShowTotalFC.setValue(0);
    EXPECT_FALSE(shown(1002.0, 1000.0));
}

TEST_F(PagesTest, EnglishPageComputesItsTotalsAndTakesForeignNames) {
    json docs = Delivery();
    docs[0]["discountPercent"] = 0.5;
    docs[0]["lines"].push_back(Line("B200", "אפס", 3, 0));
    show(docs);
    std::string compDir = company->compPath();
    ReadAdf(PathFromCp1255(compDir), state.Company);
    card->ReadITM(compDir);
    card->ChkShowDetails.setValue(0);
    std::vector<std::string> page = english(true);

    EXPECT_TRUE(Has(page, "<Font class=TD1>12-06-2026</Font>"));
    const DocTypeRow& type = state.DocTypes[static_cast<size_t>(card->cmbDocType.ListIndex())];
    EXPECT_TRUE(Has(page, "<Font class=TD4>" + type.englishTitle + "&nbsp;1234</Font>"));
    EXPECT_TRUE(Has(page, "<Font class=TD3>Date Produced:&nbsp;03/15/2024</Font>"));
    EXPECT_TRUE(Has(page, "<TD colspan='3' align='left' class=TD1>" + card->txtCustomerName.Text() +
                              "</TD>"));
    EXPECT_TRUE(Has(page, "    <td align='left' class=TD5>&nbsp;</td>"));

    // 2 x 10 less 12.5% = 17.50; 4 x 2.5 = 10.00; 1 x 1 = 1.00; quantity 0 shows nothing.
    EXPECT_TRUE(Has(page, "<td valign='top' align='right'>17.50</td>"));
    EXPECT_TRUE(Has(page, "<td valign='top' align='right'>10.00</td>"));
    EXPECT_TRUE(Has(page, "<td valign='top' align='right'>1.00</td>"));
    EXPECT_EQ(Count(page, "<td valign='top' align='right'>&nbsp;</td>"), 1u);
    EXPECT_EQ(Count(page, "<td valign='top' align='left'>Widget</td>"), 2u);
    // B200 has no foreign name: the grid's description stays.
    EXPECT_TRUE(
        Has(page, "<td valign='top' align='left'>" + card->DocLines.TextMatrix(2, 2) + "</td>"));
    // The coin column prints the currency's code, never the grid's Hebrew
    // abbreviation; the company's own currencies come from adf.fix.
    EXPECT_EQ(Count(page, "<td valign='top' align='left'>" +
                              CurrencyNames(21, state.Company).second + "</td>"),
              3u);
    EXPECT_NE(CurrencyNames(21, state.Company).second, card->DocLines.TextMatrix(1, 6));
    std::string euro = CurrencyNames(10, state.Company).second;
    EXPECT_NE(euro, "10");
    EXPECT_TRUE(Has(page, "<td valign='top' align='left'>" + euro + "</td>"));

    // A discount of 0.5 counts as none; VAT is always " 0 ".
    auto total = [&page](const char* label, const std::string& value) {
        auto it =
            std::find(page.begin(), page.end(),
                      std::string("<TD bgcolor='black' align='left' class=TD5>") + label + "</TD>");
        return it != page.end() && *(it + 1) == "<TD align='right' class=TD1>" + value + "</TD>";
    };
    EXPECT_TRUE(total("Total before Discount:", "28.50"));
    EXPECT_TRUE(total("Discount:", "0.00"));
    EXPECT_TRUE(total("Total:", "28.50"));
    EXPECT_TRUE(total("Vat:", " 0 "));
    EXPECT_TRUE(total("Final Total:", "28.50"));
    EXPECT_TRUE(
        Has(page, "<TD align='left' class=TD1>" + state.Doc.header.remarksLogical[2] + "</TD>"));

    state.Doc.header.discountPercent = -2;
    page = english(true);
    EXPECT_TRUE(total("Discount:", "-0.57"));
    EXPECT_TRUE(total("Final Total:", "29.07"));
}

TEST_F(PagesTest, ExportDocumentsKeepTheGridDescriptionAndNoTitleIsAnError) {
    json doc = Doc(6, "77", "Buyer Ltd", {Line("A100", "מסמר", 10, 1)});
    show(json::array({doc}), 6);
    std::string compDir = company->compPath();
    card->ReadITM(compDir);
    std::vector<std::string> page = english(true);
    EXPECT_TRUE(
        Has(page, "<td valign='top' align='left'>" + card->DocLines.TextMatrix(1, 2) + "</td>"));
    EXPECT_FALSE(Has(page, "<td valign='top' align='left'>Widget</td>"));

    std::string path = temp.str() + "/page.htm";
    std::string before = ReadAll(path);
    card->cmbDocType.setListIndex(-1);
    bool useForeignNames = false;
    EXPECT_THROW(card->CreateHTMLEng(path, useForeignNames), Error);
    EXPECT_EQ(ReadAll(path), before) << "a failed page leaves the earlier one as it was";
}

TEST_F(PagesTest, DocumentTextsReachThePageEscaped) {
    json doc = Doc(20, "<1>", "<script>x</script>", {Line("A&B", "<i>", 1, 1)});
    doc["remarks"] = {"\"quoted\" 'x'", "", ""};
    show(json::array({doc}));
    for (const std::vector<std::string>& page : {hebrew(), english()}) {
        for (const std::string& line : page) {
            EXPECT_EQ(line.find("<script"), std::string::npos) << line;
            EXPECT_EQ(line.find("<i>"), std::string::npos) << line;
            EXPECT_EQ(line.find("A&B"), std::string::npos) << line;
            EXPECT_EQ(line.find("\"quoted\""), std::string::npos) << line;
        }
    }
    EXPECT_TRUE(Has(hebrew(), RightCell("A&amp;B")));
    EXPECT_TRUE(Has(english(), "<td valign='top' align='left'>A&amp;B</td>"));
    EXPECT_TRUE(Has(english(), "<TD colspan='3' align='left' class=TD1>" +
                                   EscapeHtml(card->txtCustomerName.Text()) + "</TD>"));
    EXPECT_NE(card->txtCustomerName.Text().find("script"), std::string::npos);
}

TEST_F(PagesTest, WriteCellWritesOnlyIntoThePageBeingBuilt) {
    int16_t number = 1;
    std::string value;
    EXPECT_THROW(card->WriteCell(number, value), Error);
    EXPECT_EQ(value, "");
}

TEST_F(PagesTest, PrintWritesThePrivatePageAndOpensItOrSaysWhatFailed) {
    show(Delivery());
    fs::path dir = PrivatePageDir().native();
    fs::path page = dir / "dvprint.htm";

    card->CmbDocLang.setListIndex(-1);
    card->Click("PrintButt");
    EXPECT_FALSE(fs::exists(page));
    EXPECT_TRUE(browser.opened.empty());

    // A link planted where the page goes is replaced, its target untouched.
    fs::path victim = temp.path() / "victim";
    std::ofstream(victim) << "keep";
    fs::create_symlink(victim, page);
    card->CmbDocLang.setListIndex(0);
    card->Click("PrintButt");
    EXPECT_EQ(ReadAll(victim), "keep");
    EXPECT_FALSE(fs::is_symlink(page));
    EXPECT_TRUE(Has(PageLines(ReadAll(page)),
                    "<Font class=TD4>1234&nbsp;" + card->cmbDocType.Text() + "</Font>"));
    ASSERT_EQ(browser.opened, std::vector<std::string>{page.string()});
    struct stat st {};
    ASSERT_EQ(stat(dir.c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 0777, 0700u);
    ASSERT_EQ(stat(page.c_str(), &st), 0);
    EXPECT_EQ(st.st_mode & 0777, 0600u);

    card->CmbDocLang.setListIndex(1);
    card->Click("PrintButt");
    EXPECT_TRUE(Has(PageLines(ReadAll(page)), "    <td align='left' class=TD5>Line</td>"));
    EXPECT_EQ(browser.opened.size(), 2u);
    EXPECT_TRUE(messages.shown().empty());

    // A page that cannot be written is a message, and nothing is opened.
    fs::remove(page);
    fs::create_directory(page);
    card->CmbDocLang.setListIndex(2);
    card->Click("PrintButt");
    EXPECT_EQ(browser.opened.size(), 2u);
    ASSERT_EQ(messages.shown().size(), 1u);
    EXPECT_EQ(U(messages.shown()[0].title), "תקלה");
    EXPECT_EQ(messages.shown()[0].icon, MsgIcon::Critical);
    EXPECT_EQ(messages.shown()[0].buttons, MsgButtons::Ok);
    EXPECT_NE(messages.shown()[0].text.str().find("dvprint.htm"), std::string::npos);
    fs::remove(page);
    EXPECT_EQ(std::distance(fs::directory_iterator(dir), fs::directory_iterator()), 0)
        << "no half-written page is left behind";
}

TEST_F(PagesTest, ThePageFolderMustBeTheUsersOwn) {
    fs::path dir = temp.path() / ("dovrel-" + std::to_string(getuid()));
    std::ofstream(dir) << "a file, not a folder";
    EXPECT_THROW(PrintFilePath(), Error);
    fs::remove(dir);
    fs::create_directory(dir);
    fs::permissions(dir, fs::perms::owner_all | fs::perms::group_read | fs::perms::others_read);
    EXPECT_EQ(PrintFilePath().native(), (dir / "dvprint.htm").string());
    EXPECT_EQ(fs::status(dir).permissions() & fs::perms::all, fs::perms::owner_all);
    fs::remove(dir);
    fs::create_directory(temp.path() / "elsewhere");
    fs::create_directory_symlink(temp.path() / "elsewhere", dir);
    EXPECT_THROW(PrintFilePath(), Error);
}

} // namespace
} // namespace dovrel
