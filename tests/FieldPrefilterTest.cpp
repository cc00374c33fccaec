// The prefilter may only pass over fields that cannot match once decoded.

#include "fixfiles/FieldPrefilter.h"

#include "TestCompany.h"
#include "fixfiles/TextDecoding.h"

#include <gtest/gtest.h>

#include <random>
#include <string>

namespace dovrel {
namespace {

using test::W;

// Stored fields as the accounting system may hold them: DOS Hebrew letters,
// Latin letters of both cases, digits, punctuation, spaces, and bytes that
// are already code page 1255 letters.
std::string RandomField(std::mt19937& random, size_t width) {
    static const std::string alphabet =
        std::string("aAbBzZ09 -.()'\"/*#") + "\x80\x85\x9A" + "\xE0\xEA\xFA";
    std::string field;
    for (size_t i = 0; i < width; ++i)
        field.push_back(alphabet[random() % alphabet.size()]);
    return field;
}

std::string FlipLatinCase(std::string text) {
    for (char& c : text)
        if ((c | 0x20) >= 'a' && (c | 0x20) <= 'z')
            c = static_cast<char>(c ^ 0x20);
    return text;
}

TEST(FieldPrefilterTest, NeverPassesOverAFieldThatMatches) {
    std::mt19937 random(42);
    for (int round = 0; round < 20000; ++round) {
        std::string field = RandomField(random, 1 + random() % 14);
        std::string decoded = TrimCopy(LogicalText(field));
        std::string wanted = round % 2 ? FlipLatinCase(decoded) : decoded;
        ASSERT_TRUE(FieldPrefilter(wanted).mayEqual(field)) << field;
        size_t start = decoded.empty() ? 0 : random() % decoded.size();
        std::string part = FlipLatinCase(decoded.substr(start, random() % 6));
        ASSERT_TRUE(FieldPrefilter(part).mayContain(field)) << field << " / " << part;
    }
}

TEST(FieldPrefilterTest, PassesOverFieldsThatCannotMatch) {
    // The stored field is in visual order and DOS Hebrew code.
    std::string stored = sample::StoredText("משה כהן KB-12", 30);
    for (auto [part, may] :
         {std::pair{"כהן", true}, {"kb-1", true}, {"לוי", false}, {"KB-13", false}})
        EXPECT_EQ(FieldPrefilter(W(part)).mayContain(stored), may) << part;

    std::string key = sample::StoredText("KB-1042", 12);
    // "KB-104" has a digit less, "KB+1042" a character the field lacks.
    for (auto [text, may] :
         {std::pair{"kb-1042", true}, {"KB-104", false}, {"KB-1043", false}, {"KB+1042", false}})
        EXPECT_EQ(FieldPrefilter(text).mayEqual(key), may) << text;

    // An empty text is contained in every field, and equals a blank one.
    EXPECT_TRUE(FieldPrefilter("").mayContain(key));
    EXPECT_TRUE(FieldPrefilter("").mayEqual(std::string(12, ' ')));
}

} // namespace
} // namespace dovrel
