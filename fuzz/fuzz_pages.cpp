// The printed pages of whatever document the reader accepts from an
// arbitrary document file. The input starts with one options byte:
//   bit 0 drawings, bit 1 line discount, bit 2 details, bit 3 foreign-
//   currency total, bits 4-5 the rules list position (0 to 3), bit 6 the
//   Hebrew page without amounts, bit 7 the English page's foreign names;
// the rest is written as ISHP.FIX in a private directory. Both pages are
// built for the first delivery note found; none of the file's text may
// reach a page as markup.

#include "FuzzSupport.h"

#include "control/Card.h"
#include "control/ModuleState.h"
#include "platform/Error.h"
#include "platform/Messages.h"

#include <fstream>
#include <iterator>

using namespace dovrel;
using dovrel::fuzz::Bytes;
using dovrel::fuzz::Require;

namespace {

std::string ReadPage(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// The page was written whole and carries no markup from the document: the
// pages' own tags never include these.
void CheckPage(const std::string& page) {
    Require(page.size() >= 9 && page.compare(page.size() - 9, 9, "</HTML>\r\n") == 0,
            "a page is written whole");
    for (const char* tag : {"<script", "<SCRIPT", "<iframe", "<a ", "<b>", "\"", "<1"})
        Require(page.find(tag) == std::string::npos, "document text reaches the page escaped");
}

void Build(Card& card, const std::string& page, bool english, int16_t mode, bool useFName) {
    std::string path = page;
    try {
        if (english)
            card.CreateHTMLEng(path, useFName);
        else
            card.CreateHTML(path, mode);
    } catch (const Error&) {
        return; // an amount beyond any number: told, not written
    }
    CheckPage(ReadPage(page));
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    Bytes in(data, size);
    uint8_t options = in.byte();
    const std::string& dir = fuzz::PrivateDir();
    fuzz::WriteFile(dir + "/ISHP.FIX", in.rest());

    ModuleState shared;
    RecordedMessages messages;
    Card card(messages, shared);
    card.UserControl_InitProperties(nullptr);
    card.ChkWithDrawing.setValue(options & 1);
    card.chkLineDisc.setValue((options >> 1) & 1);
    card.ChkShowDetails.setValue((options >> 2) & 1);
    card.ChkShowTotalFC.setValue((options >> 3) & 1);
    card.cmbRules.setListIndex((options >> 4) & 3);
    int16_t type = 20;
    int32_t start = 2;
    card.ShowDoc(dir, type, start);
    std::string page = dir + "/page.htm";
    Build(card, page, false, (options & 0x40) ? 2 : 0, false);
    Build(card, page, true, 0, (options & 0x80) != 0);
    return 0;
}
