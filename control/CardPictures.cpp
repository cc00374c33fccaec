// The control's picture work: the lookup that gives each line of the current
// document its picture, and the picture settings form.
#include "control/Card.h"

#include "pictures/ItemPicsForm.h"
#include "pictures/PictureLookup.h"

namespace dovrel {

void Card::FillPicPath(std::string& pDbName) {
    FillPictures(pDbName, shared_.Doc, shared_.Pictures);
}

PageSettingRefs Card::pageSettings() {
    return {shared_.LogoFile, shared_.CompTitle, shared_.DBPath,
            shared_.PicPath,  shared_.PicX,      shared_.PicY};
}

// Closing the form drops what was typed but not saved: it is loaded again
// from the settings store and the picture database, as on its next use.
void Card::CmdParams_Click() {
    auto& settings = dynamic_cast<ItemPicsForm&>(form("frmItemPics"));
    settings.attach(*this);
    services_.forms.ShowModal(settings);
    if (!settings.Visible())
        settings.Load();
}

} // namespace dovrel
