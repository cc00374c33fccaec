#pragma once

#include "platform/Controls.h"
#include "platform/Form.h"

namespace dovrel {

class Card;

// The picture settings form: the printed page's settings and the ranges of
// item keys and category codes with their pictures.
class ItemPicsForm : public Form {
public:
    explicit ItemPicsForm(Card& card);

    TextBox txtLogoFile{"txtLogoFile"};
    TextBox txtCompTitle{"txtCompTitle"};
    TextBox txtDBPath{"txtDBPath"};
    TextBox txtPicPath{"txtPicPath"};
    TextBox txtPicX{"txtPicX"};
    TextBox txtPicY{"txtPicY"};

private:
    Card& card_;
};

} // namespace dovrel
