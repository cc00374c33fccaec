#pragma once

#include <QObject>
#include <QString>
#include <QVariant>

namespace dovrel {

class CardWidget;

// The members of the control's automation interface through Qt's meta-object
// system, by the same names: properties for its properties and invokable
// methods for its methods, QVariant where it takes a VARIANT. Each one goes
// through CardInterface::Invoke, which holds the names and argument kinds,
// and runs as a call of the hosting widget. A failure, which a COM host would
// get as the error of the call, is kept in lastError and announced by failed.
class CardObject : public QObject {
    Q_OBJECT
    Q_PROPERTY(int PubACTLocation READ PubACTLocation WRITE setPubACTLocation)
    Q_PROPERTY(int PubPrevLocation READ PubPrevLocation WRITE setPubPrevLocation)
    Q_PROPERTY(QString PubSearchBy READ PubSearchBy WRITE setPubSearchBy)
    Q_PROPERTY(QVariant PubSearchValue READ PubSearchValue WRITE setPubSearchValue)
    Q_PROPERTY(QVariant SetAccountKey READ SetAccountKey WRITE setSetAccountKey)
    Q_PROPERTY(QVariant SetCompDir READ SetCompDir WRITE setSetCompDir)
    Q_PROPERTY(QVariant ACTLocation READ ACTLocation WRITE setACTLocation)
    Q_PROPERTY(QVariant CompanyTitle READ CompanyTitle WRITE setCompanyTitle)
    Q_PROPERTY(QVariant DBPath READ DBPath WRITE setDBPath)
    Q_PROPERTY(QVariant PicPath READ PicPath WRITE setPicPath)
    Q_PROPERTY(short ReadingOrder READ ReadingOrder WRITE setReadingOrder)
    Q_PROPERTY(QString lastError READ lastError)

public:
    explicit CardObject(CardWidget& widget, QObject* parent = nullptr);

    // The description of the last call's failure; empty after a call that
    // succeeded.
    const QString& lastError() const { return lastError_; }

    int PubACTLocation();
    void setPubACTLocation(int value);
    int PubPrevLocation();
    void setPubPrevLocation(int value);
    QString PubSearchBy();
    void setPubSearchBy(const QString& value);
    QVariant PubSearchValue();
    void setPubSearchValue(const QVariant& value);
    QVariant SetAccountKey();
    void setSetAccountKey(const QVariant& value);
    QVariant SetCompDir();
    void setSetCompDir(const QVariant& value);
    QVariant ACTLocation();
    void setACTLocation(const QVariant& value);
    QVariant CompanyTitle();
    void setCompanyTitle(const QVariant& value);
    QVariant DBPath();
    void setDBPath(const QVariant& value);
    QVariant PicPath();
    void setPicPath(const QVariant& value);
    short ReadingOrder();
    void setReadingOrder(short value);

    Q_INVOKABLE void InitCmbDocType();
    Q_INVOKABLE void InitDocLines();
    Q_INVOKABLE int ReadStock(const QString& pCompPath, short pWizFile, const QString& pSearchBy,
                              const QVariant& pSearchValue, const QString& pStartFrom,
                              const QString& pFromDate);
    Q_INVOKABLE void CreateHTML(const QString& pFileName, short pDocFormat);
    Q_INVOKABLE int ShowDoc(const QString& pCompPath, short pWizFile, int pStartPosition);
    Q_INVOKABLE int SetParams(const QString& pCompPath, short pWizFile, int pStartPosition,
                              const QString& pDBPath, const QString& pPicPath);
    Q_INVOKABLE QVariant ReadITM(const QString& CompPath);
    Q_INVOKABLE void FillPicPath(const QString& pDbName);
    Q_INVOKABLE void CreateHTMLEng(const QString& pFileName, bool pUseFName);
    Q_INVOKABLE void SetGetRegParams(uchar Action);
    Q_INVOKABLE QString CreateAsIs(const QString& pText);
    Q_INVOKABLE QVariant ReadACT(const QString& CompPath);
    Q_INVOKABLE void WriteCell(short MyNum, const QString& CellValue);
    Q_INVOKABLE QString RulesValue();

signals:
    void failed(const QString& description);

private:
    QVariant invoke(const char* name, const QVariantList& args);

    CardWidget& widget_;
    QString lastError_;
};

} // namespace dovrel
