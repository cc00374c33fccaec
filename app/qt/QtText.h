#pragma once

#include <QString>
#include <QVariant>

#include <string>
#include <string_view>

#include "platform/Encoding.h"
#include "platform/Variant.h"

namespace dovrel {

// The edge between the core's code page 1255 texts and Qt's strings; every
// conversion goes through platform/Encoding.h.
QString ToQString(std::string_view cp1255);
QString ToQString(const Utf8& text);
std::string FromQString(const QString& text);

// Whether a text, spaces aside, is a number as the control writes them
// ("-1,234.50", "3").
bool IsPlainNumber(const QString& text);
// The text with a left-to-right mark before it, so that a number shown in a
// right-to-left place keeps its minus sign before the digits.
QString LeftToRight(const QString& text);

// A host's value where the control takes a VARIANT, and back. An invalid
// QVariant is empty, a null one (std::nullptr_t) is null; strings, numbers and
// booleans keep their kinds. Other kinds are refused with an Error.
Variant FromQVariant(const QVariant& value);
QVariant ToQVariant(const Variant& value);

} // namespace dovrel
