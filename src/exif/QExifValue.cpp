#include "QExifValue.h"

#include <QTextCodec>

QExifValuePrivate::~QExifValuePrivate() = default;

namespace {

template <typename T, quint16 TypeNumber>
class QExifVectorValuePrivate : public QExifValuePrivate
{
public:
    explicit QExifVectorValuePrivate(const QVector<T> &value)
        : QExifValuePrivate(TypeNumber, quint32(value.size())), value(value)
    {
    }

    const QVector<T> value;
};

class QExifByteValuePrivate : public QExifVectorValuePrivate<quint8, QExifValue::Byte>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifShortValuePrivate : public QExifVectorValuePrivate<quint16, QExifValue::Short>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifLongValuePrivate : public QExifVectorValuePrivate<quint32, QExifValue::Long>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifRationalValuePrivate : public QExifVectorValuePrivate<QExifURational, QExifValue::Rational>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifSignedLongValuePrivate : public QExifVectorValuePrivate<qint32, QExifValue::SignedLong>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifSignedRationalValuePrivate : public QExifVectorValuePrivate<QExifSRational, QExifValue::SignedRational>
{
public:
    using QExifVectorValuePrivate::QExifVectorValuePrivate;
};

class QExifAsciiValuePrivate : public QExifValuePrivate
{
public:
    explicit QExifAsciiValuePrivate(const QString &value)
        : QExifValuePrivate(QExifValue::Ascii, quint32(value.size() + 1)), value(value)
    {
    }

    const QString value;
};

class QExifUndefinedValuePrivate : public QExifValuePrivate
{
public:
    explicit QExifUndefinedValuePrivate(const QByteArray &value)
        : QExifValuePrivate(QExifValue::Undefined, quint32(value.size())), value(value)
    {
    }

    const QByteArray value;
};

QExifValuePrivate *sharedNull()
{
    // Holds a reference of its own, so that the count never drops to zero.
    static QExifValuePrivate *const null = [] {
        auto *value = new QExifValuePrivate;
        value->ref.ref();
        return value;
    }();
    return null;
}

template <typename P>
const P *payload(const QExifValuePrivate *d, int type)
{
    return d->type == type ? static_cast<const P *>(d) : nullptr;
}

// The 8-byte character code in front of encoded text in an UNDEFINED value.
const char asciiPrefix[8] = {'A', 'S', 'C', 'I', 'I', 0, 0, 0};
const char jisPrefix[8] = {'J', 'I', 'S', 0, 0, 0, 0, 0};
const char unicodePrefix[8] = {'U', 'N', 'I', 'C', 'O', 'D', 'E', 0};
const char undefinedPrefix[8] = {0, 0, 0, 0, 0, 0, 0, 0};

QExifValuePrivate *encodedText(const QString &value, QExifValue::TextEncoding encoding)
{
    QByteArray bytes;
    switch (encoding) {
    case QExifValue::AsciiEncoding:
        bytes = QByteArray(asciiPrefix, 8) + value.toLatin1();
        break;
    case QExifValue::JisEncoding:
        if (QTextCodec *codec = QTextCodec::codecForName("JIS X 0208"))
            bytes = QByteArray(jisPrefix, 8) + codec->fromUnicode(value);
        break;
    case QExifValue::UnicodeEncoding:
        if (QTextCodec *codec = QTextCodec::codecForName("UTF-16"))
            bytes = QByteArray(unicodePrefix, 8) + codec->fromUnicode(value);
        break;
    case QExifValue::UndefinedEncoding:
        bytes = QByteArray(undefinedPrefix, 8) + value.toLocal8Bit();
        break;
    case QExifValue::NoEncoding:
        break;
    }
    if (bytes.isEmpty())
        return new QExifAsciiValuePrivate(value);
    return new QExifUndefinedValuePrivate(bytes);
}

} // namespace

QExifValue::QExifValue()
    : d(sharedNull())
{
}

QExifValue::QExifValue(QExifValuePrivate *payload)
    : d(payload)
{
}

QExifValue::QExifValue(quint8 value)
    : QExifValue(new QExifByteValuePrivate(QVector<quint8>(1, value)))
{
}

QExifValue::QExifValue(const QVector<quint8> &value)
    : QExifValue(new QExifByteValuePrivate(value))
{
}

QExifValue::QExifValue(const QString &value, TextEncoding encoding)
    : QExifValue(encodedText(value, encoding))
{
}

QExifValue::QExifValue(quint16 value)
    : QExifValue(new QExifShortValuePrivate(QVector<quint16>(1, value)))
{
}

QExifValue::QExifValue(const QVector<quint16> &value)
    : QExifValue(new QExifShortValuePrivate(value))
{
}

QExifValue::QExifValue(quint32 value)
    : QExifValue(new QExifLongValuePrivate(QVector<quint32>(1, value)))
{
}

QExifValue::QExifValue(const QVector<quint32> &value)
    : QExifValue(new QExifLongValuePrivate(value))
{
}

QExifValue::QExifValue(const QExifURational &value)
    : QExifValue(new QExifRationalValuePrivate(QVector<QExifURational>(1, value)))
{
}

QExifValue::QExifValue(const QVector<QExifURational> &value)
    : QExifValue(new QExifRationalValuePrivate(value))
{
}

QExifValue::QExifValue(const QByteArray &value)
    : QExifValue(new QExifUndefinedValuePrivate(value))
{
}

QExifValue::QExifValue(qint32 value)
    : QExifValue(new QExifSignedLongValuePrivate(QVector<qint32>(1, value)))
{
}

