#pragma once

#include "platform/Path.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace dovrel {

// A file of fixed-length records numbered from 1, opened read-only for one
// operation and closed with the object. Records are read with pread in large
// blocks, forward or backward, so a scan costs a few system calls per block
// and its memory does not grow with the file. The two blocks read last are
// kept: a backward walk that looks ahead at a document's later records finds
// them in the block it has just left instead of reading it again. The file
// may change while it is read: a record that is no longer (or not yet) wholly
// in the file is simply not there.
class RecordFile {
public:
    // Opens the file (a file-system path); an error when it cannot be opened.
    RecordFile(const Path& path, size_t recordLength, size_t blockSize = 256 * 1024);
    ~RecordFile();
    RecordFile(const RecordFile&) = delete;
    RecordFile& operator=(const RecordFile&) = delete;

    // The file length in bytes when it was opened.
    int64_t length() const { return length_; }
    size_t recordLength() const { return recordLength_; }
    const std::string& path() const { return path_; }

    // Record n, or nullptr when the file does not hold all of it. A record
    // number below 1 is an error ("Bad record number"). The pointer stays
    // valid until the next call.
    const unsigned char* record(int64_t n) {
        // Inline for the record in the block read last, as nearly every
        // record of a scan is: a scan reads millions of them.
        auto len = static_cast<int64_t>(recordLength_);
        if (n >= 1 && n <= lastNumber_ && blocks_[0].holds((n - 1) * len, len))
            return blocks_[0].bytes.data() + ((n - 1) * len - blocks_[0].start);
        return recordElsewhere(n);
    }

private:
    struct Block {
        std::vector<unsigned char> bytes;
        int64_t start = 0; // file offset of bytes[0]
        size_t filled = 0; // bytes that hold file data
        bool holds(int64_t offset, int64_t length) const {
            return offset >= start && offset + length <= start + static_cast<int64_t>(filled);
        }
    };

    // record() for a record that is not in the block read last.
    const unsigned char* recordElsewhere(int64_t n);
    void fill(int64_t offset);

    std::string path_;
    int fd_ = -1;
    size_t recordLength_;
    int64_t lastNumber_; // the largest record number whose offset can be computed
    int64_t length_ = 0;
    Block blocks_[2];      // the block read last, and the one before it
    int64_t endSeen_ = -1; // where the last read met the end of the file; -1 unknown
};

} // namespace dovrel
