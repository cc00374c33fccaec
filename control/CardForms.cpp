#include "control/CardForms.h"

#include "control/Card.h"
#include "forms/AccDetailsForm.h"
#include "forms/OpenDirForm.h"
#include "pictures/ItemPicsForm.h"
#include "platform/Error.h"

namespace dovrel {

std::unique_ptr<Form> MakeCardForm(const std::string& name, Card& card) {
    if (name == "frmOpenDir")
        return std::make_unique<OpenDirForm>(card);
    if (name == "frmItemPics")
        return std::make_unique<ItemPicsForm>(card);
    if (name == "frmAccDetails")
        return std::make_unique<AccDetailsForm>(card);
    throw Error("Unknown form: " + name);
}

} // namespace dovrel
