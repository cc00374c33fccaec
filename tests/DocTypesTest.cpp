#include "fixfiles/DocTypes.h"

#include "TestCompany.h"

#include <gtest/gtest.h>

#include <tuple>

namespace dovrel {
namespace {

TEST(DocTypesTest, IndexOfACodeAndTheFileOfItsRow) {
    DocTypeTable docTypes;
    DocFileTable docFiles;
    InitDocTypes(docTypes, docFiles);
    EXPECT_EQ(DocTypeIndex(docTypes, 20), 13);
    EXPECT_EQ(DocTypeIndex(docTypes, 36), 23);
    EXPECT_EQ(DocTypeIndex(docTypes, 41), 25);
    // Codes without a row, 0 among them although unfilled rows hold it, select the first row.
    for (int16_t missing : {0, 8, 11, 24, 37, 42, -1, INT16_MAX})
        EXPECT_EQ(DocTypeIndex(docTypes, missing), 0) << missing;
    auto file = [&](int row) { return docFiles.at(size_t(docTypes.at(row).fileNumber)); };
    EXPECT_EQ(file(13), "\\ISHP.FIX");
    EXPECT_EQ(file(24), "\\IBD.FIX");
    EXPECT_EQ(file(0) + file(17), "\\IMV.FIX\\IORDR.FIX");
    EXPECT_EQ(docTypes[13].hebrewTitle, test::W("תעודת משלוח")); // code page 1255, not UTF-8
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
