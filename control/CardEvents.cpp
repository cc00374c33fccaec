// The handlers of the control's buttons, search labels, lists and the company
// path box.
#include "control/Card.h"

#include "fixfiles/AccountsFile.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <utility>

namespace dovrel {

namespace {

using Handler = void (Card::*)();
using HandlerTable = std::initializer_list<std::pair<const char*, Handler>>;

// Runs the handler the table gives the named control for one kind of event;
// a control without one ignores the event, an unknown name is an error.
void Raise(Card& card, const std::string& name, HandlerTable table) {
    if (card.findControl(name) == nullptr)
        throw Error("Unknown control: " + name);
    for (const auto& [control, handler] : table)
        if (name == control)
            return (card.*handler)();
}

} // namespace

void Card::Click(const std::string& name) {
    Raise(*this, name,
          {{"FirstButt", &Card::FirstButt_Click},
           {"PrevButt", &Card::PrevButt_Click},
           {"NextButt", &Card::NextButt_Click},
           {"LastButt", &Card::LastButt_Click},
           {"lblDetails", &Card::lblDetails_Click},
           {"CmdDir", &Card::CmdDir_Click},
           {"CmdParams", &Card::CmdParams_Click},
           {"cmdAccount", &Card::cmdAccount_Click},
           {"cmdSaveDef", &Card::cmdSaveDef_Click},
           {"PrintButt", &Card::PrintButt_Click}});
}

void Card::DblClick(const std::string& name) {
    Raise(*this, name,
          {{"Label1", &Card::Label1_DblClick},
           {"LblReference1", &Card::LblReference1_DblClick},
           {"Label2", &Card::Label2_DblClick},
           {"lblItemKey", &Card::lblItemKey_DblClick}});
}

void Card::LostFocus(const std::string& name) {
    Raise(
        *this, name,
        {{"cmbDocType", &Card::cmbDocType_LostFocus}, {"CmbDocLang", &Card::CmbDocLang_LostFocus}});
}

void Card::readWith(const char* direction) {
    auto row = static_cast<int16_t>(cmbDocType.ListIndex());
    std::string startFrom = direction;
    std::string fromDate = txtFromDate.Text();
    ReadStock(shared_.CompDir, row, PubSearchBy, PubSearchValue, startFrom, fromDate);
}

void Card::search(const char* by, const std::string& value) {
    PubSearchBy = by;
    PubSearchValue = Variant(value);
    readWith("First");
}

void Card::clearSearch() {
    PubSearchBy.clear();
    PubSearchValue = Variant(std::string());
}

void Card::resetPosition() {
    PubACTLocation = 2;
    PubPrevLocation = 0;
}

void Card::FirstButt_Click() {
    clearSearch();
    readWith("First");
}

void Card::PrevButt_Click() {
    readWith("Previous");
}

void Card::NextButt_Click() {
    readWith("Next");
}

void Card::LastButt_Click() {
    readWith("Last");
}

void Card::Label1_DblClick() {
    search("AccountKey", txtAccountKey.Text());
}

void Card::LblReference1_DblClick() {
    search("Reference1", std::string(Trim(txtReference1.Text())));
}

void Card::Label2_DblClick() {
    search("CustomerName", txtCustomerName.Text());
}

void Card::lblDetails_Click() {
    search("Details", txtDetails.Text());
}

void Card::lblItemKey_DblClick() {
    search("ItemKey", txtItemKey.Text());
}

void Card::cmbDocType_LostFocus() {
    shared_.CompDir = txtCompPath.Text();
    clearSearch();
    resetPosition();
    CmbDocLang_LostFocus();
}

void Card::CmbDocLang_LostFocus() {
    IgnoringErrors([&] {
        switch (CmbDocLang.ListIndex()) {
        case 1: {
            int32_t row = cmbDocType.ListIndex();
            if (row >= 0 && row < kDocTypeRows)
                txtTitle.setText(shared_.DocTypes[static_cast<size_t>(row)].englishTitle);
            break;
        }
        case 0:
        case 2:
            txtTitle.setText(cmbDocType.Text());
            break;
        default:
            break;
        }
    });
}

void Card::txtCompPath_Change() {
    shared_.CompDir = txtCompPath.Text();
    resetPosition();
    clearSearch();
}

void Card::cmdSaveDef_Click() {
    uint8_t save = 1;
    SetGetRegParams(save);
    shared_.CompDir = txtCompPath.Text();
}

} // namespace dovrel
