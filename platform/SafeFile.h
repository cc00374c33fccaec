#pragma once

#include "platform/Path.h"

#include <cstddef>
#include <string>
#include <string_view>

namespace dovrel {

// The one way Dovrel writes and reads the files a user names. Paths here are
// the file system's own names, whatever their letters; every failure is an Error that names
// what was being done, the path and the system's reason.

// True when the name ends in ".fix" in any letter case: the accounting
// system's own files, which Dovrel never writes.
bool IsAccountingFile(std::string_view path);

// Refuses a target Dovrel must not write: a name of the accounting system's
// files, or anything that is not a regular file (a device, a pipe, a folder).
// A missing target and a link are fine: the link itself is replaced, never
// followed. `what` says what was being written ("the page").
void CheckWriteTarget(const Path& path, const std::string& what);

// Writes the bytes to a new file (mode 0600) in the target's folder, flushes it
// to the disk and renames it over the target, after CheckWriteTarget. A reader
// sees the old file or the whole new one; a failure leaves the old one.
void WriteFileAtomically(const Path& path, std::string_view bytes, const std::string& what);

// Refuses to read anything but a regular file (a link to one is followed) and
// a file larger than limit, without waiting on a pipe or a device.
void CheckReadSource(const Path& path, size_t limit, const std::string& what);

// The whole of a regular file of at most limit bytes, opened without blocking.
std::string ReadWholeFile(const Path& path, size_t limit, const std::string& what);

// A folder as the user typed it and a file name in it: the two are joined by a
// separator when the folder does not end in one ("/" or "\"). An empty folder
// gives the name alone.
std::string JoinFolder(const std::string& folder, const std::string& name);

} // namespace dovrel
