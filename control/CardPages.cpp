#include "control/Card.h"

#include "fixfiles/CompanyFile.h"
#include "pages/DocumentPage.h"
#include "pages/Html.h"
#include "pages/PageFile.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/SafeFile.h"

namespace dovrel {

namespace {

// The number under which WriteCell finds the page being built.
constexpr int16_t kPageFileNumber = 1;

} // namespace

// While a page is built, WriteCell writes to it under its file number.
class Card::OpenPage {
public:
    OpenPage(Card& card, PageFile& page) : card_(card) { card_.openPage_ = &page; }
    ~OpenPage() { card_.openPage_ = nullptr; }
    OpenPage(const OpenPage&) = delete;
    OpenPage& operator=(const OpenPage&) = delete;

private:
    Card& card_;
};

// The settings form holds the page settings; the picture database and
// picture folders are taken from its boxes as they are now, and the lines'
// pictures looked up before the page is written.
PageSettings Card::preparePage() {
    auto& pics = dynamic_cast<ItemPicsForm&>(form("frmItemPics"));
    shared_.DBPath = pics.txtDBPath.Text();
    std::string database = JoinFolder(shared_.DBPath, "Dovrel.def");
    FillPicPath(database);
    shared_.PicPath = pics.txtPicPath.Text();
    return {shared_.LogoFile, shared_.CompTitle, shared_.PicPath, shared_.PicX, shared_.PicY};
}

// The pages are made from the texts as the control converts them: while the
// screen shows reading order, a box that still shows the document's text and
// the grid give the document's LogicalText instead.
PageView Card::pageView(std::string title) {
    bool reading = ReadingOrder() != 0 && document();
    if (reading)
        FillLines(pageLines_, &*document());
    PageView view(reading ? pageLines_ : DocLines);
    view.title = std::move(title);
    view.reference = pageText(&DocumentView::txtReference1);
    view.date = txtDate.Text();
    view.customer = pageText(&DocumentView::txtCustomerName);
    view.address1 = pageText(&DocumentView::txtAddress1);
    view.address2 = pageText(&DocumentView::txtAddress2);
    view.totalVat = txtTotalVat.Text();
    view.vatValue = txtVatValue.Text();
    view.total1 = txtTotal1.Text();
    view.rules = RulesValue();
    view.drawings = ChkWithDrawing.Value() == 1;
    view.lineDiscount = chkLineDisc.Value() == 1;
    view.details = ChkShowDetails.Value() == 1;
    view.showTotalFC = ChkShowTotalFC.Value() == 1;
    return view;
}

std::string Card::pageText(TextBox DocumentView::*box) const {
    const std::string& shown = (this->*box).Text();
    if (ReadingOrder() == 0 || !document())
        return shown;
    std::vector<BoxText> reading = HeaderTexts(&*document(), true);
    std::vector<BoxText> logical = HeaderTexts(&*document(), false);
    for (size_t i = 0; i < reading.size(); ++i)
        if (reading[i].first == box && reading[i].second == shown)
            return logical[i].second;
    return shown;
}

void Card::CreateHTML(std::string& pFileName, int16_t& pDocFormat) {
    PageSettings settings = preparePage();
    PageView view = pageView(txtTitle.Text().empty() ? cmbDocType.Text() : txtTitle.Text());
    PageContext context(view, shared_.Doc, settings, services_.clock.Today(), pDocFormat);
    PageFile page(shared_.Paths.native(pFileName));
    OpenPage open(*this, page);
    WriteHebrewPage(page, context);
    page.commit();
}

void Card::CreateHTMLEng(std::string& pFileName, bool& pUseFName) {
    PageSettings settings = preparePage();
    std::string title = txtTitle.Text();
    if (title.empty()) {
        int32_t row = cmbDocType.ListIndex();
        if (row < 0 || row >= kDocTypeRows)
            throw Error("There is no document type chosen to take the English title from");
        title = shared_.DocTypes[static_cast<size_t>(row)].englishTitle;
    }
    PageView view = pageView(std::move(title));
    PageContext context(view, shared_.Doc, settings, services_.clock.Today());
    PageFile page(shared_.Paths.native(pFileName));
    WriteEnglishPage(page, context, pUseFName, shared_.Company);
    page.commit();
}

std::string Card::CreateAsIs(std::string& pText) {
    return AsIsTable(pText);
}

void Card::WriteCell(int16_t& MyNum, std::string& CellValue) {
    if (MyNum != kPageFileNumber || openPage_ == nullptr)
        throw Error("Bad file name or number");
    if (CellValue.empty())
        CellValue = "&nbsp;";
    openPage_->line(RightCell(CellValue));
}

std::string Card::RulesValue() {
    return RulesFor(cmbRules.ListIndex());
}

bool Card::WritePage(const Path& path) {
    std::string compDir = shared_.CompDir;
    ReadAdf(shared_.Paths.native(compDir), shared_.Company);
    if (ChkWithDrawing.Value() == 1 || ChkUseFName.Value() == 1)
        ReadITM(compDir);
    std::string file = shared_.Paths.text(path);
    int16_t format = kPricedPage;
    bool useForeignNames = ChkUseFName.Value() == 1;
    switch (CmbDocLang.ListIndex()) {
    case 0:
        CreateHTML(file, format);
        return true;
    case 1:
        CreateHTMLEng(file, useForeignNames);
        return true;
    case 2:
        format = kPageWithoutAmounts;
        CreateHTML(file, format);
        return true;
    default:
        return false;
    }
}

// Writes the page into this user's print file and opens it in the browser.
// With no language chosen nothing is written and nothing opened. A failure
// is shown as a message and opens nothing.
// With no document shown (none read yet, or the last walk found nothing) the
// boxes hold only what an earlier document left; no page is made of that.
void Card::PrintButt_Click() {
    if (!document()) {
        services_.messages.show(MsgIcon::Information, MsgButtons::Ok, Utf8("הודעה"),
                                Utf8("אין מסמך להדפסה"));
        return;
    }
    try {
        Path path = PrintFilePath();
        if (WritePage(path))
            services_.browser.Open(path);
    } catch (const std::exception& e) {
        ShowFailure(services_.messages, Utf8("תקלה"), e);
    }
}

} // namespace dovrel
