#pragma once

#include "pictures/ItemPicsHost.h"
#include "platform/Controls.h"
#include "platform/Form.h"
#include "platform/Grid.h"

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace dovrel {

class ItemPicsHost;
class Messages;

// The picture settings form: the printed page's settings and the ranges of
// item keys and category codes with their pictures. The form lives in the
// module state and may outlive the control that made it: it keeps the state,
// and works through the services of the control that last attached it.
class ItemPicsForm : public Form {
public:
    explicit ItemPicsForm(ItemPicsHost& host);

    // The control whose settings store and message boxes the form uses from now on.
    void attach(ItemPicsHost& host) { host_ = &host; }
    // A control that goes away lets go of the form; until another control
    // attaches it, the form's work that needs one is refused.
    void detach(const ItemPicsHost& host) {
        if (host_ == &host)
            host_ = nullptr;
    }

    // Resets the grid, loads the six settings, mirrors them into the module
    // state and fills the grid from the picture database.
    void Load() override;
    // The form's buttons; labels and frames do nothing; an unknown name is an error.
    void Click(const std::string& name) override;

    void InitItemPicLines();
    // Adds the ranges of the database to the grid; the number of rows added.
    int16_t FillGridLines(const std::string& pDbName);
    // 1 saves the six settings, 2 loads them; anything else does nothing.
    void SetGetMoreParams(uint8_t Action);
    // True when the database file exists at the DBPath setting; otherwise says so.
    bool CheckDBFile();
    // Told the full name (code page 1255) of a database that CheckDBFile did
    // not find, before its message, so a host can say where it looked.
    Signal<std::string> databaseMissing;

    void CmdDelete_Click();
    void CmdNew_Click();
    void CmdUpdate_Click();
    void cmdSaveDef_Click();
    void CmdInitDB_Click();
    void cmdClose_Click();

    // The RangeID a grid row was loaded or saved with; 0 for the heading, a
    // row added since and a row beyond the grid.
    int32_t RowRangeID(int32_t row) const;

    TextBox txtLogoFile{"txtLogoFile"};
    TextBox txtCompTitle{"txtCompTitle"};
    TextBox txtDBPath{"txtDBPath"};
    TextBox txtPicPath{"txtPicPath"};
    TextBox txtPicX{"txtPicX"};
    TextBox txtPicY{"txtPicY"};
    Grid ItemPicLines{"ItemPicLines"};
    Button CmdInitDB{"CmdInitDB"};
    Button CmdDelete{"CmdDelete"};
    Button CmdNew{"CmdNew"};
    Button CmdUpdate{"CmdUpdate"};
    Button cmdSaveDef{"cmdSaveDef"};
    Button cmdClose{"cmdClose"};

private:
    void buildControls();
    void mirrorSettings();
    // The database file at the DBPath setting.
    std::string settingDbName() const;
    ItemPicsHost& host() const;
    Messages& messages() const;
    // Shows a database failure under the title "תקלה".
    void showFailure(const std::exception& failure) const;
    bool confirm(const char* questionUtf8) const;
    void reloadGrid();

    PageSettingRefs settings_;
    ItemPicsHost* host_;
    std::vector<std::unique_ptr<Control>> plain_; // labels and frames
    std::vector<int32_t> rangeIds_;               // by grid row, heading included
};

} // namespace dovrel
