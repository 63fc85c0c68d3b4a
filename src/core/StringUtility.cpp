#include "StringUtility.h"
#include "LoomkitLogging.h"

#include <QJSValue>
#include <QVariant>

namespace {

// Number of 16-bit units before the first zero unit, never past the data.
int utf16Length(const ushort *units, int count)
{
    int n = 0;
    while (n < count && units[n] != 0)
        ++n;
    return n;
}

} // namespace

QString StringUtility::toString(const QByteArray &data, TextEncoding encoding)
{
    switch (encoding) {
    case TextEncodingUtf8:
        return QString::fromUtf8(data);
    case TextEncodingLatin1:
        return QString::fromLatin1(data);
    case TextEncodingLocal8Bit:
        return QString::fromLocal8Bit(data);
    case TextEncodingUtf16: {
        const int count = data.size() / 2;
        if (count == 0)
            return QString();
        // Copy into aligned storage: the bytes may start at any address.
        QVector<ushort> units(count);
        memcpy(units.data(), data.constData(), size_t(count) * 2);
        return QString::fromUtf16(units.constData(), utf16Length(units.constData(), count));
    }
    default:
        qCWarning(lcUtility) << Q_FUNC_INFO << "Undefined encoding:" << int(encoding);
        return QString::fromUtf8(data);
    }
}

bool StringUtility::encode(const QString &text, TextEncoding encoding, QByteArray *data)
{
    switch (encoding) {
    case TextEncodingUtf8:
        *data = text.toUtf8();
        return true;
    case TextEncodingLatin1:
        *data = text.toLatin1();
        return true;
    case TextEncodingLocal8Bit:
        *data = text.toLocal8Bit();
        return true;
    case TextEncodingUtf16: {
        const int count = utf16Length(text.utf16(), text.size());
        *data = QByteArray(reinterpret_cast<const char *>(text.utf16()), count * 2);
        return true;
    }
    default:
        return false;
    }
}

QByteArray StringUtility::toStringData(const QString &text, TextEncoding encoding)
{
    QByteArray data;
    if (!encode(text, encoding, &data))
        qCWarning(lcUtility) << Q_FUNC_INFO << "Undefined encoding:" << int(encoding);
    return data;
}

QByteArray StringUtility::toValueData(const QJSValue &value, TextEncoding encoding)
{
    if (value.isString())
        return toStringData(value.toString(), encoding);

    const QVariant variant = value.toVariant();
    if (variant.canConvert<QByteArray>())
        return variant.toByteArray();

    qCWarning(lcUtility) << Q_FUNC_INFO << "Unsupported data type:" << variant;
    return QByteArray();
}
