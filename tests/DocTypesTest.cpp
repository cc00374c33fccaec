#include "fixfiles/DocTypes.h"

#include "TestCompany.h"

#include <gtest/gtest.h>

namespace dovrel {
namespace {

using test::W;

class DocTypesTest : public ::testing::Test {
protected:
    void SetUp() override { InitDocTypes(docTypes, docFiles); }

    std::string DocPath(const std::string& compDir, int row) const {
        return compDir + docFiles.at(static_cast<size_t>(docTypes.at(row).fileNumber));
    }

    DocTypeTable docTypes;
    DocFileTable docFiles;
};

TEST_F(DocTypesTest, IndexOfACode) {
    EXPECT_EQ(DocTypeIndex(docTypes, 20), 13);
    EXPECT_EQ(DocTypeIndex(docTypes, 1), 0);
    EXPECT_EQ(DocTypeIndex(docTypes, 41), 25);
    EXPECT_EQ(DocTypeIndex(docTypes, 36), 23);
    // Codes without a row select the first row.
    for (int16_t missing : {0, 8, 11, 13, 16, 24, 29, 37, 39, 42, -1, INT16_MAX}) {
        EXPECT_EQ(DocTypeIndex(docTypes, missing), 0) << missing;
    }
    // Every filled row is found by its own code.
    for (int16_t row = 0; row < kFilledDocTypes; ++row) {
        EXPECT_EQ(DocTypeIndex(docTypes, docTypes[row].code), row);
    }
}

TEST_F(DocTypesTest, FilesOfTheRows) {
    EXPECT_EQ(docFiles[0], "");
    EXPECT_EQ(DocPath("c:\\comp02", 13), "c:\\comp02\\ISHP.FIX");
    EXPECT_EQ(DocPath("c:\\comp02", 24), "c:\\comp02\\IBD.FIX");
    EXPECT_EQ(DocPath("c:\\comp02", 0), "c:\\comp02\\IMV.FIX");
    EXPECT_EQ(DocPath("c:\\comp02", 17), "c:\\comp02\\IORDR.FIX");
    for (int row = 0; row < kFilledDocTypes; ++row) {
        EXPECT_GE(docTypes[row].fileNumber, 1);
        EXPECT_LE(docTypes[row].fileNumber, 4);
    }
}

TEST_F(DocTypesTest, TitlesAreCodePage1255) {
    EXPECT_EQ(docTypes[13].hebrewTitle, W("תעודת משלוח"));
    EXPECT_EQ(docTypes[13].englishTitle, "Delivery Note");
    EXPECT_EQ(docTypes[2].hebrewTitle, W("חשבונית  סוכן"));
    EXPECT_EQ(docTypes[2].hebrewTitle, "\xE7\xF9\xE1\xE5\xF0\xE9\xFA  \xF1\xE5\xEB\xEF");
    EXPECT_EQ(docTypes[9].hebrewTitle, W("העברות בין מחסנים - כניסה"));
    EXPECT_EQ(docTypes[20].englishTitle, "Lay-Bye Invoice");
    EXPECT_EQ(docTypes[25].code, 41);
    EXPECT_EQ(docTypes[25].englishTitle, "Purchase Quotation");
}

TEST_F(DocTypesTest, UnfilledRowsAreEmptyEvenAfterReuse) {
    DocTypeTable reused;
    DocFileTable reusedFiles;
    reused.fill({99, "x", "y", 3});
    reusedFiles.fill("junk");
    InitDocTypes(reused, reusedFiles);
    EXPECT_EQ(reusedFiles, docFiles);
    for (int row = kFilledDocTypes; row < kDocTypeRows; ++row) {
        EXPECT_EQ(reused[row].code, 0);
        EXPECT_EQ(reused[row].hebrewTitle, "");
        EXPECT_EQ(reused[row].englishTitle, "");
        EXPECT_EQ(reused[row].fileNumber, 0);
    }
    for (int row = 0; row < kFilledDocTypes; ++row) {
        EXPECT_EQ(reused[row].hebrewTitle, docTypes[row].hebrewTitle);
        EXPECT_NE(reused[row].code, 0);
    }
}

} // namespace
} // namespace dovrel
