#pragma once

#include "platform/Controls.h"
#include "platform/Form.h"

namespace dovrel {

class Card;

// The company chooser: finds the companies under a directory and sets the
// control's company path to the one the user picks.
class OpenDirForm : public Form {
public:
    explicit OpenDirForm(Card& card);

private:
    Card& card_;
};

} // namespace dovrel
