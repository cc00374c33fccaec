#include "pictures/ItemPicsForm.h"

#include "pictures/ItemPicsDesign.h"
#include "pictures/PictureDb.h"
#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"
#include "platform/Messages.h"
#include "platform/SafeFile.h"
#include "platform/SettingsBinding.h"

#include <climits>
#include <map>
#include <utility>

namespace dovrel {

namespace {

struct Setting {
    const char* key;
    TextBox ItemPicsForm::*box;
    const char* defaultUtf8;
};

const Setting kSettings[] = {
    {"LogoFile", &ItemPicsForm::txtLogoFile, "c:\\logo.jpg"},
    {"CompTitle", &ItemPicsForm::txtCompTitle, "רחוב הגפן 9, חיפה. טלפון: 04-8123456"},
    {"DBPath", &ItemPicsForm::txtDBPath, "c:\\"},
    {"PicPath", &ItemPicsForm::txtPicPath, "c:\\"},
    {"PicX", &ItemPicsForm::txtPicX, "50"},
    {"PicY", &ItemPicsForm::txtPicY, "50"},
};

// The grid's format: each column's heading followed by the spaces that widen it.
std::string RangesFormat() {
    const std::pair<const char*, size_t> columns[] = {{"<ממפתח פריט", 10},
                                                      {"<עד מפתח פריט", 10},
                                                      {"<מקוד מיון", 1},
                                                      {"<עד קוד מיון", 1},
                                                      {"<קובץ תמונה", 40}};
    std::string format;
    for (const auto& [heading, spaces] : columns) {
        if (!format.empty())
            format += '|';
        format += FromUtf8(Utf8(heading)) + std::string(spaces, ' ');
    }
    return format;
}

std::optional<std::string> NullWhenEmpty(const std::string& text) {
    return text.empty() ? std::nullopt : std::optional<std::string>(text);
}

} // namespace

ItemPicsForm::ItemPicsForm(ItemPicsHost& host)
    : Form("frmItemPics"), settings_(host.pageSettings()), host_(&host) {
    buildControls();
}

// Every control of the design, in its order: the named members take their
// captions from it; labels and frames are made here.
void ItemPicsForm::buildControls() {
    std::map<std::string, Control*> members;
    for (Control* c : std::initializer_list<Control*>{
             &txtLogoFile, &txtCompTitle, &txtDBPath, &txtPicPath, &txtPicX, &txtPicY,
             &ItemPicLines, &CmdInitDB, &CmdDelete, &CmdNew, &CmdUpdate, &cmdSaveDef, &cmdClose})
        members[c->name()] = c;
    for (const ControlDesign& design : ItemPicsDesign()) {
        Control* control = nullptr;
        if (auto it = members.find(design.name); it != members.end()) {
            control = it->second;
        } else if (design.kind == ControlKind::Shape) {
            plain_.push_back(std::make_unique<Shape>(design.name, design.left, design.top,
                                                     design.width, design.height));
            control = plain_.back().get();
        } else {
            plain_.push_back(std::make_unique<Label>(design.name));
            control = plain_.back().get();
        }
        control->setCaption(design.caption);
        addControl(*control);
    }
}

ItemPicsHost& ItemPicsForm::host() const {
    if (host_ == nullptr)
        throw Error("The picture settings form has no control to work with");
    return *host_;
}

Messages& ItemPicsForm::messages() const {
    return host().formMessages();
}

void ItemPicsForm::showFailure(const std::exception& failure) const {
    ShowFailure(messages(), Utf8("תקלה"), failure);
}

bool ItemPicsForm::confirm(const char* questionUtf8) const {
    return messages().show(MsgIcon::Question, MsgButtons::YesNo, Utf8("שימו לב"),
                           Utf8(questionUtf8)) == MsgAnswer::Yes;
}

std::string ItemPicsForm::settingDbName() const {
    return JoinFolder(settings_.DBPath, PictureDb::kFileName);
}

void ItemPicsForm::Load() {
    InitItemPicLines();
    SetGetMoreParams(2);
    mirrorSettings();
    try {
        FillGridLines(settingDbName());
    } catch (const std::exception& e) {
        showFailure(e);
    }
}

void ItemPicsForm::mirrorSettings() {
    settings_.LogoFile = txtLogoFile.Text();
    settings_.CompTitle = txtCompTitle.Text();
    settings_.DBPath = txtDBPath.Text();
    settings_.PicPath = txtPicPath.Text();
    settings_.PicX = txtPicX.Text();
    settings_.PicY = txtPicY.Text();
}

void ItemPicsForm::InitItemPicLines() {
    ItemPicLines.setRows(1);
    ItemPicLines.setFixedRows(1);
    ItemPicLines.setFormatString(RangesFormat());
    rangeIds_.assign(1, 0);
}

int16_t ItemPicsForm::FillGridLines(const std::string& pDbName) {
    if (!FileExists(PathFromCp1255(pDbName)))
        return 0;
    std::vector<PictureRange> ranges = PictureDb(pDbName).rangesById();
    if (ranges.size() > static_cast<size_t>(INT16_MAX))
        throw Error("The picture database " + ToUtf8(pDbName).str() + " holds " +
                    std::to_string(ranges.size()) + " ranges, more than the list can show");
    int16_t count = 0;
    for (const PictureRange& range : ranges) {
        ++count;
        ItemPicLines.AddItem("", count);
        const std::optional<std::string>* cells[] = {&range.FromItemKey, &range.ToItemKey,
                                                     &range.FromCatCode, &range.ToCatCode,
                                                     &range.PicFile};
        for (int32_t col = 0; col < 5; ++col)
            ItemPicLines.setTextMatrix(count, col, cells[col]->value_or(""));
        rangeIds_.insert(rangeIds_.begin() + count, range.RangeID);
    }
    return count;
}

int32_t ItemPicsForm::RowRangeID(int32_t row) const {
    if (row < 1 || static_cast<size_t>(row) >= rangeIds_.size() || row >= ItemPicLines.Rows())
        return 0;
    return rangeIds_[static_cast<size_t>(row)];
}

void ItemPicsForm::SetGetMoreParams(uint8_t Action) {
    for (const Setting& setting : kSettings)
        BindSetting(host().settingsStore(), Action, host().settingsName(), "Params", setting.key,
                    this->*setting.box, 1, Variant(FromUtf8(Utf8(setting.defaultUtf8))));
}

bool ItemPicsForm::CheckDBFile() {
    if (FileExists(PathFromCp1255(settingDbName())))
        return true;
    databaseMissing(settingDbName());
    messages().show(MsgIcon::Critical, MsgButtons::Ok, Utf8("שגיאה"),
                    Utf8("קובץ ההגדרות אינו נמצא"));
    return false;
}

void ItemPicsForm::Click(const std::string& name) {
    static const std::map<std::string, void (ItemPicsForm::*)()> handlers = {
        {"CmdDelete", &ItemPicsForm::CmdDelete_Click},
        {"CmdNew", &ItemPicsForm::CmdNew_Click},
        {"CmdUpdate", &ItemPicsForm::CmdUpdate_Click},
        {"cmdSaveDef", &ItemPicsForm::cmdSaveDef_Click},
        {"CmdInitDB", &ItemPicsForm::CmdInitDB_Click},
        {"cmdClose", &ItemPicsForm::cmdClose_Click}};
    if (auto it = handlers.find(name); it != handlers.end())
        (this->*it->second)();
    else if (findControl(name) == nullptr)
        throw Error("The form frmItemPics has no control " + ToUtf8(name).str());
}

void ItemPicsForm::cmdSaveDef_Click() {
    SetGetMoreParams(1);
    mirrorSettings();
}

void ItemPicsForm::CmdNew_Click() {
    if (!CheckDBFile())
        return;
    // Appended rather than added to a literal: g++ 12 warns wrongly on
    // "literal" + std::string at -O2.
    std::string row = "\t";
    row += FromUtf8(Utf8("תתתתתתתתתתתת"));
    row += "\t\t999\tpic001.jpg";
    ItemPicLines.AddItem(std::move(row));
    rangeIds_.resize(static_cast<size_t>(ItemPicLines.Rows()), 0);
}

void ItemPicsForm::reloadGrid() {
    InitItemPicLines();
    try {
        FillGridLines(settingDbName());
    } catch (const std::exception& e) {
        showFailure(e);
    }
}

// Deletes the range the current row was loaded with, so the right range goes
// even when the stored numbers have gaps; a row not stored yet deletes nothing.
void ItemPicsForm::CmdDelete_Click() {
    if (!CheckDBFile())
        return;
    std::string dbName = JoinFolder(txtDBPath.Text(), PictureDb::kFileName);
    int32_t row = ItemPicLines.Row();
    if (!FileExists(PathFromCp1255(dbName)) || row < ItemPicLines.FixedRows() || row < 1)
        return;
    if (!confirm("האם למחוק?"))
        return;
    try {
        if (int32_t rangeId = RowRangeID(row); rangeId != 0)
            PictureDb(dbName).remove(rangeId);
    } catch (const std::exception& e) {
        showFailure(e);
        return;
    }
    reloadGrid();
}

// Writes the rows as ranges 1 to n and deletes every higher number, all in
// one transaction: a refused row leaves the database as it was.
void ItemPicsForm::CmdUpdate_Click() {
    if (!CheckDBFile())
        return;
    std::vector<PictureRange> ranges;
    for (int32_t row = 1; row < ItemPicLines.Rows(); ++row) {
        PictureRange range;
        range.FromItemKey = NullWhenEmpty(ItemPicLines.TextMatrix(row, 0));
        range.ToItemKey = ItemPicLines.TextMatrix(row, 1);
        range.FromCatCode = NullWhenEmpty(ItemPicLines.TextMatrix(row, 2));
        range.ToCatCode = ItemPicLines.TextMatrix(row, 3);
        range.PicFile = ItemPicLines.TextMatrix(row, 4);
        ranges.push_back(std::move(range));
    }
    try {
        PictureDb(JoinFolder(txtDBPath.Text(), PictureDb::kFileName)).replaceAll(ranges);
    } catch (const std::exception& e) {
        showFailure(e);
        return;
    }
    rangeIds_.resize(static_cast<size_t>(ItemPicLines.Rows()));
    for (size_t row = 0; row < rangeIds_.size(); ++row)
        rangeIds_[row] = static_cast<int32_t>(row);
}

// Re-creates the database at the typed directory. The grid keeps its rows, so
// a save can write them into the new database. A file there that is not a
// picture database is replaced only after a second question.
void ItemPicsForm::CmdInitDB_Click() {
    if (!confirm("האם אתה בטוח?"))
        return;
    settings_.DBPath = txtDBPath.Text();
    std::string dbName = settingDbName();
    bool replaceForeign = false;
    try {
        PictureDb::Inspection old = PictureDb(dbName).inspect();
        if (old.kind == PictureDb::FileKind::Foreign) {
            Utf8 question = Utf8("הקובץ ") + ToUtf8(dbName) +
                            Utf8(" אינו בסיס נתונים של תמונות (") + Utf8(old.reason) +
                            Utf8("). להחליף אותו בבסיס נתונים ריק?");
            if (messages().show(MsgIcon::Question, MsgButtons::YesNo, Utf8("שימו לב"), question) !=
                MsgAnswer::Yes)
                return;
            replaceForeign = true;
        }
    } catch (const std::exception& e) {
        showFailure(e);
        return;
    }
    if (!CreatePicDB(dbName, messages(), replaceForeign).empty())
        messages().show(MsgIcon::Information, MsgButtons::Ok, Utf8("הודעה"),
                        Utf8("בסיס הנתונים אותחל"));
}

void ItemPicsForm::cmdClose_Click() {
    Hide();
}

} // namespace dovrel
