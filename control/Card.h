#pragma once

#include "control/ModuleState.h"
#include "fixfiles/DocumentView.h"
#include "platform/Messages.h"
#include "platform/Variant.h"

#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// The viewer control. It shows one document of the accounting system at a
// time; the members keep the names of the control's interface.
class Card : public DocumentView {
public:
    // The control shares the module state of its thread (or the one given)
    // and shows its message boxes through messages, which must outlive it.
    explicit Card(Messages& messages, ModuleState& shared = ModuleState::ofThisThread());

    ModuleState& shared() { return shared_; }
    const ModuleState& shared() const { return shared_; }

    // The control's child controls, by name; nullptr for an unknown name.
    Control* findControl(const std::string& name);
    const std::vector<Control*>& controls() const { return controls_; }

    int32_t ReadStock(std::string pCompPath, int16_t& pWizFile, std::string& pSearchBy,
                      Variant& pSearchValue, std::string& pStartFrom, std::string& pFromDate);
    Variant ReadITM(std::string& CompPath);
    Variant ReadACT(std::string& CompPath);

private:
    Messages& messages_;
    ModuleState& shared_;
    std::vector<Control*> controls_;
};

} // namespace dovrel
