#pragma once

#include "forms/Companies.h"
#include "platform/Connection.h"
#include "platform/Controls.h"
#include "platform/Encoding.h"
#include "platform/Form.h"
#include "platform/ListControls.h"

#include <exception>
#include <string>
#include <vector>

namespace dovrel {

class FormHost;

// The company chooser: finds the companies under a main directory and sets
// the control's company path to the one the user picks. The form is kept
// between showings; its buttons only hide it. Closing its window unloads it:
// the next showing starts afresh from the remembered drive and directory.
class OpenDirForm : public Form {
public:
    // A form whose drive list shows the mount points of this system.
    explicit OpenDirForm(FormHost& host);
    OpenDirForm(FormHost& host, std::vector<std::string> drives);

    // The control that shows the form now; its message box is the one used.
    // Reloads the form when its window was closed. The buttons work only
    // while the form is shown, and a hidden form shows no message: what it
    // would say is thrown to the caller instead.
    void prepare(FormHost& host);

    void Load() override;
    void Click(const std::string& name) override;
    void DblClick(const std::string& name) override;
    void QueryClose() override;

    void PathDrive_Change();
    void MainDir_Change();
    void cmdFindWizComp_Click();
    void OKButton_Click();
    void CancelButton_Click();
    // Scans root and shows the companies found by name; a failure is shown
    // in a message box and leaves the list empty.
    void FindWizPaths(const std::string& root);

    // The last scan's companies, in the list's order, blank names included.
    const std::vector<CompanyEntry>& companies() const { return companies_; }
    // The drive and main directory of the last confirmed choice.
    const std::string& LastDrive() const { return lastDrive_; }
    const std::string& LastMainDir() const { return lastMainDir_; }

    // Raised when the status line must be shown at once: the scan that
    // follows keeps the user-interface thread until it ends.
    Signal<> repaint;

    Label Label1{"Label1"};
    DriveListBox PathDrive;
    DirListBox MainDir{"MainDir"};
    Button cmdFindWizComp{"cmdFindWizComp"};
    ListBox cmbCompany{"cmbCompany"};
    Label Msg1{"Msg1"};
    Button CancelButton{"CancelButton"};
    Button OKButton{"OKButton"};

private:
    void showError(const char* titleUtf8, const Utf8& text);
    void showFailure(const std::exception& failure);
    void requireShown(const std::string& control) const;
    void reset();

    std::string& compDir_;
    FormHost* host_;
    std::vector<CompanyEntry> companies_;
    std::vector<size_t> listed_; // the company of each list entry
    std::string lastDrive_;
    std::string lastMainDir_;
    bool unloaded_ = false;
    Connection driveChanged_;
    Connection dirChanged_;
};

} // namespace dovrel
