#pragma once

#include "fixfiles/CompanyFile.h"
#include "fixfiles/CurrentDocument.h"
#include "pages/PageFile.h"
#include "platform/Clock.h"
#include "platform/Grid.h"

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace dovrel {

// The page settings kept by the picture settings form, as typed there.
struct PageSettings {
    std::string logoFile;
    std::string compTitle;
    std::string picPath;
    std::string picX;
    std::string picY;
};

// What the control shows, as the page builders take it. Texts are code page
// 1255, as shown.
struct PageView {
    explicit PageView(const Grid& grid) : lines(grid) {}

    const Grid& lines;
    std::string title;
    std::string reference;
    std::string date;
    std::string customer, address1, address2;
    std::string totalVat, vatValue, total1;
    std::string rules;
    bool drawings = false;
    bool lineDiscount = false;
    bool details = false;
    bool showTotalFC = false;
};

// The two modes of the Hebrew page.
constexpr int16_t kPricedPage = 0;
constexpr int16_t kPageWithoutAmounts = 2;

struct PageContext {
    PageContext(const PageView& view, const CurrentDocument& doc, const PageSettings& settings,
                CivilDate today, int16_t mode = kPricedPage);

    const PageView& view;
    const CurrentDocument& doc;
    const PageSettings& settings;
    CivilDate today;
    // The Hebrew page's mode: 0 with amounts, 2 with a checkbox column
    // instead; any other mode has neither.
    int16_t mode = 0;
    // The item keys of the document's lines, trimmed: entry i - 1 is line i.
    std::vector<std::string_view> lineKeys;
};

// The Hebrew page of the document on display, right to left.
void WriteHebrewPage(PageFile& page, const PageContext& context);
// The English page, left to right, its totals computed from the lines.
void WriteEnglishPage(PageFile& page, const PageContext& context, bool useForeignNames,
                      const CompanyRecord& company);

// Where the footer link of the Hebrew page leads.
extern const char* const kMakerWebAddress;

} // namespace dovrel
