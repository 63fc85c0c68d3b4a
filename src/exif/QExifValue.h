#ifndef QEXIFVALUE_H
#define QEXIFVALUE_H

#include <QByteArray>
#include <QExplicitlySharedDataPointer>
#include <QMetaType>
#include <QPair>
#include <QSharedData>
#include <QString>
#include <QVector>

typedef QPair<quint32, quint32> QExifURational;
typedef QPair<qint32, qint32> QExifSRational;

// Base of the typed payloads. One process-wide instance of this class is the
// null value; payloads never change after construction, so copies share them
// without detaching.
class QExifValuePrivate : public QSharedData
{
public:
    QExifValuePrivate(quint16 type = 0, quint32 count = 0)
        : type(type), count(count)
    {
    }
    virtual ~QExifValuePrivate();

    quint16 type;
    quint32 count;
};

// The value of one Exif tag: an implicitly shared handle on a TIFF-typed payload.
class QExifValue
{
public:
    enum Type {
        Byte = 1,
        Ascii = 2,
        Short = 3,
        Long = 4,
        Rational = 5,
        Undefined = 7,
        SignedLong = 9,
        SignedRational = 10
    };

    enum TextEncoding {
        NoEncoding = 0,
        AsciiEncoding = 1,
        JisEncoding = 2,
        UnicodeEncoding = 3,
        UndefinedEncoding = 4
    };

    QExifValue();
    QExifValue(quint8 value);
    QExifValue(const QVector<quint8> &value);
    QExifValue(const QString &value, TextEncoding encoding = NoEncoding);
    QExifValue(quint16 value);
    QExifValue(const QVector<quint16> &value);
    QExifValue(quint32 value);
    QExifValue(const QVector<quint32> &value);
    QExifValue(const QExifURational &value);
    QExifValue(const QVector<QExifURational> &value);
    QExifValue(const QByteArray &value);
    QExifValue(qint32 value);
    QExifValue(const QVector<qint32> &value);
    QExifValue(const QExifSRational &value);
    QExifValue(const QVector<QExifSRational> &value);
    QExifValue(const QExifValue &other);
    QExifValue &operator=(const QExifValue &other);
    ~QExifValue();

    bool isNull() const;
    int type() const;
    quint32 count() const;

    quint8 toByte() const;
    QVector<quint8> toByteVector() const;
    QByteArray toByteArray() const;
    quint16 toShort() const;
    QVector<quint16> toShortVector() const;
    quint32 toLong() const;
    QVector<quint32> toLongVector() const;
    QVector<qint32> toSignedLongVector() const;
    QExifURational toRational() const;
    QVector<QExifURational> toRationalVector() const;
    QExifSRational toSignedRational() const;
    QVector<QExifSRational> toSignedRationalVector() const;
    QString toString() const;

private:
    explicit QExifValue(QExifValuePrivate *payload);

    QExplicitlySharedDataPointer<QExifValuePrivate> d;
};

Q_DECLARE_METATYPE(QExifValue)

#endif // QEXIFVALUE_H
