#include "platform/ListControls.h"

#include "platform/Encoding.h"
#include "platform/Error.h"
#include "platform/FileSystem.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <sstream>

namespace dovrel {

namespace {

// File systems that hold no user files.
const std::set<std::string, std::less<>> kInternalTypes = {
    "autofs",     "binfmt_misc", "bpf",       "cgroup", "cgroup2", "configfs", "debugfs",
    "devpts",     "fusectl",     "hugetlbfs", "mqueue", "nsfs",    "proc",     "pstore",
    "rpc_pipefs", "securityfs",  "selinuxfs", "sysfs",  "tracefs", "efivarfs"};

// The mounts table writes space, tab, newline and backslash as \ooo.
std::string Unescape(const std::string& field) {
    auto octal = [](char c) { return c >= '0' && c <= '7'; };
    std::string out;
    for (size_t i = 0; i < field.size(); ++i) {
        if (field[i] == '\\' && i + 3 < field.size() && octal(field[i + 1]) &&
            octal(field[i + 2]) && octal(field[i + 3])) {
            out += static_cast<char>(((field[i + 1] - '0') << 6) | ((field[i + 2] - '0') << 3) |
                                     (field[i + 3] - '0'));
            i += 3;
        } else {
            out += field[i];
        }
    }
    return out;
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
    throw Error("Drive not found: " + ToUtf8(drive));
}

void DirListBox::setPath(const std::string& path) {
    std::error_code ec;
    if (path.empty() ||
        !std::filesystem::is_directory(ResolvePath(PathFromCp1255(path)).native(), ec))
        throw Error("Path not found: " + ToUtf8(path));
    if (path == path_)
        return;
    path_ = path;
    changed();
}

std::vector<std::string> MountPoints(std::string_view mountsTable) {
    std::set<std::string> points;
    std::istringstream lines{std::string(mountsTable)};
    std::string line;
    while (std::getline(lines, line)) {
        std::istringstream fields(line);
        std::string device, point, type;
        if (!(fields >> device >> point >> type) || kInternalTypes.count(type) != 0)
            continue;
        std::string native = Unescape(point);
        std::string text = FromUtf8(native);
        // A mount point the core's code page cannot name could not be opened.
        if (native.starts_with('/') && ToUtf8(text) == native)
            points.insert(text);
    }
    points.erase("/");
    std::vector<std::string> result{"/"};
    result.insert(result.end(), points.begin(), points.end());
    return result;
}

std::vector<std::string> SystemMountPoints() {
    std::ifstream in("/proc/self/mounts");
    std::string table{std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>()};
    return MountPoints(table);
}

} // namespace dovrel
