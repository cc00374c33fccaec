#pragma once

#include <array>
#include <cstdint>
#include <string>

namespace dovrel {

// The accounting system's document types and the files that hold them.
struct DocTypeRow {
    int16_t code = 0;
    std::string hebrewTitle; // code page 1255
    std::string englishTitle;
    int16_t fileNumber = 0; // index into DocFiles; 0 names no file
};

constexpr int kDocTypeRows = 42; // rows 0 to 41; 26 are filled
constexpr int kFilledDocTypes = 26;

using DocTypeTable = std::array<DocTypeRow, kDocTypeRows>;
using DocFileTable = std::array<std::string, 5>; // slot 0 stays empty

// Fills both tables with the system's fixed values.
void InitDocTypes(DocTypeTable& docTypes, DocFileTable& docFiles);

// The first filled row whose code equals the argument, or 0 when none does.
int16_t DocTypeIndex(const DocTypeTable& docTypes, int16_t code);

} // namespace dovrel
