#pragma once

#include <map>
#include <optional>
#include <string>

namespace dovrel {

// The page or form that holds the control. A web page answers the value of
// one of its elements by identifier; other containers answer nothing.
class Container {
public:
    virtual ~Container() = default;
    // The element's value (code page 1255), or nothing when there is no such
    // element. May raise an error when the page cannot be reached.
    virtual std::optional<std::string> ElementValue(const std::string& id) = 0;
};

// A container whose page elements are given up front.
class ElementsContainer : public Container {
public:
    explicit ElementsContainer(std::map<std::string, std::string> elements)
        : elements_(std::move(elements)) {}
    std::optional<std::string> ElementValue(const std::string& id) override {
        auto found = elements_.find(id);
        if (found == elements_.end())
            return std::nullopt;
        return found->second;
    }

private:
    std::map<std::string, std::string> elements_;
};

} // namespace dovrel
