#include "app/session/HostArgs.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <cmath>

namespace dovrel {

HostArgs::HostArgs(std::string command, const nlohmann::json& args)
    : command_(std::move(command)), args_(args) {}

void HostArgs::expectCount(size_t count) const {
    if (args_.size() != count)
        throw Error(command_ + " takes " + std::to_string(count) + " argument" +
                    (count == 1 ? "" : "s") + ", got " + std::to_string(args_.size()));
}

const nlohmann::json& HostArgs::at(size_t index) const {
    if (index >= args_.size())
        throw Error(command_ + ": argument " + std::to_string(index + 1) + " is missing");
    return args_[index];
}

std::string HostArgs::describe(size_t index, const char* what) const {
    return command_ + ": argument " + std::to_string(index + 1) + " (" + what + ")";
}

std::string HostArgs::text(size_t index, const char* what) const {
    return Text(at(index), describe(index, what));
}

int64_t HostArgs::integer(size_t index, const char* what, int64_t min, int64_t max) const {
    return Integer(at(index), describe(index, what), min, max);
}

Variant HostArgs::scalar(size_t index, const char* what) const {
    return Scalar(at(index), describe(index, what));
}

std::string HostArgs::Text(const nlohmann::json& value, const std::string& what) {
    if (!value.is_string())
        throw Error(what + " must be a string");
    return FromUtf8(Utf8(value.get_ref<const std::string&>()));
}

int64_t HostArgs::Integer(const nlohmann::json& value, const std::string& what, int64_t min,
                          int64_t max) {
    bool fits = false;
    int64_t result = 0;
    if (value.is_number_unsigned()) {
        uint64_t number = value.get<uint64_t>();
        fits = max >= 0 && number <= static_cast<uint64_t>(max);
        result = fits ? static_cast<int64_t>(number) : 0;
    } else if (value.is_number_integer()) {
        result = value.get<int64_t>();
        fits = true;
    } else if (value.is_number_float()) {
        double number = value.get<double>();
        fits = std::isfinite(number) && std::floor(number) == number &&
               number >= static_cast<double>(min) && number <= static_cast<double>(max);
        result = fits ? static_cast<int64_t>(number) : 0;
    }
    if (!fits || result < min || result > max)
        throw Error(what + " must be a whole number from " + std::to_string(min) + " to " +
                    std::to_string(max));
    return result;
}

Variant HostArgs::Scalar(const nlohmann::json& value, const std::string& what) {
    if (value.is_null())
        return Variant::Null();
    if (value.is_boolean())
        return Variant(value.get<bool>());
    if (value.is_number())
        return Variant(value.get<double>());
    if (value.is_string())
        return Variant(FromUtf8(Utf8(value.get_ref<const std::string&>())));
    throw Error(what + " must be null, a number, a string or a boolean");
}

} // namespace dovrel
