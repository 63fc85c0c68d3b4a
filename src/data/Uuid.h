#ifndef UUID_H
#define UUID_H

#include <QByteArray>
#include <QMetaType>
#include <QString>
#include <QUuid>
#include <QVariant>

// A universally unique identifier as a QML value: compares by value with ==,
// reads as its braced text in string context.
class Uuid
{
    Q_GADGET

    Q_PROPERTY(bool isNull READ isNull CONSTANT)
    Q_PROPERTY(QString string READ string CONSTANT)
    Q_PROPERTY(QString withoutBraces READ withoutBraces CONSTANT)
    Q_PROPERTY(QString id128 READ id128 CONSTANT)
    Q_PROPERTY(QByteArray rfc4122 READ rfc4122 CONSTANT)
    Q_PROPERTY(int version READ version CONSTANT)

public:
    Uuid() = default;
    explicit Uuid(const QUuid &uuid);

    static Uuid createUuid();
    // Text with or without braces and hyphens; anything else gives a null
    // value and a warning.
    static Uuid fromString(const QString &text);
    // Exactly 16 bytes in network order; anything else gives a null value.
    static Uuid fromRfc4122(const QByteArray &bytes);
    // A Uuid, its text or its 16 bytes.
    static Uuid fromVariant(const QVariant &value);

    // The value wrapped for QML, with the metatype set up on first use.
    QVariant toVariant() const;
    static void registerMetaType();

    QUuid uuid() const { return m_uuid; }
    bool isNull() const;
    QString string() const;
    QString withoutBraces() const;
    QString id128() const;
    QByteArray rfc4122() const;
    int version() const;

    Q_INVOKABLE QString toString() const;
    Q_INVOKABLE bool equals(const QVariant &other) const;

    bool operator==(const Uuid &other) const { return m_uuid == other.m_uuid; }
    bool operator!=(const Uuid &other) const { return m_uuid != other.m_uuid; }
    bool operator<(const Uuid &other) const { return m_uuid < other.m_uuid; }

private:
    QUuid m_uuid;
};

Q_DECLARE_METATYPE(Uuid)

#endif // UUID_H