QExifValue::QExifValue(const QVector<qint32> &value)
    : QExifValue(new QExifSignedLongValuePrivate(value))
{
}

QExifValue::QExifValue(const QExifSRational &value)
    : QExifValue(new QExifSignedRationalValuePrivate(QVector<QExifSRational>(1, value)))
{
}

QExifValue::QExifValue(const QVector<QExifSRational> &value)
    : QExifValue(new QExifSignedRationalValuePrivate(value))
{
}

QExifValue::QExifValue(const QExifValue &other) = default;
QExifValue &QExifValue::operator=(const QExifValue &other) = default;
QExifValue::~QExifValue() = default;

bool QExifValue::isNull() const
{
    return d.data() == sharedNull();
}

int QExifValue::type() const
{
    return d->type;
}

quint32 QExifValue::count() const
{
    return d->count;
}

quint8 QExifValue::toByte() const
{
    if (d->count != 1)
        return 0;
    const auto *byteValue = payload<QExifByteValuePrivate>(d.data(), Byte);
    return byteValue ? byteValue->value.at(0) : 0;
}

QVector<quint8> QExifValue::toByteVector() const
{
    const auto *byteValue = payload<QExifByteValuePrivate>(d.data(), Byte);
    return byteValue ? byteValue->value : QVector<quint8>();
}

QByteArray QExifValue::toByteArray() const
{
    const auto *undefinedValue = payload<QExifUndefinedValuePrivate>(d.data(), Undefined);
    return undefinedValue ? undefinedValue->value : QByteArray();
}

quint16 QExifValue::toShort() const
{
    if (d->count != 1)
        return 0;
    if (d->type == Byte)
        return static_cast<const QExifByteValuePrivate *>(d.data())->value.at(0);
    if (d->type == Short)
        return static_cast<const QExifShortValuePrivate *>(d.data())->value.at(0);
    return 0;
}

QVector<quint16> QExifValue::toShortVector() const
{
    const auto *shortValue = payload<QExifShortValuePrivate>(d.data(), Short);
    return shortValue ? shortValue->value : QVector<quint16>();
}

quint32 QExifValue::toLong() const
{
    if (d->count != 1)
        return 0;
    switch (d->type) {
    case Byte:
        return static_cast<const QExifByteValuePrivate *>(d.data())->value.at(0);
    case Short:
        return static_cast<const QExifShortValuePrivate *>(d.data())->value.at(0);
    case Long:
        return static_cast<const QExifLongValuePrivate *>(d.data())->value.at(0);
    case SignedLong:
        return quint32(static_cast<const QExifSignedLongValuePrivate *>(d.data())->value.at(0));
    default:
        return 0;
    }
}

QVector<quint32> QExifValue::toLongVector() const
{
    const auto *longValue = payload<QExifLongValuePrivate>(d.data(), Long);
    return longValue ? longValue->value : QVector<quint32>();
}

QVector<qint32> QExifValue::toSignedLongVector() const
{
    const auto *signedValue = payload<QExifSignedLongValuePrivate>(d.data(), SignedLong);
    return signedValue ? signedValue->value : QVector<qint32>();
}

QExifURational QExifValue::toRational() const
{
    if (d->count != 1)
        return QExifURational(0, 0);
    const auto *rationalValue = payload<QExifRationalValuePrivate>(d.data(), Rational);
    return rationalValue ? rationalValue->value.at(0) : QExifURational(0, 0);
}

QVector<QExifURational> QExifValue::toRationalVector() const
{
    const auto *rationalValue = payload<QExifRationalValuePrivate>(d.data(), Rational);
    return rationalValue ? rationalValue->value : QVector<QExifURational>();
}

QExifSRational QExifValue::toSignedRational() const
{
    if (d->count != 1)
        return QExifSRational(0, 0);
    const auto *rationalValue = payload<QExifSignedRationalValuePrivate>(d.data(), SignedRational);
    return rationalValue ? rationalValue->value.at(0) : QExifSRational(0, 0);
}

QVector<QExifSRational> QExifValue::toSignedRationalVector() const
{
    const auto *rationalValue = payload<QExifSignedRationalValuePrivate>(d.data(), SignedRational);
    return rationalValue ? rationalValue->value : QVector<QExifSRational>();
}

QString QExifValue::toString() const
{
    if (d->type == Ascii)
        return static_cast<const QExifAsciiValuePrivate *>(d.data())->value;
    if (d->type != Undefined || d->count < 9)
        return QString();

    const QByteArray &bytes = static_cast<const QExifUndefinedValuePrivate *>(d.data())->value;
    const QByteArray text = QByteArray::fromRawData(bytes.constData() + 8, bytes.size() - 8);
    if (bytes.startsWith(QByteArray::fromRawData(asciiPrefix, 8)))
        return QString::fromLatin1(text);
    if (bytes.startsWith(QByteArray::fromRawData(jisPrefix, 8))) {
        QTextCodec *codec = QTextCodec::codecForName("JIS X 0208");
        return codec ? codec->toUnicode(text) : QString();
    }
    if (bytes.startsWith(QByteArray::fromRawData(unicodePrefix, 8))) {
        // Without the codec the bytes are taken as local text: unlike JIS,
        // which gives nothing.
        QTextCodec *codec = QTextCodec::codecForName("UTF-16");
        return codec ? codec->toUnicode(text) : QString::fromLocal8Bit(text);
    }
    if (bytes.startsWith(QByteArray::fromRawData(undefinedPrefix, 8)))
        return QString::fromLocal8Bit(text);
    return QString();
}
