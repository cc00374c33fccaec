#include "pictures/ItemPicsDesign.h"

#include "platform/Encoding.h"

#include <algorithm>

namespace dovrel {

namespace {

constexpr int32_t kTextHeight = 285;
constexpr int32_t kLabelHeight = 255;
constexpr int32_t kButtonHeight = 375;
constexpr int32_t kButtonWidth = 1500;

using Kind = ControlKind;

ControlDesign Field(const char* name, int32_t left, int32_t top, int32_t width) {
    return Design(name, Kind::TextBox, "", left, top, width, kTextHeight);
}

// A caption label just right of the field it names, as wide as its caption.
ControlDesign CaptionLabel(const char* name, const char* captionUtf8, const ControlDesign& field) {
    ControlDesign d = Design(name, Kind::Label, captionUtf8, field.left + field.width + 60,
                             field.top + 30, 0, kLabelHeight);
    d.width = static_cast<int32_t>(d.caption.size()) * 100 + 100;
    d.labelFor = field.name;
    return d;
}

ControlDesign Command(const char* name, const char* captionUtf8, int32_t left, int32_t top) {
    return Design(name, Kind::Button, captionUtf8, left, top, kButtonWidth, kButtonHeight);
}

void AddHeader(std::vector<ControlDesign>& s) {
    s.push_back(Design("Frame1", Kind::Shape, "", 120, 120, 8160, 840));
    s.push_back(Field("txtLogoFile", 240, 240, 6000));
    s.push_back(CaptionLabel("Label1", "קובץ לוגו:", s.back()));
    s.push_back(Field("txtCompTitle", 240, 600, 6000));
    s.push_back(CaptionLabel("Label2", "פרטי כותרת:", s.back()));
    s.push_back(
        Design("Label3", Kind::Label, "שיוך תמונות לפריטים:", 5880, 1080, 2400, kLabelHeight));
}

void AddPaths(std::vector<ControlDesign>& s) {
    s.push_back(Design("Frame2", Kind::Shape, "", 120, 1380, 8160, 1260));
    s.push_back(Field("txtDBPath", 1800, 1500, 4440));
    s.push_back(CaptionLabel("Label4", ":מחיצת הגדרות", s.back()));
    s.push_back(Command("CmdInitDB", "איתחול הגדרות", 240, 1455));
    s.push_back(Field("txtPicPath", 1800, 1860, 4440));
    s.push_back(CaptionLabel("Label5", ":מחיצת תמונות", s.back()));
    s.push_back(Field("txtPicX", 4560, 2220, 660));
    s.push_back(Design("Label6", Kind::Label, "X", 5280, 2250, 240, kLabelHeight));
    s.push_back(Field("txtPicY", 5580, 2220, 660));
    s.push_back(CaptionLabel("Label7", "גודל תמונה:", s.back()));
}

void AddRanges(std::vector<ControlDesign>& s) {
    s.push_back(
        Design("Label8", Kind::Label, ":תמונות לקבוצות פריטים ", 5280, 2760, 3000, kLabelHeight));
    s.push_back(Design("ItemPicLines", Kind::Grid, "", 120, 3060, 8160, 2640));
    const char* buttons[][2] = {{"CmdDelete", "מחק מהרשימה"},
                                {"CmdNew", "שורה חדשה"},
                                {"CmdUpdate", "שמור שינויים"},
                                {"cmdSaveDef", "שמור הגדרות"},
                                {"cmdClose", "סגור"}};
    int32_t left = 120;
    for (const auto& button : buttons) {
        s.push_back(Command(button[0], button[1], left, 5880));
        left += kButtonWidth + 165;
    }
}

std::vector<ControlDesign> MakeDesign() {
    std::vector<ControlDesign> s;
    AddHeader(s);
    AddPaths(s);
    AddRanges(s);
    return s;
}

} // namespace

const std::vector<ControlDesign>& ItemPicsDesign() {
    static const std::vector<ControlDesign> design = MakeDesign();
    return design;
}

const ControlDesign* FindItemPicsDesign(const std::string& name) {
    const std::vector<ControlDesign>& design = ItemPicsDesign();
    auto it = std::find_if(design.begin(), design.end(),
                           [&](const ControlDesign& d) { return d.name == name; });
    return it == design.end() ? nullptr : &*it;
}

} // namespace dovrel
