#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace dovrel {

// Fields of a fixed-length record as the accounting system stores them:
// fixed-width texts, little-endian 16-bit integers and IEEE 754 doubles.

inline std::string_view Field(const unsigned char* record, size_t offset, size_t width) {
    return {reinterpret_cast<const char*>(record) + offset, width};
}

inline double DoubleAt(const unsigned char* record, size_t offset) {
    uint64_t bits = 0;
    for (size_t i = 0; i < 8; ++i)
        bits |= static_cast<uint64_t>(record[offset + i]) << (8 * i);
    return std::bit_cast<double>(bits);
}

inline int16_t Int16At(const unsigned char* record, size_t offset) {
    return static_cast<int16_t>(record[offset] | (record[offset + 1] << 8));
}

} // namespace dovrel
