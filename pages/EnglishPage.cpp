#include "pages/DocumentPage.h"

#include "fixfiles/Formats.h"
#include "fixfiles/TextDecoding.h"
#include "pages/Html.h"
#include "pages/PageParts.h"

#include <string>

namespace dovrel {

namespace {

void WriteStyleAndCompany(PageFile& page, const PageContext& c) {
    page::WriteHead(page);
    page.line("  TD{font-size:10pt; font-weight=200; color: '#000000';font-family: Arial;}");
    page.line("  A {font-size:12pt;font-weight=600;text-decoration:'underline'; color:'#3300CC';}");
    page.line(
        "  A:hover{font-size:12pt;font-weight=600;text-decoration:'underline'; color:'#CC3300';}");
    page.line("  .TD1{font-size : 10pt; font-weight=600; color: '#000000';}");
    page.line("  .TD2{font-size : 10pt; font-weight=600; color: '#000000';}");
    page.line("  .TD3{font-size : 12pt; font-weight=600; color: '#000000';}");
    page.line("  .TD4{font-size : 16pt; font-weight=600; color: '#000000';}");
    // The heading and label cells stand on black: their white is written
    // without quotes, which today's browsers drop, leaving black on black.
    page.line("  .TD5{font-size : 10pt; font-weight=800; color: white;font-family: Arial;}");
    page.line("</STYLE>");
    page.line("</HEAD>");
    page.line("<BODY BGCOLOR='#FFFFFF'>");
    page.line("<table cellspacing='0' cellpadding='0' border='0' align='center' width='100%'>");
    if (!c.settings.logoFile.empty()) {
        page.line("<tr>");
        page.line("<td align='left'><img src='" + EscapeHtml(c.settings.logoFile) + "'></td>");
        page.line("<td align='right' class=TD3>&nbsp;</td>");
        page.line("</tr>");
    }
    page.line("<tr>");
    page.line("<td align='left' class=TD2>" + c.settings.compTitle + "</td>");
    page.line("<td align='right' class=TD3>&nbsp;</td>");
    page.line("</tr>");
    page.line("</table>");
    page.line("<hr align='center' noshade size='1' width='100%'>");
}

void WriteHeading(PageFile& page, const PageContext& c) {
    page.line("<div align='right'>");
    page.line("<Font class=TD1>" + page::FormatToday(c.today, true, '-') + "</Font>");
    page.line("</div>");
    page.line("<div align='center'>");
    page.line("<Font class=TD4>" + EscapeHtml(c.view.title) + "&nbsp;" +
              EscapeHtml(c.view.reference) + "</Font>");
    page.line("<br>");
    page.line("<Font class=TD3>Date Produced:&nbsp;" +
              page::FormatShownDate(c.view.date, true, '/') + "</Font>");
    page.line("</div>");
}

void WriteAddressee(PageFile& page, const PageContext& c) {
    auto row = [&page](const char* label, const std::string& value) {
        page.line("<TR>");
        page.line(std::string("<TD align='left' class=TD1>") + label + "</TD>");
        page.line("<TD colspan='3' align='left' class=TD1>" + EscapeHtml(value) + "</TD>");
        page.line("</TR>");
    };
    page.line("<TABLE width='100%' border='0' cellspacing='0'>");
    page.line("<TR><TD width='10%'></TD>");
    page.line("    <TD width='30%'></TD>");
    page.line("    <TD width='50%'></TD>");
    page.line("    <TD width='10%'></TD>");
    page.line("</TR>");
    row("To: ", c.view.customer);
    row("Address:", c.view.address1);
    row("&nbsp;", c.view.address2);
    page.line("<TR><TD colspan='4'>&nbsp;</TD></TR>");
    page.line("</TABLE>");
}

void WriteLinesHead(PageFile& page, const PageContext& c) {
    page.line("<table rules='" + c.view.rules +
              "' width='100%' border='1' bordercolor='#000000' cellspacing='0'>");
    page.line("  <tr bgcolor='black'>");
    page.line("    <td align='left' class=TD5>Line</td>");
    page.line("    <td align='left' class=TD5>Item</td>");
    page.line("    <td align='left' class=TD5>Description</td>");
    page.line(c.view.details ? "    <td align='left' class=TD5>Details</td>"
                             : "    <td align='left' class=TD5>&nbsp;</td>");
    page.line("    <td align='center' class=TD5>Qty.</td>");
    page.line("    <td align='center' class=TD5>Price</td>");
    page.line("    <td align='left' class=TD5>Coin</td>");
    page.line("    <td align='center' class=TD5>Total</td>");
    if (c.view.drawings)
        page.line("    <td width='" + EscapeHtml(c.settings.picX) +
                  "' align='center' class=TD5>Drawing</td>");
    page.line("  </tr>");
}

bool DescriptionFromGrid(uint8_t type) {
    return type == 6 || type == 32 || type == 35;
}

std::string Description(const PageContext& c, int32_t row, bool useForeignNames) {
    const std::string& shown = c.view.lines.TextMatrix(row, 2);
    if (DescriptionFromGrid(c.doc.header.type) || !useForeignNames)
        return shown;
    const DocumentLine* line = page::LineOfRow(c, row);
    std::string foreign = line != nullptr ? TrimCopy(line->foreignName) : std::string();
    return foreign.empty() ? shown : foreign;
}

void WriteCell(PageFile& page, const char* align, const std::string& text) {
    page.line(std::string("<td valign='top' align='") + align + "'>" +
              (text.empty() ? std::string("&nbsp;") : text) + "</td>");
}

// Writes the line rows and gives the sum of the line totals.
double WriteLineRows(PageFile& page, const PageContext& c, bool useForeignNames,
                     const CompanyRecord& company) {
    const Grid& grid = c.view.lines;
    double sum = 0;
    int32_t last = page::LastLineRow(grid);
    for (int32_t r = 1; r <= last; ++r) {
        const LineAmounts& amounts = page::AmountsOfRow(c, r);
        page.line("<tr>");
        for (int32_t col = 0; col < grid.Cols(); ++col) {
            std::string text;
            const char* align = "left";
            switch (col) {
            case 2:
                text = EscapeHtml(Description(c, r, useForeignNames));
                break;
            case 3:
                text = c.view.details ? EscapeHtml(grid.TextMatrix(r, 3)) : "";
                break;
            case 4:
            case 5:
                text = EscapeHtml(grid.TextMatrix(r, col));
                align = "right";
                break;
            case 6:
                text = EscapeHtml(CurrencyNames(amounts.currency, company).second);
                break;
            case 7:
                align = "right";
                if (amounts.quantity > 0) {
                    double total =
                        amounts.quantity * amounts.price * (100 - amounts.discount) / 100;
                    text = FormatAmount(total);
                    sum += total;
                }
                break;
            default:
                text = EscapeHtml(grid.TextMatrix(r, col));
                break;
            }
            WriteCell(page, align, text);
        }
        if (c.view.drawings)
            page.line("<td align='right'>" + page::DrawingText(c, r) + "</td>");
        page.line("</tr>");
    }
    page.line("</table>");
    page.line("<br>");
    return sum;
}

void WriteTotals(PageFile& page, double discountPercent, double sum) {
    double d = discountPercent > -1 && discountPercent < 1 ? 0 : discountPercent;
    auto row = [&page](const char* label, const std::string& value) {
        page.line("<TR>");
        page.line(std::string("<TD bgcolor='black' align='left' class=TD5>") + label + "</TD>");
        page.line("<TD align='right' class=TD1>" + value + "</TD>");
        page.line("</TR>");
    };
    page.line("<TABLE rules='rows' align='right' width='100%' border='1' bordercolor='#000000' "
              "cellspacing='0'>");
    row("Total before Discount:", FormatAmount(sum));
    row("Discount:", FormatAmount(d * sum / 100));
    row("Total:", FormatAmount((100 - d) * sum / 100));
    row("Vat:", " 0 ");
    row("Final Total:", FormatAmount((100 - d) * sum / 100));
}

void WriteBottom(PageFile& page, const PageContext& c, double sum) {
    page.line("<TABLE align='right' width='100%' border='0' cellspacing='0'>");
    page.line("<TR><TD width='60%'>");
    page.line("<TABLE align='left' width='100%' border='0' cellspacing='0'>");
    for (const std::string& remark : c.doc.header.remarksLogical) {
        page.line("<TR>");
        page.line("<TD align='left' class=TD1>" + EscapeHtml(remark) + "</TD>");
        page.line("</TR>");
    }
    page.line("</TABLE>");
    page.line("</TD><TD width='40%'>");
    WriteTotals(page, c.doc.header.discountPercent, sum);
    page.line("</TABLE>");
    page.line("</TD></TR></TABLE>");
    page.line("<br><br><br><br><br><br><br>");
    page.line("<hr align='center' noshade size='1' width='100%'>");
    page.line("<br><br>");
    page.line("</BODY>");
    page.line("</HTML>");
}

} // namespace

void WriteEnglishPage(PageFile& page, const PageContext& context, bool useForeignNames,
                      const CompanyRecord& company) {
    WriteStyleAndCompany(page, context);
    WriteHeading(page, context);
    WriteAddressee(page, context);
    WriteLinesHead(page, context);
    double sum = WriteLineRows(page, context, useForeignNames, company);
    WriteBottom(page, context, sum);
}

} // namespace dovrel
