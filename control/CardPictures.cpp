#include "control/Card.h"

namespace dovrel {

// Fills the picture file name of each line of the current document from the
// picture database; nothing yet.
void Card::FillPicPath(std::string&) {}

void Card::CmdParams_Click() {
    services_.forms.ShowModal(form("frmItemPics"));
}

} // namespace dovrel
