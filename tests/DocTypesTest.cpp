#include "fixfiles/DocTypes.h"

#include "TestCompany.h"

#include <gtest/gtest.h>

#include <tuple>

namespace dovrel {
namespace {

// The rows themselves are the table in the code; what can go wrong is the lookup.
TEST(DocTypesTest, CodesWithoutARowSelectTheFirstRow) {
    DocTypeTable docTypes;
    DocFileTable docFiles;
    InitDocTypes(docTypes, docFiles);
    for (int16_t code : {1, 20, 41})
        EXPECT_EQ(docTypes.at(size_t(DocTypeIndex(docTypes, code))).code, code);
    // 0 among them, although unfilled rows hold it.
    for (int16_t missing : {0, 8, 11, 24, 37, 42, -1, INT16_MAX})
        EXPECT_EQ(DocTypeIndex(docTypes, missing), 0) << missing;
}

TEST(DocTypesTest, ReuseLeavesNothingOfThePreviousContents) {
    DocTypeTable fresh, reused;
    DocFileTable freshFiles, reusedFiles;
    InitDocTypes(fresh, freshFiles);
    reused.fill({99, "x", "y", 3});
    reusedFiles.fill("junk");
    InitDocTypes(reused, reusedFiles);
    EXPECT_EQ(reusedFiles, freshFiles);
    auto fields = [](const DocTypeRow& r) {
        return std::tie(r.code, r.hebrewTitle, r.englishTitle, r.fileNumber);
    };
    for (int row = 0; row < kDocTypeRows; ++row)
        EXPECT_EQ(fields(reused[row]), fields(fresh[row])) << row;
}

} // namespace
} // namespace dovrel
