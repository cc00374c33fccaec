#include "app/qt/CardObject.h"

#include "app/qt/CardWidget.h"
#include "app/qt/QtText.h"
#include "control/CardInterface.h"
#include "platform/Error.h"

#include <vector>

namespace dovrel {

CardObject::CardObject(CardWidget& widget, QObject* parent) : QObject(parent), widget_(widget) {}

QVariant CardObject::invoke(const char* name, const QVariantList& args) {
    lastError_.clear();
    try {
        std::vector<Variant> values;
        for (const QVariant& arg : args)
            values.push_back(FromQVariant(arg));
        Variant result;
        widget_.call([&] { result = CardInterface::Invoke(widget_.card(), name, values); });
        return ToQVariant(result);
    } catch (const std::exception& failure) {
        lastError_ = ToQString(ErrorText(failure));
        emit failed(lastError_);
        return QVariant();
    }
}

int CardObject::PubACTLocation() {
    return invoke("PubACTLocation", {}).toInt();
}

void CardObject::setPubACTLocation(int value) {
    invoke("PubACTLocation", {QVariant::fromValue(value)});
}

int CardObject::PubPrevLocation() {
    return invoke("PubPrevLocation", {}).toInt();
}

void CardObject::setPubPrevLocation(int value) {
    invoke("PubPrevLocation", {QVariant::fromValue(value)});
}

QString CardObject::PubSearchBy() {
    return invoke("PubSearchBy", {}).toString();
}

void CardObject::setPubSearchBy(const QString& value) {
    invoke("PubSearchBy", {QVariant::fromValue(value)});
}

QVariant CardObject::PubSearchValue() {
    return invoke("PubSearchValue", {});
}

void CardObject::setPubSearchValue(const QVariant& value) {
    invoke("PubSearchValue", {value});
}

QVariant CardObject::SetAccountKey() {
    return invoke("SetAccountKey", {});
}

void CardObject::setSetAccountKey(const QVariant& value) {
    invoke("SetAccountKey", {value});
}

QVariant CardObject::SetCompDir() {
    return invoke("SetCompDir", {});
}

void CardObject::setSetCompDir(const QVariant& value) {
    invoke("SetCompDir", {value});
}

QVariant CardObject::ACTLocation() {
    return invoke("ACTLocation", {});
}

void CardObject::setACTLocation(const QVariant& value) {
    invoke("ACTLocation", {value});
}

QVariant CardObject::CompanyTitle() {
    return invoke("CompanyTitle", {});
}

void CardObject::setCompanyTitle(const QVariant& value) {
    invoke("CompanyTitle", {value});
}

QVariant CardObject::DBPath() {
    return invoke("DBPath", {});
}

void CardObject::setDBPath(const QVariant& value) {
    invoke("DBPath", {value});
}

QVariant CardObject::PicPath() {
    return invoke("PicPath", {});
}

void CardObject::setPicPath(const QVariant& value) {
    invoke("PicPath", {value});
}

short CardObject::ReadingOrder() {
    return static_cast<short>(invoke("ReadingOrder", {}).toInt());
}

void CardObject::setReadingOrder(short value) {
    invoke("ReadingOrder", {QVariant::fromValue(value)});
}

void CardObject::InitCmbDocType() {
    invoke("InitCmbDocType", {});
}

void CardObject::InitDocLines() {
    invoke("InitDocLines", {});
}

int CardObject::ReadStock(const QString& pCompPath, short pWizFile, const QString& pSearchBy,
                          const QVariant& pSearchValue, const QString& pStartFrom,
                          const QString& pFromDate) {
    return invoke("ReadStock", {QVariant::fromValue(pCompPath), QVariant::fromValue(pWizFile),
                                QVariant::fromValue(pSearchBy), pSearchValue,
                                QVariant::fromValue(pStartFrom), QVariant::fromValue(pFromDate)})
        .toInt();
}

void CardObject::CreateHTML(const QString& pFileName, short pDocFormat) {
    invoke("CreateHTML", {QVariant::fromValue(pFileName), QVariant::fromValue(pDocFormat)});
}

int CardObject::ShowDoc(const QString& pCompPath, short pWizFile, int pStartPosition) {
    return invoke("ShowDoc", {QVariant::fromValue(pCompPath), QVariant::fromValue(pWizFile),
                              QVariant::fromValue(pStartPosition)})
        .toInt();
}

int CardObject::SetParams(const QString& pCompPath, short pWizFile, int pStartPosition,
                          const QString& pDBPath, const QString& pPicPath) {
    return invoke("SetParams", {QVariant::fromValue(pCompPath), QVariant::fromValue(pWizFile),
                                QVariant::fromValue(pStartPosition), QVariant::fromValue(pDBPath),
                                QVariant::fromValue(pPicPath)})
        .toInt();
}

QVariant CardObject::ReadITM(const QString& CompPath) {
    return invoke("ReadITM", {QVariant::fromValue(CompPath)});
}

void CardObject::FillPicPath(const QString& pDbName) {
    invoke("FillPicPath", {QVariant::fromValue(pDbName)});
}

void CardObject::CreateHTMLEng(const QString& pFileName, bool pUseFName) {
    invoke("CreateHTMLEng", {QVariant::fromValue(pFileName), QVariant::fromValue(pUseFName)});
}

void CardObject::SetGetRegParams(uchar Action) {
    invoke("SetGetRegParams", {QVariant::fromValue(Action)});
}

QString CardObject::CreateAsIs(const QString& pText) {
    return invoke("CreateAsIs", {QVariant::fromValue(pText)}).toString();
}

QVariant CardObject::ReadACT(const QString& CompPath) {
    return invoke("ReadACT", {QVariant::fromValue(CompPath)});
}

void CardObject::WriteCell(short MyNum, const QString& CellValue) {
    invoke("WriteCell", {QVariant::fromValue(MyNum), QVariant::fromValue(CellValue)});
}

QString CardObject::RulesValue() {
    return invoke("RulesValue", {}).toString();
}

} // namespace dovrel
