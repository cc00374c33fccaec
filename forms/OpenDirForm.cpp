#include "forms/OpenDirForm.h"

#include "control/Card.h"

namespace dovrel {

OpenDirForm::OpenDirForm(Card& card) : Form("frmOpenDir"), card_(card) {}

} // namespace dovrel
