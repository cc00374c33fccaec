#pragma once

#include "platform/Variant.h"

#include <string>
#include <vector>

namespace dovrel {

class Card;

// The control's automation interface: its members in their fixed order, with
// the kinds of their parameters, and a late-bound call by name that converts
// the host's values to those kinds the way the host's automation would.
class CardInterface {
public:
    enum class Type { Int16, Int32, Byte, Boolean, Text, Variant, None };

    struct Param {
        const char* name;
        Type type;
        bool byRef;
    };

    struct Member {
        const char* name;
        bool isProperty;
        // A property's type, or a method's result (None for no result).
        Type type;
        std::vector<Param> params;
    };

    // The members, numbered from 1 in this order.
    static const std::vector<Member>& Members();
    // The member of that name (letter case ignored), or nullptr.
    static const Member* Find(const std::string& name);

    // Calls a member by name. A property with no argument is read and with one
    // argument is assigned; a method takes exactly its parameters. Arguments
    // are converted to the parameter kinds; a wrong count, an unknown name or
    // a value that does not convert is an Error. By-reference arguments are
    // passed as copies: the control changes none of them.
    static Variant Invoke(Card& card, const std::string& name, const std::vector<Variant>& args);
};

} // namespace dovrel
