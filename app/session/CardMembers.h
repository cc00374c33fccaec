#pragma once

#include "app/session/HostArgs.h"
#include "control/Card.h"

#include <string>

#include <nlohmann/json.hpp>

namespace dovrel {

// Reads and writes a Card's public members and child controls by name, with
// JSON values: the four Pub members and ReadingOrder, the text of a text box, the position of
// a list (-1 for none), the value of a check box, the path of a directory
// tree. Getting also gives a shape's width, a grid's cells, a caption, and a
// side form's list with its entries. "FORM.CONTROL" names a
// control of a loaded side form. A wrong name or value is an Error.
class CardMembers {
public:
    static void Set(Card& card, const std::string& name, const nlohmann::json& value);
    static nlohmann::json Get(Card& card, const std::string& name);
    static void SetControl(Control& control, const nlohmann::json& value);
    // ["select", NAME, INDEX] picks the entry of a list; ["select", NAME,
    // START, LENGTH] selects part of a text box's text.
    // ["select", GRID, ROW] makes a row the grid's current row.
    static void Select(Card& card, const std::string& name, const HostArgs& args);
    // Types a text into one cell of a grid: the arguments after the name
    // are the row, the column and the text.
    static void SetCell(Card& card, const std::string& name, const HostArgs& args);
    // The control of the card, or of a loaded form for "FORM.CONTROL".
    static Control& Find(Card& card, const std::string& name);
    // The loaded form of that name.
    static Form& FindForm(Card& card, const std::string& name);

private:
    static bool SetPub(Card& card, const std::string& name, const nlohmann::json& value);
};

} // namespace dovrel
