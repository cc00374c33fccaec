#include "forms/OpenDirForm.h"

#include "forms/FormDesigns.h"
#include "forms/FormHost.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/Messages.h"

namespace dovrel {

namespace {

constexpr const char* kScanHint = "לחץ על חפש חברות חשבשבת לאיתור החברות";
constexpr const char* kScanning = "סורק ומאתר חברות. נא להמתין..";
constexpr const char* kScanDone = "הסריקה הסתיימה. תקתוק כפול לבחירה...";

} // namespace

OpenDirForm::OpenDirForm(FormHost& host) : OpenDirForm(host, SystemMountPoints()) {}

OpenDirForm::OpenDirForm(FormHost& host, std::vector<std::string> drives)
    : Form("frmOpenDir"), PathDrive("PathDrive", std::move(drives)),
      compDir_(host.companyDirectory()), host_(&host) {
    for (Control* control :
         std::initializer_list<Control*>{&Label1, &PathDrive, &MainDir, &cmdFindWizComp,
                                         &cmbCompany, &Msg1, &CancelButton, &OKButton}) {
        addControl(*control);
        for (const ControlDesign& design : OpenDirDesign())
            if (design.name == control->name())
                control->setCaption(design.caption);
    }
    if (PathDrive.ListCount() > 0)
        IgnoringErrors([&] { MainDir.setPath(PathDrive.Drive()); });
    driveChanged_ = PathDrive.changed.connect([this] { PathDrive_Change(); });
    dirChanged_ = MainDir.changed.connect([this] { MainDir_Change(); });
}

void OpenDirForm::prepare(FormHost& host) {
    host_ = &host;
    if (!unloaded_)
        return;
    reset();
    Load();
    unloaded_ = false;
}

// Back to the state of a form just made: the first drive and its root, an
// empty list and status line.
void OpenDirForm::reset() {
    cmbCompany.Clear();
    cmbCompany.setEnabled(true);
    listed_.clear();
    if (PathDrive.ListCount() > 0) {
        IgnoringErrors([&] { PathDrive.setListIndex(0); });
        IgnoringErrors([&] { MainDir.setPath(PathDrive.Drive()); });
    }
    cmbCompany.Clear();
    Msg1.setCaption({});
}

void OpenDirForm::Load() {
    IgnoringErrors([&] { PathDrive.setDrive(lastDrive_.empty() ? "c:" : lastDrive_); });
    if (!lastMainDir_.empty())
        IgnoringErrors([&] { MainDir.setPath(lastMainDir_); });
}

void OpenDirForm::requireShown(const std::string& control) const {
    if (!Visible())
        throw Error("The company chooser is not shown; " + control + " cannot be used");
}

void OpenDirForm::Click(const std::string& name) {
    if (name == "cmdFindWizComp")
        cmdFindWizComp_Click();
    else if (name == "OKButton")
        OKButton_Click();
    else if (name == "CancelButton")
        CancelButton_Click();
}

void OpenDirForm::DblClick(const std::string& name) {
    if (name == "cmbCompany")
        OKButton_Click();
}

void OpenDirForm::QueryClose() {
    Hide();
    unloaded_ = true;
}

// A drive that cannot be opened is reported; the tree stays where it was.
void OpenDirForm::PathDrive_Change() {
    std::string drive = PathDrive.Drive();
    if (!drive.empty()) {
        try {
            MainDir.setPath(drive);
        } catch (const std::exception& e) {
            showFailure(e);
        }
    }
    cmbCompany.Clear();
    listed_.clear();
}

void OpenDirForm::MainDir_Change() {
    cmbCompany.Clear();
    listed_.clear();
    Msg1.setCaption(FromUtf8(Utf8(kScanHint)));
}

void OpenDirForm::cmdFindWizComp_Click() {
    requireShown("cmdFindWizComp");
    Msg1.setCaption(FromUtf8(Utf8(kScanning)));
    repaint();
    if (!MainDir.Path().empty()) {
        cmbCompany.setEnabled(false);
        FindWizPaths(MainDir.Path());
        cmbCompany.setEnabled(true);
    }
    Msg1.setCaption(FromUtf8(Utf8(kScanDone)));
}

void OpenDirForm::FindWizPaths(const std::string& root) {
    companies_.clear();
    cmbCompany.Clear();
    listed_.clear();
    try {
        companies_ = FindCompanies(root);
    } catch (const std::exception& e) {
        showFailure(e);
        return;
    }
    for (size_t i = 0; i < companies_.size(); ++i) {
        std::string name = ListedName(companies_[i]);
        if (name.empty())
            continue;
        cmbCompany.AddItem(name);
        listed_.push_back(i);
    }
}

void OpenDirForm::OKButton_Click() {
    requireShown("OKButton");
    int32_t index = cmbCompany.ListIndex();
    if (index < 0 || static_cast<size_t>(index) >= listed_.size()) {
        showError("שגיאה", Utf8("לא בחרת חברה"));
        return;
    }
    compDir_ = companies_[listed_[static_cast<size_t>(index)]].path;
    lastDrive_ = PathDrive.Drive();
    lastMainDir_ = MainDir.Path();
    Hide();
}

void OpenDirForm::CancelButton_Click() {
    requireShown("CancelButton");
    Hide();
}

void OpenDirForm::showError(const char* titleUtf8, const Utf8& text) {
    if (!Visible())
        throw Error(text.str());
    host_->formMessages().show(MsgIcon::Critical, MsgButtons::Ok, Utf8(titleUtf8), text);
}

void OpenDirForm::showFailure(const std::exception& failure) {
    showError("תקלה", ErrorText(failure));
}

} // namespace dovrel
