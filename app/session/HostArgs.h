#pragma once

#include "platform/Variant.h"

#include <cstddef>
#include <cstdint>
#include <string>

#include <nlohmann/json.hpp>

namespace dovrel {

// The arguments of one automation request (the array after the command's
// name), read with checks: a missing argument or one of the wrong type is an
// Error that names the command and the argument.
class HostArgs {
public:
    HostArgs(std::string command, const nlohmann::json& args);

    size_t size() const { return args_.size(); }
    // Requires exactly count arguments.
    void expectCount(size_t count) const;

    const nlohmann::json& at(size_t index) const;
    // A JSON string, converted from UTF-8 to the core's code page.
    std::string text(size_t index, const char* what) const;
    // A JSON number without a fraction, within [min, max].
    int64_t integer(size_t index, const char* what, int64_t min, int64_t max) const;
    // Any JSON scalar: null, number, string or boolean.
    Variant scalar(size_t index, const char* what) const;

    // The same conversions for a single value.
    static int64_t Integer(const nlohmann::json& value, const std::string& what, int64_t min,
                           int64_t max);
    static Variant Scalar(const nlohmann::json& value, const std::string& what);
    static std::string Text(const nlohmann::json& value, const std::string& what);

private:
    std::string describe(size_t index, const char* what) const;

    std::string command_;
    const nlohmann::json& args_;
};

} // namespace dovrel
