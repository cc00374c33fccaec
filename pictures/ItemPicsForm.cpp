#include "pictures/ItemPicsForm.h"

#include "control/Card.h"

namespace dovrel {

ItemPicsForm::ItemPicsForm(Card& card) : Form("frmItemPics"), card_(card) {}

} // namespace dovrel
