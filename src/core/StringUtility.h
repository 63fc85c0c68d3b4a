#ifndef STRINGUTILITY_H
#define STRINGUTILITY_H

#include "TextEncoding.h"

#include <QByteArray>
#include <QString>

class QJSValue;

// Conversions between text and bytes in the module's text encodings.
class StringUtility
{
public:
    static QString toString(const QByteArray &data, TextEncoding encoding = TextEncodingUtf8);
    static QByteArray toStringData(const QString &text, TextEncoding encoding = TextEncodingUtf8);
    static QByteArray toValueData(const QJSValue &value, TextEncoding encoding = TextEncodingUtf8);

private:
    static bool encode(const QString &text, TextEncoding encoding, QByteArray *data);
};

#endif // STRINGUTILITY_H
