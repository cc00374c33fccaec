#include "control/Card.h"

#include "control/CardForms.h"
#include "control/Surface.h"
#include "fixfiles/AccountsFile.h"
#include "fixfiles/CompanyFile.h"
#include "fixfiles/ItemsFile.h"
#include "fixfiles/ReadStock.h"
#include "fixfiles/TextDecoding.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Error.h"
#include "platform/SettingsStore.h"

#include <limits>

namespace dovrel {

struct Card::OwnServices {
    MemorySettingsStore settings;
    ClosingFormPresenter forms;
    MemoryClipboard clipboard;
    RecordingBrowser browser;
    SystemClock clock;
};

Card::Card(Messages& messages, ModuleState& shared)
    : own_(std::make_unique<OwnServices>()), services_{messages,      own_->settings,
                                                       own_->forms,   own_->clipboard,
                                                       own_->browser, own_->clock},
      shared_(shared) {
    buildControls();
}

Card::Card(const CardServices& services, ModuleState& shared)
    : services_(services), shared_(shared) {
    buildControls();
}

Card::~Card() {
    auto pictures = shared_.Forms.find("frmItemPics");
    if (pictures != shared_.Forms.end())
        if (auto* form = dynamic_cast<ItemPicsForm*>(pictures->second.get()))
            form->detach(*this);
}

void Card::buildControls() {
    if (shared_.DocTypes[0].code == 0)
        InitDocTypes(shared_.DocTypes, shared_.DocFiles);
    for (const ControlDesign& design : CardSurface()) {
        Control* control = ownControl(design.name);
        if (control == nullptr) {
            if (design.kind == ControlKind::Button)
                plain_.push_back(std::make_unique<Button>(design.name));
            else if (design.kind == ControlKind::Shape)
                plain_.push_back(std::make_unique<Shape>(design.name, design.left, design.top,
                                                         design.width, design.height));
            else
                plain_.push_back(std::make_unique<Label>(design.name));
            control = plain_.back().get();
        }
        control->setCaption(design.caption);
        if (auto* list = dynamic_cast<ComboBox*>(control))
            for (const std::string& entry : design.entries)
                list->AddItem(entry);
        controls_.push_back(control);
    }
    compPathChanged_ = txtCompPath.changed.connect([this] { txtCompPath_Change(); });
    InitDocLines();
}

// The controls that are members of the class, by name.
Control* Card::ownControl(const std::string& name) {
    Control* own[] = {
        &cmbDocType,      &txtCompPath, &txtReference1,  &txtDate,    &txtAccountKey,
        &txtCustomerName, &txtAddress1, &txtAddress2,    &txtDetails, &txtItemKey,
        &DocLines,        &txtTotalVat, &txtVatValue,    &txtTotal1,  &ProgressFrame,
        &ProgressFill,    &txtTitle,    &ChkWithDrawing, &CmbDocLang, &ChkShowTotalFC,
        &chkLineDisc,     &ChkUseFName, &txtFromDate,    &cmbRules,   &ChkShowDetails};
    for (Control* control : own)
        if (control->name() == name)
            return control;
    return nullptr;
}

Control* Card::findControl(const std::string& name) const {
    for (Control* control : controls_)
        if (control->name() == name)
            return control;
    return nullptr;
}

void Card::UserControl_InitProperties(Container* container) {
    IgnoringErrors([&] { shared_.AppName = "Dovrel"; });
    IgnoringErrors([&] {
        std::optional<std::string> id =
            container ? container->ElementValue("SettingID") : std::nullopt;
        std::string value = id ? std::string(Trim(*id)) : std::string();
        if (!value.empty() && Variant(value).isNumeric())
            shared_.AppName += value;
    });
    IgnoringErrors([&] {
        std::optional<std::string> key =
            container ? container->ElementValue("AccountKey") : std::nullopt;
        std::string value = key ? std::string(Trim(*key)) : std::string();
        if (!value.empty())
            txtAccountKey.setText(value);
    });
    IgnoringErrors([&] {
        shared_.CompDir = txtCompPath.Text();
        clearSearch();
        PubACTLocation = 2;
    });
    IgnoringErrors([&] { InitDocTypes(shared_.DocTypes, shared_.DocFiles); });
    IgnoringErrors([&] {
        InitCmbDocType();
        InitDocLines();
    });
    IgnoringErrors([&] {
        CmbDocLang.setListIndex(0);
        txtTitle.setText(cmbDocType.Text());
    });
    IgnoringErrors([&] {
        uint8_t load = 2;
        SetGetRegParams(load);
    });
    IgnoringErrors([&] { dynamic_cast<ItemPicsForm&>(form("frmItemPics")).attach(*this); });
}

Variant Card::SetAccountKey() const {
    return Variant(txtAccountKey.Text());
}

void Card::SetAccountKey(const Variant& value) {
    txtAccountKey.setText(value.toText());
}

Variant Card::SetCompDir() const {
    return Variant(shared_.CompDir);
}

void Card::SetCompDir(const Variant& value) {
    std::string path = value.isNull() ? std::string() : value.toText();
    shared_.CompDir = path;
    txtCompPath.setText(path);
}

Variant Card::ACTLocation() const {
    return Variant(static_cast<double>(PubACTLocation));
}

void Card::ACTLocation(const Variant& value) {
    PubACTLocation = value.toInt32();
}

void Card::InitCmbDocType() {
    for (int row = 0; row < kFilledDocTypes; ++row)
        cmbDocType.AddItem(shared_.DocTypes[static_cast<size_t>(row)].hebrewTitle);
    cmbDocType.setListIndex(0);
}

int32_t Card::ReadStock(std::string pCompPath, int16_t& pWizFile, std::string& pSearchBy,
                        Variant& pSearchValue, std::string& pStartFrom, std::string& pFromDate) {
    // The company's own currency names are shown from the first document on,
    // not only after a print; a missing or short adf.fix leaves them as they were.
    Path compPath = shared_.Paths.native(pCompPath);
    LoadCompany(compPath, shared_.Company);
    StockContext context{shared_.DocTypes, shared_.DocFiles, shared_.Company, shared_.Doc,
                         services_.messages};
    return dovrel::ReadStock(*this, context, compPath, pWizFile, pSearchBy, pSearchValue,
                             pStartFrom, pFromDate);
}

Variant Card::CompanyTitle() const {
    return Variant(shared_.Company.title());
}

void Card::CompanyTitle(const Variant& value) {
    shared_.Company.setTitle(value.toText());
}

// The first steps of ShowDoc and SetParams: the document type, the company
// path (its change handling runs when it differs), no search, and the
// position just before the record to start at.
void Card::prepareShow(const std::string& pCompPath, int16_t pWizFile, int32_t pStartPosition) {
    cmbDocType.setListIndex(DocTypeIndex(shared_.DocTypes, pWizFile));
    shared_.CompDir = pCompPath;
    txtCompPath.setText(pCompPath);
    clearSearch();
    if (pStartPosition == std::numeric_limits<int32_t>::min())
        throw Error("Overflow");
    PubACTLocation = pStartPosition - 1;
}

int32_t Card::ShowDoc(std::string pCompPath, int16_t& pWizFile, int32_t& pStartPosition) {
    prepareShow(pCompPath, pWizFile, pStartPosition);
    readWith("Next");
    return 0;
}

int32_t Card::SetParams(std::string pCompPath, int16_t& pWizFile, int32_t& pStartPosition,
                        std::string& pDBPath, std::string& pPicPath) {
    prepareShow(pCompPath, pWizFile, pStartPosition);
    shared_.DBPath = pDBPath;
    shared_.PicPath = pPicPath;
    readWith("Next");
    return 0;
}

Variant Card::DBPath() const {
    return Variant(shared_.DBPath);
}

void Card::DBPath(const Variant& value) {
    shared_.DBPath = value.toText();
}

Variant Card::PicPath() const {
    return Variant(shared_.PicPath);
}

void Card::PicPath(const Variant& value) {
    shared_.PicPath = value.toText();
}

Variant Card::ReadITM(std::string& CompPath) {
    Variant read =
        dovrel::ReadITM(shared_.Paths.native(CompPath), shared_.Doc, {ProgressFrame, ProgressFill});
    takeCategoryCodes(shared_.Doc);
    return read;
}

Variant Card::ReadACT(std::string& CompPath) {
    return dovrel::ReadACT(shared_.Paths.native(CompPath), shared_.Accounts,
                           {ProgressFrame, ProgressFill});
}

Form& Card::form(const std::string& name) {
    std::unique_ptr<Form>& slot = shared_.Forms[name];
    if (!slot) {
        std::unique_ptr<Form> made = MakeCardForm(name, *this);
        made->Load();
        slot = std::move(made);
    }
    return *slot;
}

} // namespace dovrel
