#pragma once

#include "platform/Controls.h"
#include "platform/Form.h"

namespace dovrel {

class Card;

// The account details window: the phones, details and district of the
// account on screen, each with a button that copies it.
class AccDetailsForm : public Form {
public:
    explicit AccDetailsForm(Card& card);

private:
    Card& card_;
};

} // namespace dovrel
