#include "forms/AccDetailsForm.h"

#include "control/Card.h"

namespace dovrel {

AccDetailsForm::AccDetailsForm(Card& card) : Form("frmAccDetails"), card_(card) {}

} // namespace dovrel
