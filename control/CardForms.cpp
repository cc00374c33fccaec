#include "control/CardForms.h"

#include "platform/Error.h"

namespace dovrel {

std::unique_ptr<Form> MakeCardForm(const std::string& name, Card&) {
    if (name != "frmOpenDir" && name != "frmItemPics" && name != "frmAccDetails")
        throw Error("Unknown form: " + name);
    return std::make_unique<Form>(name);
}

} // namespace dovrel
