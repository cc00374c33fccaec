#include "app/web/DesignJson.h"

#include "control/Surface.h"
#include "forms/FormDesigns.h"
#include "pictures/ItemPicsDesign.h"
#include "platform/ControlDesign.h"
#include "platform/Encoding.h"

#include <cstdio>
#include <string>
#include <vector>

namespace dovrel {
namespace {

using nlohmann::json;

const char* KindName(ControlKind kind) {
    switch (kind) {
    case ControlKind::TextBox:
        return "text";
    case ControlKind::ComboBox:
        return "combo";
    case ControlKind::CheckBox:
        return "check";
    case ControlKind::Label:
        return "label";
    case ControlKind::Shape:
        return "shape";
    case ControlKind::Button:
        return "button";
    case ControlKind::Grid:
        return "grid";
    case ControlKind::ListBox:
        return "list";
    case ControlKind::DriveList:
        return "drives";
    case ControlKind::DirList:
        return "dirs";
    }
    return "label";
}

json Control(const ControlDesign& d) {
    json entries = json::array();
    for (const std::string& entry : d.entries)
        entries.push_back(ToUtf8(entry).str());
    char color[8];
    std::snprintf(color, sizeof color, "#%06x", d.foreColor & 0xffffffu);
    return {{"name", d.name},
            {"kind", KindName(d.kind)},
            {"caption", ToUtf8(d.caption).str()},
            {"toolTip", ToUtf8(d.toolTip).str()},
            {"left", d.left},
            {"top", d.top},
            {"width", d.width},
            {"height", d.height},
            {"entries", std::move(entries)},
            {"text", ToUtf8(d.text).str()},
            {"labelFor", d.labelFor},
            {"picture", d.picture},
            {"grey", d.grey},
            {"bold", d.bold},
            {"color", color}};
}

json Layout(const std::string& captionUtf8, int32_t width, int32_t height,
            const std::vector<ControlDesign>& controls) {
    json list = json::array();
    for (const ControlDesign& design : controls)
        list.push_back(Control(design));
    return {{"caption", captionUtf8}, {"width", width}, {"height", height}, {"controls", list}};
}

} // namespace

json DesignJson::Build() {
    json forms = {
        {"frmItemPics", Layout(kItemPicsCaptionUtf8, kItemPicsDesignWidth, kItemPicsDesignHeight,
                               ItemPicsDesign())},
        {"frmOpenDir", Layout(kOpenDirCaptionUtf8, kOpenDirWidth, kOpenDirHeight, OpenDirDesign())},
        {"frmAccDetails",
         Layout(kAccDetailsCaptionUtf8, kAccDetailsWidth, kAccDetailsHeight, AccDetailsDesign())}};
    return {{"card", Layout("", kCardDesignWidth, kCardDesignHeight, CardSurface())},
            {"forms", std::move(forms)}};
}

} // namespace dovrel
