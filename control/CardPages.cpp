#include "control/Card.h"

#include "platform/Error.h"

namespace dovrel {

namespace {

[[noreturn]] void NotAvailable(const char* member) {
    throw Error(std::string(member) + " is not available yet");
}

} // namespace

void Card::CreateHTML(std::string&, int16_t&) {
    NotAvailable("CreateHTML");
}

void Card::CreateHTMLEng(std::string&, bool&) {
    NotAvailable("CreateHTMLEng");
}

std::string Card::CreateAsIs(std::string&) {
    NotAvailable("CreateAsIs");
}

void Card::WriteCell(int16_t&, std::string&) {
    NotAvailable("WriteCell");
}

std::string Card::RulesValue() {
    NotAvailable("RulesValue");
}

void Card::PrintButt_Click() {
    throw Error("Printing is not available yet");
}

} // namespace dovrel
