#pragma once

#include "platform/Controls.h"

#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

// A list shown open, one entry per line, which can be switched off while it
// is being refilled.
class ListBox : public ComboBox {
public:
    explicit ListBox(std::string name) : ComboBox(std::move(name), ControlKind::ListBox) {}

    bool Enabled() const { return enabled_; }
    // A list switched on or off tells its watchers, as a refill does.
    void setEnabled(bool enabled) {
        if (enabled_ == enabled)
            return;
        enabled_ = enabled;
        changed();
    }

private:
    bool enabled_ = true;
};

// A drop-down of the mounted file systems: its entries are their mount
// points, "/" first, and the selected one is the drive. It starts on the
// first entry.
class DriveListBox : public ComboBox {
public:
    DriveListBox(std::string name, std::vector<std::string> drives);

    std::string Drive() const { return Text(); }
    // Selects the entry equal to drive; a drive that is not in the list is
    // refused with an error and the selection stays.
    void setDrive(const std::string& drive);
};

// A directory tree that shows one directory, its path. Only an existing
// directory can be shown; any other path is refused with an error.
class DirListBox : public Control {
public:
    explicit DirListBox(std::string name, std::string path = "/")
        : Control(std::move(name), ControlKind::DirList), path_(std::move(path)) {}

    const std::string& Path() const { return path_; }
    void setPath(const std::string& path);

    Signal<> changed;

private:
    std::string path_;
};

// The mount points listed in the text of a mounts table (the format of
// /proc/self/mounts), in code page 1255: "/" first, then the others in
// sorted order, once each. Kernel-internal file systems (proc, sysfs,
// cgroups and the like) are left out.
std::vector<std::string> MountPoints(std::string_view mountsTable);
// The mount points of this system; just "/" when the table cannot be read.
std::vector<std::string> SystemMountPoints();

} // namespace dovrel
