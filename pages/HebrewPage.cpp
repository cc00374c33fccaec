#include "pages/DocumentPage.h"

#include "fixfiles/Formats.h"
#include "pages/Html.h"
#include "pages/PageParts.h"

#include <cmath>
#include <string>

namespace dovrel {

using page::H;

const char* const kMakerWebAddress = "https://dovrel.example/";

namespace {

void WriteStyleAndCompany(PageFile& page, const PageContext& c) {
    page::WriteHead(page);
    page.line(
        "  TD{font-size:10pt; font-weight=200; color: '#000000';font-family: arial (Hebrew);}");
    page.line("  A {font-size:12pt;font-weight=600;text-decoration:'underline'; color:'#3300CC';}");
    page.line(
        "  A:hover{font-size:12pt;font-weight=600;text-decoration:'underline'; color:'#CC3300';}");
    page.line("  .TD1{font-size : 10pt; font-weight=600; color: #000000;}");
    page.line("  .TD1f{font-size : 10pt; font-weight=600; color: green;}");
    page.line("  .TD2{font-size : 10pt; font-weight=600; color: #000000;}");
    page.line("  .TD3{font-size : 12pt; font-weight=600; color: #000000;}");
    page.line("  .TD4{font-size : 16pt; font-weight=600; color: #000000;}");
    page.line("  .TD5{font-size : 10pt; font-weight=800; color: #000000;font-family: arial "
              "(Hebrew); background: #EBEBEB}");
    page.line("</STYLE>");
    page.line("</HEAD>");
    page.line("<BODY BGCOLOR='#FFFFFF'>");
    page.line(
        "<table cellspacing='0' cellpadding='0' border='0' align='center' width='100%' dir='rtl'>");
    if (!c.settings.logoFile.empty()) {
        page.line("<tr>");
        page.line("<td align='right' class=TD3>&nbsp;</td>");
        page.line("<td align='left'><img src='" + EscapeHtml(c.settings.logoFile) + "'></td>");
        page.line("</tr>");
    }
    page.line("<tr>");
    page.line("<td align='right' class=TD1>&nbsp;</td>");
    // The company title is the user's own page header, written as typed.
    page.line("<td align='left' class=TD1>" + c.settings.compTitle + "</td>");
    page.line("</tr>");
    page.line("</table>");
    page.line("<hr align='center' noshade size='1' width='100%'>");
}

void WriteHeading(PageFile& page, const PageContext& c) {
    page.line("<div align='left'>");
    page.line("<Font class=TD1>" + page::FormatToday(c.today, false, '/') + "</Font>");
    page.line("</div>");
    page.line("<div align='center'>");
    page.line("<Font class=TD4>" + EscapeHtml(c.view.reference) + "&nbsp;" +
              EscapeHtml(c.view.title) + "</Font>");
    page.line("<br>");
    page.line("<Font class=TD3>" + page::FormatShownDate(c.view.date, false, '/') + "&nbsp;" +
              H("תאריך הפקה") + "</Font>");
    page.line("</div>");
}

void WriteAddressee(PageFile& page, const PageContext& c) {
    const DocumentHeader& h = c.doc.header;
    page.line("<TABLE width='100%' border='0' cellspacing='0'>");
    page.line("<TR><TD width='10%'></TD>");
    page.line("    <TD width='20%'></TD>");
    page.line("    <TD width='60%'></TD>");
    page.line("    <TD width='10%'></TD>");
    page.line("</TR>");
    page.line("<TR>");
    page.line("<TD colspan='1' align='right' class=TD1>" + std::to_string(h.warehouse) + "</TD>");
    page.line(H("<TD align='left' class=TD1>: מחסן</TD>"));
    page.line("<TD colspan='1' align='right' class=TD1>" + AsIsTable(h.customerVisual) + "</TD>");
    page.line(H("<TD align='right' class=TD1>: לכבוד</TD>"));
    page.line("</TR>");
    page.line("<TR>");
    page.line("<TD colspan='3' align='right' class=TD1>" + AsIsTable(h.address1Visual) + "</TD>");
    page.line(H("<TD align='right' class=TD1>: כתובת</TD>"));
    page.line("</TR>");
    page.line("<TR>");
    page.line("<TD colspan='3' align='right' class=TD1>" + AsIsTable(h.address2Visual) + "</TD>");
    page.line("<TD align='right' class=TD1>&nbsp;</TD>");
    page.line("</TR>");
    page.line("<TR><TD colspan='4'>&nbsp;</TD></TR>");
    page.line("</TABLE>");
}

void WriteLinesHead(PageFile& page, const PageContext& c, bool priced) {
    auto head = [&page](const char* utf8Caption) {
        page.line("    <td align='right' class=TD5>" + H(utf8Caption) + "</td>");
    };
    page.line("<table rules='" + c.view.rules +
              "' width='100%' border='1' bordercolor='#000000' cellspacing='0'>");
    page.line("  <tr>");
    if (c.view.drawings)
        page.line("    <td width='" + EscapeHtml(c.settings.picX) + "' align='right' class=TD5>" +
                  H("שרטוט") + "</td>");
    if (priced) {
        head("סהכ שח");
        if (c.view.lineDiscount)
            head("%הנחה");
        head("מטבע");
        head("מחיר");
    }
    if (c.mode == kPageWithoutAmounts)
        head("נבדק");
    head("כמות");
    if (c.view.details)
        head("פרטים");
    head("תאור");
    head("פריט");
    head("שורה");
    page.line("  </tr>");
}

std::string DiscountCell(double discount) {
    std::string text = FormatFixed2(discount);
    return text == "0.00" ? "&nbsp;" : text;
}

void WriteLineRows(PageFile& page, const PageContext& c, bool priced) {
    const Grid& grid = c.view.lines;
    auto cell = [&page, &grid](int32_t row, int32_t col) {
        page.line(RightCell(EscapeHtml(grid.TextMatrix(row, col))));
    };
    int32_t last = page::LastLineRow(grid);
    for (int32_t r = 1; r <= last; ++r) {
        page.line("<tr>");
        if (c.view.drawings)
            page.line("<td align='right'>" + page::DrawingText(c, r) + "</td>");
        if (priced) {
            cell(r, 7);
            if (c.view.lineDiscount)
                page.line(RightCell(DiscountCell(page::AmountsOfRow(c, r).discount)));
            cell(r, 6);
            cell(r, 5);
        }
        if (c.mode == kPageWithoutAmounts) {
            page.line("<td align='right'><input type='checkbox' name='Sel" + std::to_string(r) +
                      "' value='0'></td>");
        }
        cell(r, 4);
        if (c.view.details)
            cell(r, 3);
        page.line(RightCell(AsIsTable(c.doc.lines[static_cast<size_t>(r)].descriptionVisual)));
        cell(r, 1);
        cell(r, 0);
        page.line("</tr>");
    }
    page.line("</table>");
    page.line("<br>");
}

void WriteTotalRow(PageFile& page, const std::string& valueCell, const std::string& labelCell) {
    page.line("<TR>");
    page.line(valueCell);
    page.line(labelCell);
    page.line("</TR>");
}

void WriteTotals(PageFile& page, const PageContext& c) {
    const DocumentHeader& h = c.doc.header;
    auto value = [](const std::string& text) {
        return "<TD align='right' class=TD1>" + text + "</TD>";
    };
    auto label = [](const char* utf8) {
        return "<TD align='right' class=TD5>" + H(utf8) + "</TD>";
    };
    page.line("<TABLE rules='rows' align='left' width='100%' border='1' bordercolor='#000000' "
              "cellspacing='0'>");
    WriteTotalRow(page, value(FormatAmount(h.totalBeforeDiscount)), label(": סהכ לפני הנחה"));
    WriteTotalRow(page, value(FormatAmount(h.discountPercent * h.totalBeforeDiscount / 100.0)),
                  H("<TD dir='ltr' align='right' class=TD5>הנחה : %") +
                      FormatFixed2(h.discountPercent) + "</TD>");
    WriteTotalRow(page, value(EscapeHtml(c.view.totalVat)), label(": סהכ"));
    if (c.view.showTotalFC && std::fabs(h.foreignTotal) > 0.01 &&
        std::fabs(h.foreignTotal - h.totalBeforeDiscount) > 1.0)
        WriteTotalRow(page,
                      "<TD align='right' class=TD1f>" + FormatAmount(h.foreignTotal) + "</TD>",
                      label(": סהכ מטח"));
    WriteTotalRow(page, value(EscapeHtml(c.view.vatValue)), label(": מעמ"));
    WriteTotalRow(page, value(EscapeHtml(c.view.total1)), label(": סהכ כולל מעמ"));
    page.line("</TABLE>");
}

void WriteBottom(PageFile& page, const PageContext& c, bool priced) {
    page.line("<TABLE align='left' width='100%' border='0' cellspacing='0'>");
    page.line("<TR><TD width='30%'>");
    if (priced)
        WriteTotals(page, c);
    page.line("</TD><TD width='70%'>");
    page.line("<TABLE align='right' width='100%' border='0' cellspacing='0'>");
    for (const std::string& remark : c.doc.header.remarksVisual) {
        page.line("<TR>");
        page.line("<TD align='right' class=TD1>" + AsIsTable(remark) + "</TD>");
        page.line("</TR>");
    }
    page.line("</TABLE>");
    page.line("</TD></TR></TABLE>");
    page.line("<br><br><br><br><br><br><br>");
    page.line("<hr align='center' noshade size='1' width='100%'>");
    page.line("<br><br>");
    page.line("");
    page.line(std::string("<p align='center'><A HREF='") + kMakerWebAddress + "'>" +
              H("<font size='2'>טברין מערכות מידע</font></A></p>"));
    page.line("</BODY>");
    page.line("</HTML>");
}

} // namespace

void WriteHebrewPage(PageFile& page, const PageContext& context) {
    bool priced = context.mode == kPricedPage;
    WriteStyleAndCompany(page, context);
    WriteHeading(page, context);
    WriteAddressee(page, context);
    WriteLinesHead(page, context, priced);
    WriteLineRows(page, context, priced);
    WriteBottom(page, context, priced);
}

} // namespace dovrel
