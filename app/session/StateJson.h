#pragma once

#include "control/Card.h"
#include "platform/Messages.h"
#include "platform/Variant.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include <nlohmann/json.hpp>

namespace dovrel {

// The control's whole visible state as JSON, for the automation host and
// `dovrel show --json`. Texts are converted to UTF-8 here; numbers that are
// not finite (damaged files can hold them) are written as null.
class StateJson {
public:
    static nlohmann::json Build(const Card& card);
    // The same state, with what the document reader gives (the header boxes,
    // the lines grid, the current document) made from the document the
    // control shows instead of read from its controls.
    static nlohmann::json BuildFromDocument(const Card& card);

    // The value of one control: the text of a text box, the position of a
    // list, the value of a check box, the width of a shape, the cells of a
    // grid, the caption of a label or button.
    static nlohmann::json ControlValue(const Control& control);
    static nlohmann::json Messages(const std::vector<RecordedMessages::Shown>& shown);

    static nlohmann::json Text(std::string_view cp1255);
    static nlohmann::json Number(double value);
    static nlohmann::json FromVariant(const Variant& value);
    static nlohmann::json Account(const AccountEntry& entry);

    // Serialises without failing on bytes that are not UTF-8 (they become
    // U+FFFD); indent -1 gives one line.
    static std::string Dump(const nlohmann::json& value, int indent = -1);

private:
    static nlohmann::json Controls(const std::vector<Control*>& list);
    static nlohmann::json FormControls(const std::vector<Control*>& list);
    static nlohmann::json Forms(const ModuleState& shared);
    static nlohmann::json GridCells(const Grid& grid);
    static nlohmann::json Selections(const std::vector<Control*>& list);
    static nlohmann::json ListValue(const ComboBox& list);
    static nlohmann::json Document(const CurrentDocument& doc);
    static nlohmann::json Header(const DocumentHeader& header);
    static nlohmann::json Lines(const CurrentDocument& doc);
    static nlohmann::json Amounts(const CurrentDocument& doc);
};

} // namespace dovrel
