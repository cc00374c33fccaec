#pragma once

#include "control/ModuleState.h"
#include "fixfiles/DocumentView.h"
#include "forms/FormHost.h"
#include "pictures/ItemPicsHost.h"
#include "platform/Browser.h"
#include "platform/Clipboard.h"
#include "platform/Clock.h"
#include "platform/Connection.h"
#include "platform/Container.h"
#include "platform/Form.h"
#include "platform/Messages.h"
#include "platform/Variant.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace dovrel {

class PageFile;
class SettingsStore;
struct PageSettings;
struct PageView;

// The outside services a control uses; all must outlive it.
struct CardServices {
    Messages& messages;
    SettingsStore& settings;
    FormPresenter& forms;
    Clipboard& clipboard;
    Browser& browser;
    const Clock& clock;
};

// The viewer control. It shows one document of the accounting system at a
// time; the members keep the names of the control's interface. A host makes
// it, runs its start-up (UserControl_InitProperties), sets its properties and
// calls ShowDoc or SetParams; the user's clicks arrive through Click,
// DblClick and LostFocus.
class Card : public DocumentView, public FormHost, public ItemPicsHost {
public:
    // A control with its own headless services: settings kept in memory,
    // forms closed at once, a private clipboard, pages kept unopened, the
    // system's date; messages and the shared state must outlive it.
    Card(Messages& messages, ModuleState& shared);
    Card(const CardServices& services, ModuleState& shared);
    ~Card() override;

    ModuleState& shared() { return shared_; }
    const ModuleState& shared() const { return shared_; }
    const CardServices& services() const { return services_; }

    // What the side forms use of the control and of the shared state.
    Messages& formMessages() override { return services_.messages; }
    Clipboard& formClipboard() override { return services_.clipboard; }
    std::string& companyDirectory() override { return shared_.CompDir; }
    const AccountEntry& currentAccount() const override { return shared_.Accounts.CurrentAccount; }
    SettingsStore& settingsStore() override { return services_.settings; }
    const std::string& settingsName() const override { return shared_.AppName; }
    PageSettingRefs pageSettings() override;

    // Every child control, in the order of the surface table; nullptr for an
    // unknown name.
    Control* findControl(const std::string& name) const;
    const std::vector<Control*>& controls() const { return controls_; }

    // Start-up, run when the container initialises a new control. Every
    // failing step is skipped. The container may be null (not a web page).
    void UserControl_InitProperties(Container* container);

    // The members of the control's interface, in their order. The first four
    // are the data members PubACTLocation, PubPrevLocation, PubSearchBy and
    // PubSearchValue; InitDocLines comes from DocumentView.
    Variant SetAccountKey() const;
    void SetAccountKey(const Variant& value);
    Variant SetCompDir() const;
    void SetCompDir(const Variant& value);
    Variant ACTLocation() const;
    void ACTLocation(const Variant& value);
    void InitCmbDocType();
    int32_t ReadStock(std::string pCompPath, int16_t& pWizFile, std::string& pSearchBy,
                      Variant& pSearchValue, std::string& pStartFrom, std::string& pFromDate);
    void CreateHTML(std::string& pFileName, int16_t& pDocFormat);
    Variant CompanyTitle() const;
    void CompanyTitle(const Variant& value);
    int32_t ShowDoc(std::string pCompPath, int16_t& pWizFile, int32_t& pStartPosition);
    Variant DBPath() const;
    void DBPath(const Variant& value);
    int32_t SetParams(std::string pCompPath, int16_t& pWizFile, int32_t& pStartPosition,
                      std::string& pDBPath, std::string& pPicPath);
    Variant PicPath() const;
    void PicPath(const Variant& value);
    Variant ReadITM(std::string& CompPath);
    void FillPicPath(std::string& pDbName);
    void CreateHTMLEng(std::string& pFileName, bool& pUseFName);
    void SetGetRegParams(uint8_t& Action);
    std::string CreateAsIs(std::string& pText);
    Variant ReadACT(std::string& CompPath);
    void WriteCell(int16_t& MyNum, std::string& CellValue);
    std::string RulesValue();

    // What the print button writes: the company record and, when the page
    // needs them, the items are read, then the page the language list asks
    // for is written at path. False, and nothing written, when no language
    // is chosen.
    bool WritePage(const Path& path);

    // Moves one property of a control (kind 1 Text, 2 ListIndex, 3 Value) to
    // the settings store (Action 1) or from it (Action 2).
    void SetGetRegParam(uint8_t Action, const std::string& AppName, const std::string& Section,
                        const std::string& Key, Control& Ctl, uint8_t Kind, const Variant& Default);

    // The user's events on child controls. A control without a handler for
    // the event ignores it; an unknown name is an error.
    void Click(const std::string& name);
    void DblClick(const std::string& name);
    void LostFocus(const std::string& name);

    // The event handlers.
    void FirstButt_Click();
    void PrevButt_Click();
    void NextButt_Click();
    void LastButt_Click();
    void Label1_DblClick();
    void LblReference1_DblClick();
    void Label2_DblClick();
    void lblDetails_Click();
    void lblItemKey_DblClick();
    void cmbDocType_LostFocus();
    void CmbDocLang_LostFocus();
    void txtCompPath_Change();
    void CmdDir_Click();
    void CmdParams_Click();
    void cmdAccount_Click();
    void cmdSaveDef_Click();
    void PrintButt_Click();

    // The controls with state beyond those the document reader fills.
    ComboBox cmbDocType{"cmbDocType"};
    TextBox txtCompPath{"txtCompPath", "e:\\cong98"};
    TextBox txtTitle{"txtTitle"};
    ComboBox CmbDocLang{"CmbDocLang"};
    ComboBox cmbRules{"cmbRules"};
    CheckBox ChkWithDrawing{"ChkWithDrawing"};
    CheckBox ChkShowTotalFC{"ChkShowTotalFC"};
    CheckBox chkLineDisc{"chkLineDisc"};
    CheckBox ChkUseFName{"ChkUseFName"};
    CheckBox ChkShowDetails{"ChkShowDetails"};

private:
    struct OwnServices;
    class OpenPage;

    void buildControls();
    Control* ownControl(const std::string& name);
    // Reads with the direction word under the current search.
    void readWith(const char* direction);
    void search(const char* by, const std::string& value);
    void clearSearch();
    void resetPosition();
    void readingOrderSetting(uint8_t Action);
    void prepareShow(const std::string& pCompPath, int16_t pWizFile, int32_t pStartPosition);
    Form& form(const std::string& name);
    PageSettings preparePage();
    PageView pageView(std::string title);
    // What a header box gives the pages (see pageView).
    std::string pageText(TextBox DocumentView::*box) const;

    std::unique_ptr<OwnServices> own_;
    CardServices services_;
    ModuleState& shared_;
    std::vector<std::unique_ptr<Control>> plain_; // labels, buttons, frames
    std::vector<Control*> controls_;
    PageFile* openPage_ = nullptr; // the page being built, for WriteCell
    Grid pageLines_{"DocLines"};   // the lines for the pages while the screen reads in order
    Connection compPathChanged_;
};

} // namespace dovrel
