#include "forms/FormDesigns.h"

#include "platform/Encoding.h"

namespace dovrel {

namespace {

using Kind = ControlKind;

constexpr int32_t kMargin = 120;
constexpr int32_t kButtonHeight = 375;

ControlDesign CaptionFor(const std::string& name, const char* captionUtf8,
                         const ControlDesign& field, int32_t formWidth) {
    int32_t left = field.left + field.width + 60;
    ControlDesign d = Design(name, Kind::Label, captionUtf8, left, field.top + 30,
                             formWidth - kMargin - left, 255);
    d.labelFor = field.name;
    return d;
}

std::vector<ControlDesign> MakeOpenDir() {
    constexpr int32_t inner = kOpenDirWidth - 2 * kMargin;
    ControlDesign drive = Design("PathDrive", Kind::DriveList, "", kMargin, 120, 2400, 315);
    std::vector<ControlDesign> d;
    d.push_back(CaptionFor("Label1", "בחירת מחיצה/כונן ראשי:", drive, kOpenDirWidth));
    d.push_back(drive);
    d.push_back(Design("MainDir", Kind::DirList, "", kMargin, 540, inner, 2340));
    d.push_back(Design("cmdFindWizComp", Kind::Button, "לחץ כאן לחיפוש חברות חשבשבת...", kMargin,
                       3000, inner, kButtonHeight));
    d.push_back(Design("cmbCompany", Kind::ListBox, "", kMargin, 3480, inner, 1980));
    d.push_back(Design("Msg1", Kind::Label, "", kMargin, 5520, inner, 255));
    d.push_back(Design("CancelButton", Kind::Button, "ביטול", kMargin, 5880, 1215, kButtonHeight));
    d.push_back(Design("OKButton", Kind::Button, "אישור", kOpenDirWidth - kMargin - 1215, 5880,
                       1215, kButtonHeight));
    return d;
}

std::vector<ControlDesign> MakeAccDetails() {
    struct Row {
        const char* box;
        const char* label;
        const char* captionUtf8;
    };
    const Row rows[] = {{"txtPhone", "Label1", "טלפונים:"},
                        {"txtDetails", "Label2", "פרטים:"},
                        {"txtDistrict", "Label3", "שכונה:"}};
    std::vector<ControlDesign> d;
    int32_t top = 150;
    int32_t index = 0;
    for (const Row& row : rows) {
        ControlDesign box = Design(row.box, Kind::TextBox, "", kMargin, top, 4200, 285);
        d.push_back(CaptionFor(row.label, row.captionUtf8, box, kAccDetailsWidth));
        d.push_back(box);
        d.push_back(Design(ArrayElementName("cmdCopyText", index++), Kind::Button, "העתק וסגור",
                           kMargin, top + 345, 1335, 330));
        top += 1080;
    }
    return d;
}

} // namespace

const std::vector<ControlDesign>& OpenDirDesign() {
    static const std::vector<ControlDesign> design = MakeOpenDir();
    return design;
}

const std::vector<ControlDesign>& AccDetailsDesign() {
    static const std::vector<ControlDesign> design = MakeAccDetails();
    return design;
}

std::string ArrayElementName(const std::string& name, int32_t index) {
    return name + "(" + std::to_string(index) + ")";
}

} // namespace dovrel
