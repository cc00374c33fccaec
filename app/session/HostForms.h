#pragma once

#include "platform/Form.h"

#include <deque>
#include <functional>
#include <map>
#include <string>

#include <nlohmann/json.hpp>

namespace dovrel {

// Shows the side forms to a script instead of a person: what the user does
// the next time a form is shown is queued beforehand as automation requests.
// While the form is shown they run in order; a form still shown when they
// end is closed as with the window's close button. A form with nothing
// queued is closed at once.
class HostForms : public FormPresenter {
public:
    using Runner = std::function<void(const nlohmann::json& request)>;

    explicit HostForms(Runner run) : run_(std::move(run)) {}

    // Queues the requests (a JSON array) for the next showing of the form.
    void queue(const std::string& form, nlohmann::json requests);
    void ShowModal(Form& form) override;
    // True while a form is shown: the control that opened it is still at work.
    bool showing() const { return depth_ > 0; }

private:
    Runner run_;
    std::map<std::string, std::deque<nlohmann::json>> queued_;
    int depth_ = 0;
};

} // namespace dovrel
