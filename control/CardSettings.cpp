// Saving the control's settings to the settings store and loading them back.
#include "control/Card.h"

#include "platform/SettingsBinding.h"
#include "platform/SettingsStore.h"

#include <string>

namespace dovrel {

namespace {

enum PropertyKind : uint8_t { kText = 1, kListIndex = 2, kValue = 3 };

} // namespace

void Card::SetGetRegParam(uint8_t Action, const std::string& AppName, const std::string& Section,
                          const std::string& Key, Control& Ctl, uint8_t Kind,
                          const Variant& Default) {
    BindSetting(services_.settings, Action, AppName, Section, Key, Ctl, Kind, Default);
}

void Card::SetGetRegParams(uint8_t& Action) {
    struct Row {
        const char* key;
        Control& control;
        uint8_t kind;
        Variant defaultValue;
    };
    const Row rows[] = {
        {"CompPath", txtCompPath, kText, Variant("c:\\comp02")},
        {"DocType", cmbDocType, kListIndex, Variant(1)},
        {"Title", txtTitle, kText, Variant("")},
        {"WithDrawing", ChkWithDrawing, kValue, Variant(0)},
        {"DocLang", CmbDocLang, kListIndex, Variant(1)},
        {"UseFname", ChkUseFName, kValue, Variant(0)},
        {"LineDisc", chkLineDisc, kValue, Variant(0)},
        {"ShowDetails", ChkShowDetails, kValue, Variant(1)},
        {"ShowTotalFC", ChkShowTotalFC, kValue, Variant(0)},
        {"Rules", cmbRules, kListIndex, Variant(0)},
        {"FromDate", txtFromDate, kText, Variant("01/01/1980")},
    };
    for (const Row& row : rows)
        SetGetRegParam(Action, shared_.AppName, "Params", row.key, row.control, row.kind,
                       row.defaultValue);
    readingOrderSetting(Action);
}

// The screen's reading order is kept after the eleven, under its own name.
void Card::readingOrderSetting(uint8_t Action) {
    if (Action == 1) {
        services_.settings.SaveSetting(shared_.AppName, "Params", "ReadingOrder",
                                       std::to_string(ReadingOrder()));
    } else if (Action == 2) {
        Variant stored(services_.settings.GetSetting(shared_.AppName, "Params", "ReadingOrder",
                                                     std::to_string(ReadingOrder())));
        setReadingOrder(stored.toInt16());
    }
}

} // namespace dovrel
