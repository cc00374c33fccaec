// The block record reader, checked against the file's own bytes. The input
// starts with control bytes, then the file's bytes:
//   length   1 byte: record length 1 to 256
//   block    1 byte: block size, 1 to 8 records plus 0 to 31 bytes (so the
//            blocks of small files are small too, and do not hold whole records)
//   count    1 byte: number of record reads that follow
//   reads    count x 2 bytes, little-endian signed: record numbers
// The rest is written as a file in a private directory.

#include "FuzzSupport.h"

#include "fixfiles/RecordFile.h"
#include "platform/Error.h"

#include <cstring>
#include <vector>

using namespace dovrel;
using dovrel::fuzz::Bytes;
using dovrel::fuzz::Require;

namespace {

void CheckRecord(RecordFile& file, std::string_view bytes, int64_t n) {
    auto length = static_cast<int64_t>(file.recordLength());
    const unsigned char* record = nullptr;
    try {
        record = file.record(n);
    } catch (const Error&) {
        Require(n < 1, "only a record number below 1 is an error");
        return;
    }
    Require(n >= 1, "a record number below 1 is an error");
    bool whole = n * length <= static_cast<int64_t>(bytes.size());
    Require((record != nullptr) == whole,
            "a record is there exactly when the file holds all of it");
    if (record != nullptr)
        Require(std::memcmp(record, bytes.data() + (n - 1) * length, file.recordLength()) == 0,
                "a record holds the file's bytes");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    Bytes in(data, size);
    size_t length = size_t{in.byte()} + 1;
    uint8_t block = in.byte();
    size_t blockSize = length * (1 + block % 8) + block / 8;
    std::vector<int64_t> reads(in.byte());
    for (int64_t& n : reads)
        n = in.int16();
    std::string_view bytes = in.rest();
    const std::string path = fuzz::PrivateDir() + "/records";
    fuzz::WriteFile(path, bytes);

    RecordFile file(Path(path), length, blockSize);
    Require(file.length() == static_cast<int64_t>(bytes.size()), "the length is the file's");
    int64_t last = static_cast<int64_t>(bytes.size() / length);
    for (int64_t n : reads)
        CheckRecord(file, bytes, n);
    // A walk to the end and back, as the readers make it.
    for (int64_t n = 1; n <= last + 1; ++n)
        CheckRecord(file, bytes, n);
    for (int64_t n = last + 1; n >= 1; --n)
        CheckRecord(file, bytes, n);
    return 0;
}
