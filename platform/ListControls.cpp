#include "platform/ListControls.h"

#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileReach.h"
#include "platform/FileSystem.h"

#include <mntent.h>

#include <cstdio>
#include <filesystem>
#include <set>
#include <vector>

namespace dovrel {

namespace {

// File systems that hold no user files.
const std::set<std::string, std::less<>> kInternalTypes = {
    "autofs",     "binfmt_misc", "bpf",       "cgroup", "cgroup2", "configfs", "debugfs",
    "devpts",     "fusectl",     "hugetlbfs", "mqueue", "nsfs",    "proc",     "pstore",
    "rpc_pipefs", "securityfs",  "selinuxfs", "sysfs",  "tracefs", "efivarfs"};

// The mount points of an open mounts table, in code page 1255, "/" first.
std::vector<std::string> ReadMountPoints(FILE* table) {
    std::set<std::string> points;
    // getmntent_r undoes the table's escapes (space, tab, newline,
    // backslash); the reentrant form keeps two threads' scans apart.
    std::vector<char> line(16384);
    mntent entry{};
    while (table != nullptr &&
           getmntent_r(table, &entry, line.data(), static_cast<int>(line.size())) != nullptr) {
        if (kInternalTypes.count(entry.mnt_type) != 0)
            continue;
        std::string native = entry.mnt_dir;
        std::string text = FromUtf8(Utf8(native));
        // A mount point the core's code page cannot name could not be opened.
        if (native.starts_with('/') && ToUtf8(text).str() == native)
            points.insert(text);
    }
    points.erase("/");
    std::vector<std::string> result{"/"};
    result.insert(result.end(), points.begin(), points.end());
    return result;
}

} // namespace

DriveListBox::DriveListBox(std::string name, std::vector<std::string> drives)
    : ComboBox(std::move(name), ControlKind::DriveList) {
    for (std::string& drive : drives)
        AddItem(std::move(drive));
    if (ListCount() > 0)
        setListIndex(0);
}

void DriveListBox::setDrive(const std::string& drive) {
    for (int32_t i = 0; i < ListCount(); ++i)
        if (List(i) == drive)
            return setListIndex(i);
    throw Error("Drive not found: " + ToUtf8(drive).str());
}

void DirListBox::setPath(const std::string& path) {
    std::error_code ec;
    if (path.empty() ||
        !std::filesystem::is_directory(ResolvePath(PathFromCp1255(path)).native(), ec))
        throw Error("Path not found: " + ToUtf8(path).str());
    if (path == path_)
        return;
    path_ = path;
    changed();
}

std::vector<std::string> MountPoints(std::string_view mountsTable) {
    std::string text(mountsTable);
    FILE* table = text.empty() ? nullptr : fmemopen(text.data(), text.size(), "r");
    std::vector<std::string> points = ReadMountPoints(table);
    if (table != nullptr)
        fclose(table);
    return points;
}

std::vector<std::string> SystemMountPoints() {
    // A thread held to some folders shows those folders as its drives.
    if (!FileReach::Roots().empty()) {
        std::vector<std::string> roots;
        for (const std::string& root : FileReach::Roots())
            if (ToUtf8(FromUtf8(Utf8(root))).str() == root)
                roots.push_back(FromUtf8(Utf8(root)));
        return roots;
    }
    FILE* table = setmntent("/proc/self/mounts", "r");
    std::vector<std::string> points = ReadMountPoints(table);
    if (table != nullptr)
        endmntent(table);
    return points;
}

} // namespace dovrel
