#include "control/CardInterface.h"

#include "control/Card.h"
#include "fixfiles/TextDecoding.h"
#include "platform/Error.h"

#include <functional>
#include <map>

namespace dovrel {

namespace {

using Type = CardInterface::Type;
using Args = std::vector<Variant>;
using Call = std::function<Variant(Card&, const Args&)>;

Variant Number(double value) {
    return Variant(value);
}

// Property accessors: no argument reads, one assigns.
Call Property(std::function<Variant(Card&)> get, std::function<void(Card&, const Variant&)> let) {
    return [get, let](Card& card, const Args& args) {
        if (args.empty())
            return get(card);
        let(card, args[0]);
        return Variant();
    };
}

std::map<std::string, Call> MakeCalls() {
    std::map<std::string, Call> calls;
    calls["PubACTLocation"] =
        Property([](Card& c) { return Number(c.PubACTLocation); },
                 [](Card& c, const Variant& v) { c.PubACTLocation = v.toInt32(); });
    calls["PubPrevLocation"] =
        Property([](Card& c) { return Number(c.PubPrevLocation); },
                 [](Card& c, const Variant& v) { c.PubPrevLocation = v.toInt32(); });
    calls["PubSearchBy"] = Property([](Card& c) { return Variant(c.PubSearchBy); },
                                    [](Card& c, const Variant& v) { c.PubSearchBy = v.toText(); });
    calls["PubSearchValue"] = Property([](Card& c) { return c.PubSearchValue; },
                                       [](Card& c, const Variant& v) { c.PubSearchValue = v; });
    calls["SetAccountKey"] = Property([](Card& c) { return c.SetAccountKey(); },
                                      [](Card& c, const Variant& v) { c.SetAccountKey(v); });
    calls["SetCompDir"] = Property([](Card& c) { return c.SetCompDir(); },
                                   [](Card& c, const Variant& v) { c.SetCompDir(v); });
    calls["ACTLocation"] = Property([](Card& c) { return c.ACTLocation(); },
                                    [](Card& c, const Variant& v) { c.ACTLocation(v); });
    calls["CompanyTitle"] = Property([](Card& c) { return c.CompanyTitle(); },
                                     [](Card& c, const Variant& v) { c.CompanyTitle(v); });
    calls["DBPath"] = Property([](Card& c) { return c.DBPath(); },
                               [](Card& c, const Variant& v) { c.DBPath(v); });
    calls["PicPath"] = Property([](Card& c) { return c.PicPath(); },
                                [](Card& c, const Variant& v) { c.PicPath(v); });
    calls["InitCmbDocType"] = [](Card& c, const Args&) {
        c.InitCmbDocType();
        return Variant();
    };
    calls["InitDocLines"] = [](Card& c, const Args&) {
        c.InitDocLines();
        return Variant();
    };
    calls["ReadStock"] = [](Card& c, const Args& a) {
        int16_t row = a[1].toInt16();
        std::string by = a[2].toText(), from = a[4].toText(), date = a[5].toText();
        Variant value = a[3];
        return Number(c.ReadStock(a[0].toText(), row, by, value, from, date));
    };
    calls["CreateHTML"] = [](Card& c, const Args& a) {
        std::string file = a[0].toText();
        int16_t format = a[1].toInt16();
        c.CreateHTML(file, format);
        return Variant();
    };
    calls["ShowDoc"] = [](Card& c, const Args& a) {
        int16_t type = a[1].toInt16();
        int32_t start = a[2].toInt32();
        return Number(c.ShowDoc(a[0].toText(), type, start));
    };
    calls["SetParams"] = [](Card& c, const Args& a) {
        int16_t type = a[1].toInt16();
        int32_t start = a[2].toInt32();
        std::string db = a[3].toText(), pics = a[4].toText();
        return Number(c.SetParams(a[0].toText(), type, start, db, pics));
    };
    calls["ReadITM"] = [](Card& c, const Args& a) {
        std::string path = a[0].toText();
        return c.ReadITM(path);
    };
    calls["FillPicPath"] = [](Card& c, const Args& a) {
        std::string db = a[0].toText();
        c.FillPicPath(db);
        return Variant();
    };
    calls["CreateHTMLEng"] = [](Card& c, const Args& a) {
        std::string file = a[0].toText();
        bool foreign = a[1].toBool();
        c.CreateHTMLEng(file, foreign);
        return Variant();
    };
    calls["SetGetRegParams"] = [](Card& c, const Args& a) {
        uint8_t action = a[0].toByte();
        c.SetGetRegParams(action);
        return Variant();
    };
    calls["CreateAsIs"] = [](Card& c, const Args& a) {
        std::string text = a[0].toText();
        return Variant(c.CreateAsIs(text));
    };
    calls["ReadACT"] = [](Card& c, const Args& a) {
        std::string path = a[0].toText();
        return c.ReadACT(path);
    };
    calls["WriteCell"] = [](Card& c, const Args& a) {
        int16_t number = a[0].toInt16();
        std::string value = a[1].toText();
        c.WriteCell(number, value);
        return Variant();
    };
    calls["RulesValue"] = [](Card& c, const Args&) { return Variant(c.RulesValue()); };
    calls["ReadingOrder"] =
        Property([](Card& c) { return Number(c.ReadingOrder()); },
                 [](Card& c, const Variant& v) { c.setReadingOrder(v.toInt16()); });
    return calls;
}

} // namespace

const std::vector<CardInterface::Member>& CardInterface::Members() {
    static const std::vector<Member> members = {
        {"PubACTLocation", true, Type::Int32, {}},
        {"PubPrevLocation", true, Type::Int32, {}},
        {"PubSearchBy", true, Type::Text, {}},
        {"PubSearchValue", true, Type::Variant, {}},
        {"SetAccountKey", true, Type::Variant, {}},
        {"SetCompDir", true, Type::Variant, {}},
        {"ACTLocation", true, Type::Variant, {}},
        {"InitCmbDocType", false, Type::None, {}},
        {"InitDocLines", false, Type::None, {}},
        {"ReadStock",
         false,
         Type::Int32,
         {{"pCompPath", Type::Text, false},
          {"pWizFile", Type::Int16, true},
          {"pSearchBy", Type::Text, true},
          {"pSearchValue", Type::Variant, true},
          {"pStartFrom", Type::Text, true},
          {"pFromDate", Type::Text, true}}},
        {"CreateHTML",
         false,
         Type::None,
         {{"pFileName", Type::Text, true}, {"pDocFormat", Type::Int16, true}}},
        {"CompanyTitle", true, Type::Variant, {}},
        {"ShowDoc",
         false,
         Type::Int32,
         {{"pCompPath", Type::Text, false},
          {"pWizFile", Type::Int16, true},
          {"pStartPosition", Type::Int32, true}}},
        {"DBPath", true, Type::Variant, {}},
        {"SetParams",
         false,
         Type::Int32,
         {{"pCompPath", Type::Text, false},
          {"pWizFile", Type::Int16, true},
          {"pStartPosition", Type::Int32, true},
          {"pDBPath", Type::Text, true},
          {"pPicPath", Type::Text, true}}},
        {"PicPath", true, Type::Variant, {}},
        {"ReadITM", false, Type::Variant, {{"CompPath", Type::Text, true}}},
        {"FillPicPath", false, Type::None, {{"pDbName", Type::Text, true}}},
        {"CreateHTMLEng",
         false,
         Type::None,
         {{"pFileName", Type::Text, true}, {"pUseFName", Type::Boolean, true}}},
        {"SetGetRegParams", false, Type::None, {{"Action", Type::Byte, true}}},
        {"CreateAsIs", false, Type::Text, {{"pText", Type::Text, true}}},
        {"ReadACT", false, Type::Variant, {{"CompPath", Type::Text, true}}},
        {"WriteCell",
         false,
         Type::None,
         {{"MyNum", Type::Int16, true}, {"CellValue", Type::Text, true}}},
        {"RulesValue", false, Type::Text, {}},
        // Added after the original members: the screen's reading order.
        {"ReadingOrder", true, Type::Int16, {}},
    };
    return members;
}

const CardInterface::Member* CardInterface::Find(const std::string& name) {
    for (const Member& member : Members())
        if (EqualsNoCase(member.name, name))
            return &member;
    return nullptr;
}

Variant CardInterface::Invoke(Card& card, const std::string& name, const Args& args) {
    static const std::map<std::string, Call> calls = MakeCalls();
    const Member* member = Find(name);
    if (member == nullptr)
        throw Error("Unknown member: " + name);
    size_t expected = member->params.size();
    if (member->isProperty ? args.size() > 1 : args.size() != expected)
        throw Error(std::string(member->name) + " takes " +
                    (member->isProperty ? "no argument (get) or one (let)"
                                        : std::to_string(expected) + " arguments") +
                    ", got " + std::to_string(args.size()));
    return calls.at(member->name)(card, args);
}

} // namespace dovrel
