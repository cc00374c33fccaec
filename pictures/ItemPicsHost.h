#pragma once

#include <string>

namespace dovrel {

class Messages;
class SettingsStore;

// The printed page's settings in the module state, which the picture
// settings form keeps in step with its boxes.
struct PageSettingRefs {
    std::string& LogoFile;
    std::string& CompTitle;
    std::string& DBPath;
    std::string& PicPath;
    std::string& PicX;
    std::string& PicY;
};

// What the picture settings form needs from the control that attaches it.
// The page settings it gives live as long as the form does.
class ItemPicsHost {
public:
    virtual Messages& formMessages() = 0;
    virtual SettingsStore& settingsStore() = 0;
    // The settings set's application name, AppName.
    virtual const std::string& settingsName() const = 0;
    virtual PageSettingRefs pageSettings() = 0;

protected:
    ~ItemPicsHost() = default;
};

} // namespace dovrel
