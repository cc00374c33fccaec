#include "control/Surface.h"

#include "platform/Encoding.h"

#include <algorithm>

namespace dovrel {

namespace {

constexpr int32_t kTextHeight = 285;
constexpr int32_t kListHeight = 315;
constexpr int32_t kCheckHeight = 255;
constexpr int32_t kLabelHeight = 255;
constexpr uint32_t kSearchLabelColor = 0x000080;

using Kind = ControlKind;

ControlDesign Field(const char* name, Kind kind, int32_t left, int32_t top, int32_t width,
                    bool grey = false) {
    ControlDesign d = Design(name, kind, "", left, top, width,
                             kind == Kind::ComboBox ? kListHeight : kTextHeight);
    d.grey = grey;
    return d;
}

// A caption label stands to the right of the field it names (the layout runs
// right to left), its width taken from the caption's length.
ControlDesign CaptionLabel(const char* name, const char* captionUtf8, const ControlDesign& field,
                           bool searches = false) {
    ControlDesign d = Design(name, Kind::Label, captionUtf8, field.left + field.width + 60,
                             field.top + 30, 0, kLabelHeight);
    d.width = static_cast<int32_t>(d.caption.size()) * 100 + 100;
    d.labelFor = field.name;
    d.bold = searches;
    d.foreColor = searches ? kSearchLabelColor : 0;
    return d;
}

ControlDesign Command(const char* name, const char* captionUtf8, const char* tipUtf8,
                      const char* picture, int32_t left, int32_t top, int32_t width,
                      int32_t height) {
    ControlDesign d = Design(name, Kind::Button, captionUtf8, left, top, width, height);
    d.toolTip = FromUtf8(Utf8(tipUtf8));
    d.picture = picture;
    return d;
}

ControlDesign Check(const char* name, const char* captionUtf8, int32_t left, int32_t top,
                    int32_t width) {
    return Design(name, Kind::CheckBox, captionUtf8, left, top, width, kCheckHeight);
}

std::vector<std::string> Entries(std::initializer_list<const char*> utf8) {
    std::vector<std::string> entries;
    for (const char* entry : utf8)
        entries.push_back(FromUtf8(Utf8(entry)));
    return entries;
}

void AddHeader(std::vector<ControlDesign>& s) {
    ControlDesign docType = Field("cmbDocType", Kind::ComboBox, 6600, 240, 2535);
    ControlDesign compPath = Field("txtCompPath", Kind::TextBox, 2040, 240, 2775);
    compPath.text = "e:\\cong98";
    s.push_back(docType);
    s.push_back(CaptionLabel("Label8", ":סוג מסמך", docType));
    s.push_back(compPath);
    s.push_back(CaptionLabel("Label4", ":מחיצת חשבשבת", compPath));
    s.push_back(Command("CmdDir", "", "בחירת חברה", "folder", 1560, 120, 480, 480));
    s.push_back(Command("cmdSaveDef", "שמור הגדרות", "", "", 240, 120, 1275, 375));
    s.push_back(Command("cmdAccount", "פרטי כרטיס", "", "", 240, 720, 1635, 375));

    ControlDesign reference = Field("txtReference1", Kind::TextBox, 6600, 780, 2535);
    ControlDesign date = Field("txtDate", Kind::TextBox, 2880, 780, 1335, true);
    ControlDesign account = Field("txtAccountKey", Kind::TextBox, 6600, 1140, 2535);
    ControlDesign customer = Field("txtCustomerName", Kind::TextBox, 240, 1140, 3975);
    ControlDesign address1 = Field("txtAddress1", Kind::TextBox, 5880, 1560, 3255, true);
    ControlDesign address2 = Field("txtAddress2", Kind::TextBox, 5880, 1920, 3255, true);
    ControlDesign details = Field("txtDetails", Kind::TextBox, 1980, 1560, 2235);
    ControlDesign itemKey = Field("txtItemKey", Kind::TextBox, 1980, 1920, 2235);
    for (const ControlDesign& d :
         {reference, date, account, customer, address1, address2, details, itemKey})
        s.push_back(d);
    s.push_back(CaptionLabel("LblReference1", ":אסמכתא", reference, true));
    s.push_back(CaptionLabel("Label15", ":תאריך", date));
    s.push_back(CaptionLabel("Label1", ":כרטיס", account, true));
    s.push_back(CaptionLabel("Label2", ":שם", customer, true));
    s.push_back(CaptionLabel("Label7", ":כתובת", address1));
    s.push_back(CaptionLabel("lblDetails", ":חיפוש בפרטים", details, true));
    s.push_back(CaptionLabel("lblItemKey", ":חיפוש מק\"ט", itemKey, true));
    s.push_back(Command("PrintButt", "הדפסה", "הצגה להדפסה", "print", 240, 1500, 795, 735));
    s.push_back(Command("CmdParams", "הגדרות", "הגדרות", "settings", 1080, 1500, 795, 735));
}

void AddLinesAndTotals(std::vector<ControlDesign>& s) {
    s.push_back(Design("DocLines", Kind::Grid, "", 120, 2520, 10215, 2115));
    ControlDesign totalVat = Field("txtTotalVat", Kind::TextBox, 240, 4800, 1815, true);
    ControlDesign vat = Field("txtVatValue", Kind::TextBox, 240, 5040, 1815, true);
    ControlDesign total = Field("txtTotal1", Kind::TextBox, 240, 5280, 1815, true);
    s.push_back(totalVat);
    s.push_back(CaptionLabel("Label3", ":סה\"כ", totalVat));
    s.push_back(vat);
    s.push_back(CaptionLabel("Label9", ":מע\"מ", vat));
    s.push_back(total);
    s.push_back(CaptionLabel("Label10", ":סה\"כ כולל מע\"מ", total));
    s.push_back(Design("ProgressFrame", Kind::Shape, "", 3720, 4680, 3015, 495));
    s.push_back(Design("ProgressFill", Kind::Shape, "", 3720, 4680, 0, 495));
    s.push_back(Command("FirstButt", "הראשון", "המסמך הראשון", "first", 9420, 4740, 855, 615));
    s.push_back(Command("PrevButt", "הקודם", "המסמך הקודם", "previous", 8520, 4800, 735, 495));
    s.push_back(Command("NextButt", "הבא", "המסמך הבא", "next", 7740, 4800, 735, 495));
    s.push_back(Command("LastButt", "האחרון", "המסמך האחרון", "last", 6960, 4800, 735, 495));
}

void AddPageOptions(std::vector<ControlDesign>& s) {
    ControlDesign title = Field("txtTitle", Kind::TextBox, 240, 5820, 2415);
    s.push_back(title);
    s.push_back(CaptionLabel("Label14", "כותרת:", title));
    s.push_back(Check("ChkWithDrawing", "להציג שרטוטים של הפריטים?", 3900, 5820, 2595));
    ControlDesign lang = Field("CmbDocLang", Kind::ComboBox, 6960, 5820, 1935);
    lang.entries = Entries({"עברית", "אנגלית", "עברית ללא סכומים"});
    s.push_back(lang);
    s.push_back(CaptionLabel("Label16", "תבנית ההדפסה:", lang));
    s.push_back(Check("ChkShowTotalFC", "להציג סה\"כ מטח?", 240, 6300, 1695));
    s.push_back(Check("chkLineDisc", "להציג הנחה לשורה?", 3900, 6300, 1935));
    s.push_back(
        Check("ChkUseFName", " להציג את תאור הפריט מתוך התאור הלועזי של הפריט?", 6060, 6300, 4215));
    ControlDesign fromDate = Field("txtFromDate", Kind::TextBox, 3780, 6780, 1035);
    fromDate.text = "01/01/1980";
    s.push_back(fromDate);
    s.push_back(CaptionLabel("LblFromDate", "חיפוש החל מ:", fromDate));
    ControlDesign rules = Field("cmbRules", Kind::ComboBox, 6000, 6780, 1635);
    rules.entries = Entries({"רשת מלאה", "ללא קוים", "אפקיים בלבד", "אנכיים בלבד"});
    s.push_back(rules);
    s.push_back(CaptionLabel("Label18", "קוי הפרדה:", rules));
    s.push_back(Check("ChkShowDetails", "עמודת פרטים?", 8820, 6780, 1455));
}

// The version text, the product caption and the frames around the groups.
void AddDecoration(std::vector<ControlDesign>& s) {
    s.push_back(Design("Label17", Kind::Label, "גירסה 5.0130", 180, 6960, 1335, kLabelHeight));
    s.push_back(Design("Label12", Kind::Label, "דוברל", 5160, 5280, 700, kLabelHeight));
    s.push_back(Design("Label6", Kind::Label, "-", 4980, 5280, 180, kLabelHeight));
    s.push_back(Design("Label13", Kind::Label, "לחשבשבת", 4020, 5280, 960, kLabelHeight));
    static const int32_t frames[14][4] = {
        {120, 60, 10215, 600},    {120, 660, 10215, 1800},  {180, 1440, 1755, 855},
        {120, 4620, 10215, 1080}, {180, 4740, 3480, 840},   {3660, 4620, 3135, 615},
        {6900, 4680, 3435, 720},  {120, 5760, 10215, 420},  {120, 6240, 10215, 420},
        {120, 6720, 10215, 420},  {3720, 6720, 2220, 420},  {5940, 6720, 2820, 420},
        {8760, 6720, 1575, 420},  {120, 2460, 10215, 2235},
    };
    for (int i = 0; i < 14; ++i)
        s.push_back(Design(("Shape" + std::to_string(i + 1)).c_str(), Kind::Shape, "", frames[i][0],
                           frames[i][1], frames[i][2], frames[i][3]));
}

} // namespace

const std::vector<ControlDesign>& CardSurface() {
    static const std::vector<ControlDesign> surface = [] {
        std::vector<ControlDesign> s;
        AddHeader(s);
        AddLinesAndTotals(s);
        AddPageOptions(s);
        AddDecoration(s);
        return s;
    }();
    return surface;
}

const ControlDesign* FindDesign(const std::string& name) {
    const auto& surface = CardSurface();
    auto found = std::find_if(surface.begin(), surface.end(),
                              [&](const ControlDesign& d) { return d.name == name; });
    return found == surface.end() ? nullptr : &*found;
}

} // namespace dovrel
