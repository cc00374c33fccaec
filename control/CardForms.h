#pragma once

#include "platform/Form.h"

#include <memory>
#include <string>

namespace dovrel {

class Card;

// Makes the side form of the given name ("frmOpenDir", "frmItemPics",
// "frmAccDetails") for the control that first opens it.
std::unique_ptr<Form> MakeCardForm(const std::string& name, Card& card);

} // namespace dovrel
