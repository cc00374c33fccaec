#include "fixfiles/RecordFile.h"

#include "platform/Error.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <limits>

namespace dovrel {

RecordFile::RecordFile(const Path& path, size_t recordLength, size_t blockSize)
    : path_(path.shown().str()), recordLength_(recordLength),
      lastNumber_(std::numeric_limits<int64_t>::max() /
                  std::max<int64_t>(1, static_cast<int64_t>(recordLength))),
      blocks_{{std::vector<unsigned char>(std::max(blockSize, recordLength))},
              {std::vector<unsigned char>(std::max(blockSize, recordLength))}} {
    // O_NONBLOCK keeps a named pipe planted where a data file should be from
    // hanging the open; such a file is then refused below.
    fd_ = ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK | O_NOCTTY);
    if (fd_ < 0)
        ThrowSystemError("Cannot open", path_, errno);
    struct stat st;
    if (::fstat(fd_, &st) != 0) {
        int err = errno;
        ::close(fd_);
        ThrowSystemError("Cannot read", path_, err);
    }
    if (!S_ISREG(st.st_mode)) {
        ::close(fd_);
        throw Error("Cannot read " + path_ + ": not a regular file");
    }
    length_ = st.st_size;
}

RecordFile::~RecordFile() {
    if (fd_ >= 0)
        ::close(fd_);
}

const unsigned char* RecordFile::recordElsewhere(int64_t n) {
    if (n < 1)
        throw Error("Bad record number " + std::to_string(n) + " in " + path_);
    // Worked out once in the constructor: a division for every record would
    // cost a scan more than the rest of this function.
    if (n > lastNumber_)
        return nullptr;
    auto len = static_cast<int64_t>(recordLength_);
    int64_t offset = (n - 1) * len;
    if (!blocks_[0].holds(offset, len)) {
        // A record past the end the last read met is not there; asking the
        // file again for each one would make a walk over a shortened file slow.
        if (endSeen_ >= 0 && offset + len > endSeen_)
            return nullptr;
        if (blocks_[1].holds(offset, len))
            std::swap(blocks_[0], blocks_[1]);
        else
            fill(offset);
        if (!blocks_[0].holds(offset, len))
            return nullptr;
    }
    return blocks_[0].bytes.data() + (offset - blocks_[0].start);
}

// Reads a block that holds the record at offset, in place of the older of the
// two: starting at the record when the scan goes forward, ending with it when
// the scan has moved backward.
void RecordFile::fill(int64_t offset) {
    const Block& last = blocks_[0];
    Block& block = blocks_[1];
    auto size = static_cast<int64_t>(block.bytes.size());
    int64_t start = offset;
    if (last.filled > 0 && offset < last.start)
        start = std::max<int64_t>(0, offset + static_cast<int64_t>(recordLength_) - size);
    block.start = start;
    block.filled = 0;
    while (block.filled < block.bytes.size()) {
        ssize_t got =
            ::pread(fd_, block.bytes.data() + block.filled, block.bytes.size() - block.filled,
                    start + static_cast<int64_t>(block.filled));
        if (got < 0 && errno == EINTR)
            continue;
        if (got < 0)
            ThrowSystemError("Cannot read", path_, errno);
        if (got == 0)
            break;
        block.filled += static_cast<size_t>(got);
    }
    std::swap(blocks_[0], blocks_[1]);
    int64_t end = start + static_cast<int64_t>(blocks_[0].filled);
    if (blocks_[0].filled < blocks_[0].bytes.size()) {
        // The end of the file was met: it may have become shorter since the
        // other block was read, so that block no longer counts.
        endSeen_ = end;
        blocks_[1].filled = 0;
    } else if (end > endSeen_) {
        endSeen_ = -1;
    }
}

} // namespace dovrel
