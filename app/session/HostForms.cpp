#include "app/session/HostForms.h"

#include "platform/Error.h"

namespace dovrel {

void HostForms::queue(const std::string& form, nlohmann::json requests) {
    if (!requests.is_array())
        throw Error("modal: the user's requests must be a JSON array");
    queued_[form].push_back(std::move(requests));
}

void HostForms::ShowModal(Form& form) {
    nlohmann::json requests = nlohmann::json::array();
    auto found = queued_.find(form.name());
    if (found != queued_.end() && !found->second.empty()) {
        requests = std::move(found->second.front());
        found->second.pop_front();
    }
    form.Show();
    ++depth_;
    try {
        for (const nlohmann::json& request : requests)
            run_(request);
    } catch (...) {
        --depth_;
        form.Hide();
        throw;
    }
    --depth_;
    if (form.Visible())
        form.QueryClose();
    form.Hide();
}

} // namespace dovrel
