#include "app/qt/QtText.h"

#include "platform/Encoding.h"
#include "platform/Error.h"

#include <QRegularExpression>

namespace dovrel {

QString ToQString(std::string_view cp1255) {
    return ToQString(ToUtf8(cp1255));
}

QString ToQString(const Utf8& text) {
    return QString::fromUtf8(text.str().data(), static_cast<qsizetype>(text.str().size()));
}

std::string FromQString(const QString& text) {
    return FromUtf8(Utf8(text.toUtf8().toStdString()));
}

Variant FromQVariant(const QVariant& value) {
    if (!value.isValid())
        return Variant();
    switch (value.typeId()) {
    case QMetaType::Nullptr:
        return Variant::Null();
    case QMetaType::QString:
    case QMetaType::QByteArray:
    case QMetaType::QChar:
        return Variant(FromQString(value.toString()));
    case QMetaType::Bool:
        return Variant(value.toBool());
    case QMetaType::Int:
    case QMetaType::UInt:
    case QMetaType::Short:
    case QMetaType::UShort:
    case QMetaType::UChar:
    case QMetaType::SChar:
    case QMetaType::Long:
    case QMetaType::ULong:
    case QMetaType::LongLong:
    case QMetaType::ULongLong:
    case QMetaType::Float:
    case QMetaType::Double:
        return Variant(value.toDouble());
    default:
        throw Error(std::string("Type mismatch: a value of type ") + value.typeName() +
                    " cannot be passed to the control");
    }
}

QVariant ToQVariant(const Variant& value) {
    switch (value.kind()) {
    case Variant::Kind::Empty:
        return QVariant();
    case Variant::Kind::Null:
        return QVariant::fromValue(nullptr);
    case Variant::Kind::Text:
        return ToQString(value.toText());
    case Variant::Kind::Number:
        return value.toNumber();
    case Variant::Kind::Boolean:
        return value.toBool();
    }
    return QVariant();
}

bool IsPlainNumber(const QString& text) {
    static const QRegularExpression number(QStringLiteral("^\\s*-?[0-9][0-9,]*(\\.[0-9]+)?\\s*$"));
    return number.match(text).hasMatch();
}

QString LeftToRight(const QString& text) {
    return QChar(0x200E) + text;
}

} // namespace dovrel
