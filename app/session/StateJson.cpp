#include "app/session/StateJson.h"

#include "platform/Encoding.h"
#include "platform/ListControls.h"

#include <algorithm>
#include <cmath>

namespace dovrel {

using nlohmann::json;

json StateJson::Build(const Card& card) {
    const ModuleState& shared = card.shared();
    json state;
    state["PubACTLocation"] = card.PubACTLocation;
    state["PubPrevLocation"] = card.PubPrevLocation;
    state["PubSearchBy"] = Text(card.PubSearchBy);
    state["PubSearchValue"] = FromVariant(card.PubSearchValue);
    state["CompDir"] = Text(shared.CompDir);
    state["AppName"] = Text(shared.AppName);
    state["DBPath"] = Text(shared.DBPath);
    state["PicPath"] = Text(shared.PicPath);
    state["controls"] = Controls(card.controls());
    state["grid"] = GridCells(card.DocLines);
    state["progress"] = {{"frame", card.ProgressFrame.Width()},
                         {"fill", card.ProgressFill.Width()}};
    state["doc"] = Document(shared.Doc);
    state["accounts"] = {{"count", shared.Accounts.AccountCount},
                         {"loaded", shared.Accounts.AccountsLoaded},
                         {"current", Account(shared.Accounts.CurrentAccount)}};
    state["forms"] = Forms(shared);
    return state;
}

json StateJson::BuildFromDocument(const Card& card) {
    json state = Build(card);
    const dovrel::Document* document = card.document() ? &*card.document() : nullptr;
    for (const auto& [box, text] : DocumentView::HeaderTexts(document))
        state["controls"][(card.*box).name()] = Text(text);
    Grid lines(card.DocLines.name());
    DocumentView::FillLines(lines, document);
    state["grid"] = GridCells(lines);
    state["doc"] = Document(document ? ToCurrentDocument(*document) : CurrentDocument());
    return state;
}

// Every control but grids, whose cells are given on their own.
json StateJson::Controls(const std::vector<Control*>& list) {
    json controls = json::object();
    for (const Control* control : list)
        if (control->kind() != ControlKind::Grid)
            controls[control->name()] = ControlValue(*control);
    return controls;
}

// A form's grid is its only one, so its cells go with the other controls.
json StateJson::FormControls(const std::vector<Control*>& list) {
    json controls = json::object();
    for (const Control* control : list)
        controls[control->name()] = ControlValue(*control);
    return controls;
}

json StateJson::Forms(const ModuleState& shared) {
    json forms = json::object();
    for (const auto& [name, form] : shared.Forms)
        if (form)
            forms[name] = {{"visible", form->Visible()},
                           {"controls", FormControls(form->controls())},
                           {"selections", Selections(form->controls())}};
    return forms;
}

// Where the caret and the selection of each text box are.
json StateJson::Selections(const std::vector<Control*>& list) {
    json selections = json::object();
    for (const Control* control : list)
        if (control->kind() == ControlKind::TextBox) {
            const auto& box = static_cast<const TextBox&>(*control);
            selections[box.name()] = {{"start", box.SelStart()}, {"length", box.SelLength()}};
        }
    return selections;
}

json StateJson::Account(const AccountEntry& entry) {
    return {{"Key", Text(entry.Key)},
            {"Phone", Text(entry.Phone)},
            {"Details", Text(entry.Details)},
            {"District", Text(entry.District)}};
}

json StateJson::ControlValue(const Control& control) {
    switch (control.kind()) {
    case ControlKind::TextBox:
        return Text(static_cast<const TextBox&>(control).Text());
    case ControlKind::ComboBox:
        return static_cast<const ComboBox&>(control).ListIndex();
    case ControlKind::ListBox:
    case ControlKind::DriveList:
        return ListValue(static_cast<const ComboBox&>(control));
    case ControlKind::DirList:
        return Text(static_cast<const DirListBox&>(control).Path());
    case ControlKind::CheckBox:
        return static_cast<const CheckBox&>(control).Value();
    case ControlKind::Shape:
        return static_cast<const Shape&>(control).Width();
    case ControlKind::Grid:
        return GridCells(static_cast<const Grid&>(control));
    case ControlKind::Label:
    case ControlKind::Button:
        return Text(control.Caption());
    }
    return nullptr;
}

// A list the user picks from on a side form: its entries too, since a
// script cannot know them beforehand.
json StateJson::ListValue(const ComboBox& list) {
    json entries = json::array();
    for (int32_t i = 0; i < list.ListCount(); ++i)
        entries.push_back(Text(list.List(i)));
    json value = {{"index", list.ListIndex()}, {"entries", std::move(entries)}};
    if (list.kind() == ControlKind::ListBox)
        value["enabled"] = static_cast<const ListBox&>(list).Enabled();
    return value;
}

json StateJson::GridCells(const Grid& grid) {
    json rows = json::array();
    for (int32_t row = 0; row < grid.Rows(); ++row) {
        json cells = json::array();
        for (int32_t col = 0; col < grid.Cols(); ++col)
            cells.push_back(Text(grid.TextMatrix(row, col)));
        rows.push_back(std::move(cells));
    }
    return rows;
}

json StateJson::Document(const CurrentDocument& doc) {
    return {{"header", Header(doc.header)},
            {"lineCount", doc.lineCount},
            {"lines", Lines(doc)},
            {"amounts", Amounts(doc)}};
}

json StateJson::Header(const DocumentHeader& header) {
    json logical = json::array();
    json visual = json::array();
    for (size_t i = 0; i < header.remarksLogical.size(); ++i) {
        logical.push_back(Text(header.remarksLogical[i]));
        visual.push_back(Text(header.remarksVisual[i]));
    }
    return {{"type", header.type},
            {"totalBeforeDiscount", Number(header.totalBeforeDiscount)},
            {"foreignTotal", Number(header.foreignTotal)},
            {"discountPercent", Number(header.discountPercent)},
            {"warehouse", header.warehouse},
            {"customerVisual", Text(header.customerVisual)},
            {"address1Visual", Text(header.address1Visual)},
            {"address2Visual", Text(header.address2Visual)},
            {"remarksLogical", std::move(logical)},
            {"remarksVisual", std::move(visual)}};
}

json StateJson::Lines(const CurrentDocument& doc) {
    json lines = json::array();
    // The line count comes from a file; never trust it beyond the table.
    int count = std::clamp<int>(doc.lineCount, 0, kMaxDocLines);
    for (int i = 1; i <= count; ++i) {
        const DocumentLine& line = doc.lines[static_cast<size_t>(i)];
        lines.push_back({{"itemKey", Text(line.itemKey)},
                         {"catCode", Text(line.catCode)},
                         {"picFile", Text(line.picFile)},
                         {"foreignName", Text(line.foreignName)},
                         {"descriptionVisual", Text(line.descriptionVisual)}});
    }
    return lines;
}

json StateJson::Amounts(const CurrentDocument& doc) {
    json amounts = json::object();
    for (int n = 1; n <= kMaxDocLines; ++n) {
        const LineAmounts& entry = doc.amounts[static_cast<size_t>(n)];
        if (entry.isZero())
            continue;
        amounts[std::to_string(n)] = {{"price", Number(entry.price)},
                                      {"currency", entry.currency},
                                      {"quantity", Number(entry.quantity)},
                                      {"discount", Number(entry.discount)}};
    }
    return amounts;
}

json StateJson::Messages(const std::vector<RecordedMessages::Shown>& shown) {
    json list = json::array();
    for (const auto& message : shown) {
        const char* icon = message.icon == MsgIcon::Critical   ? "critical"
                           : message.icon == MsgIcon::Question ? "question"
                                                               : "information";
        list.push_back({{"icon", icon},
                        {"title", message.title.str()},
                        {"text", message.text.str()},
                        {"buttons", message.buttons == MsgButtons::Ok ? "ok" : "yesno"}});
    }
    return list;
}

json StateJson::Text(std::string_view cp1255) {
    return ToUtf8(cp1255).str();
}

json StateJson::Number(double value) {
    if (!std::isfinite(value))
        return nullptr;
    return value;
}

json StateJson::FromVariant(const Variant& value) {
    switch (value.kind()) {
    case Variant::Kind::Text:
        return Text(value.toText());
    case Variant::Kind::Number:
        return Number(value.toNumber());
    case Variant::Kind::Boolean:
        return value.toNumber() != 0;
    case Variant::Kind::Empty:
    case Variant::Kind::Null:
        break;
    }
    return nullptr;
}

std::string StateJson::Dump(const json& value, int indent) {
    return value.dump(indent, ' ', false, json::error_handler_t::replace);
}

} // namespace dovrel
