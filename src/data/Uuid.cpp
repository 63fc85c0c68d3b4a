#include "Uuid.h"
#include "LoomkitLogging.h"

Uuid::Uuid(const QUuid &uuid)
    : m_uuid(uuid)
{
}

Uuid Uuid::createUuid()
{
    return Uuid(QUuid::createUuid());
}

Uuid Uuid::fromString(const QString &text)
{
    const QString trimmed = text.trimmed();
    QUuid uuid = QUuid::fromString(trimmed);
    // The 32-digit form has no hyphens for QUuid to find.
    if (uuid.isNull() && trimmed.size() == 32) {
        const QByteArray bytes = QByteArray::fromHex(trimmed.toLatin1());
        if (bytes.size() == 16 && bytes.toHex() == trimmed.toLatin1().toLower())
            uuid = QUuid::fromRfc4122(bytes);
    }
    if (uuid.isNull() && !trimmed.isEmpty()
        && trimmed != QLatin1String("{00000000-0000-0000-0000-000000000000}")
        && trimmed != QLatin1String("00000000-0000-0000-0000-000000000000")) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Not a UUID:" << text;
    }
    return Uuid(uuid);
}

Uuid Uuid::fromRfc4122(const QByteArray &bytes)
{
    if (bytes.size() != 16) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Expected 16 bytes, got" << bytes.size();
        return Uuid();
    }
    return Uuid(QUuid::fromRfc4122(bytes));
}

Uuid Uuid::fromVariant(const QVariant &value)
{
    const int type = value.userType();
    if (type == qMetaTypeId<Uuid>())
        return value.value<Uuid>();
    if (type == qMetaTypeId<QUuid>())
        return Uuid(value.value<QUuid>());
    if (type == QMetaType::QByteArray)
        return fromRfc4122(value.toByteArray());
    if (type == QMetaType::QString)
        return fromString(value.toString());
    return Uuid();
}

void Uuid::registerMetaType()
{
    static const bool registered = [] {
        qRegisterMetaType<Uuid>("Uuid");
        QMetaType::registerComparators<Uuid>();
        QMetaType::registerConverter<Uuid, QString>(&Uuid::toString);
        return true;
    }();
    Q_UNUSED(registered)
}

QVariant Uuid::toVariant() const
{
    registerMetaType();
    return QVariant::fromValue(*this);
}

bool Uuid::isNull() const
{
    return m_uuid.isNull();
}

QString Uuid::string() const
{
    return m_uuid.toString(QUuid::WithBraces);
}

QString Uuid::withoutBraces() const
{
    return m_uuid.toString(QUuid::WithoutBraces);
}

QString Uuid::id128() const
{
    return m_uuid.toString(QUuid::Id128);
}

QByteArray Uuid::rfc4122() const
{
    return m_uuid.toRfc4122();
}

int Uuid::version() const
{
    return m_uuid.isNull() ? 0 : int(m_uuid.version());
}

QString Uuid::toString() const
{
    return string();
}

bool Uuid::equals(const QVariant &other) const
{
    return m_uuid == fromVariant(other).m_uuid;
}
