#pragma once

// Helpers shared by the fuzz targets: a private directory for the files a
// target writes, and a reader over the input's leading control bytes.

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>
#include <string_view>

namespace dovrel::fuzz {

// A directory of this process's own, made once and kept for its lifetime.
inline const std::string& PrivateDir() {
    static const std::string dir = [] {
        std::string pattern = "/tmp/dovrel-fuzz-XXXXXX";
        if (mkdtemp(pattern.data()) == nullptr) {
            std::perror("mkdtemp");
            std::abort();
        }
        return pattern;
    }();
    return dir;
}

inline void WriteFile(const std::string& path, std::string_view bytes) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    if (!out) {
        std::perror(path.c_str());
        std::abort();
    }
}

// A broken promise of the code under test: stops the run so that the fuzzer
// keeps the input.
inline void Require(bool holds, const char* what) {
    if (!holds) {
        std::fprintf(stderr, "fuzz check failed: %s\n", what);
        std::abort();
    }
}

// Takes control values from the front of the input; past its end every
// value is 0 and every text empty. rest() is what has not been taken.
class Bytes {
public:
    Bytes(const uint8_t* data, size_t size) : text_(reinterpret_cast<const char*>(data), size) {}

    uint8_t byte() {
        if (text_.empty())
            return 0;
        auto b = static_cast<uint8_t>(text_.front());
        text_.remove_prefix(1);
        return b;
    }
    int16_t int16() { return static_cast<int16_t>(byte() | (byte() << 8)); }
    int32_t int32() {
        uint32_t v = 0;
        for (int i = 0; i < 4; ++i)
            v |= static_cast<uint32_t>(byte()) << (8 * i);
        return static_cast<int32_t>(v);
    }
    std::string text(size_t length) {
        std::string taken(text_.substr(0, length));
        text_.remove_prefix(taken.size());
        return taken;
    }
    std::string_view rest() const { return text_; }

private:
    std::string_view text_;
};

} // namespace dovrel::fuzz
