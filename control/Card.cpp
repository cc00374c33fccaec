#include "control/Card.h"

#include "fixfiles/AccountsFile.h"
#include "fixfiles/ItemsFile.h"
#include "fixfiles/ReadStock.h"

namespace dovrel {

Card::Card(Messages& messages, ModuleState& shared) : messages_(messages), shared_(shared) {
    if (shared_.DocTypes[0].code == 0)
        InitDocTypes(shared_.DocTypes, shared_.DocFiles);
    controls_ = {&txtAccountKey, &txtReference1, &txtCustomerName, &txtDate,
                 &txtAddress1,   &txtAddress2,   &txtTotalVat,     &txtVatValue,
                 &txtTotal1,     &txtItemKey,    &txtDetails,      &txtFromDate,
                 &DocLines,      &ProgressFrame, &ProgressFill};
    InitDocLines();
}

Control* Card::findControl(const std::string& name) {
    for (Control* control : controls_)
        if (control->name() == name)
            return control;
    return nullptr;
}

int32_t Card::ReadStock(std::string pCompPath, int16_t& pWizFile, std::string& pSearchBy,
                        Variant& pSearchValue, std::string& pStartFrom, std::string& pFromDate) {
    StockContext context{shared_.DocTypes, shared_.DocFiles, shared_.Company, shared_.Doc,
                         messages_};
    return dovrel::ReadStock(*this, context, pCompPath, pWizFile, pSearchBy, pSearchValue,
                             pStartFrom, pFromDate);
}

Variant Card::ReadITM(std::string& CompPath) {
    return dovrel::ReadITM(CompPath, shared_.Doc, {ProgressFrame, ProgressFill});
}

Variant Card::ReadACT(std::string& CompPath) {
    return dovrel::ReadACT(CompPath, shared_.Accounts, {ProgressFrame, ProgressFill});
}

} // namespace dovrel
