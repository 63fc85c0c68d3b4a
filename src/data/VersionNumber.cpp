#include "VersionNumber.h"
#include "LoomkitLogging.h"

#include <QQmlEngine>

VersionNumber::VersionNumber(QObject *parent)
    : LoomkitObject(parent)
{
}

VersionNumber::VersionNumber(const QVersionNumber &version, QObject *parent)
    : LoomkitObject(parent)
    , m_version(version)
{
}

VersionNumber *VersionNumber::create(const QVersionNumber &version)
{
    auto *object = new VersionNumber(version);
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

QVersionNumber VersionNumber::toVersion(const QVariant &value)
{
    switch (value.userType()) {
    case QMetaType::QVariantList:
    case QMetaType::QStringList: {
        QVector<int> segments;
        for (const QVariant &segment : value.toList()) {
            bool ok = false;
            const int number = segment.toInt(&ok);
            if (!ok || number < 0)
                return QVersionNumber();
            segments.append(number);
        }
        return QVersionNumber(segments);
    }
    case QMetaType::QObjectStar:
        if (auto *other = qobject_cast<VersionNumber *>(value.value<QObject *>()))
            return other->m_version;
        return QVersionNumber();
    default:
        break;
    }
    if (value.userType() == qMetaTypeId<QVersionNumber>())
        return value.value<QVersionNumber>();
    if (value.userType() == qMetaTypeId<QJSValue>())
        return toVersion(value.value<QJSValue>().toVariant());
    if (!value.canConvert<QString>())
        return QVersionNumber();
    return QVersionNumber::fromString(value.toString().trimmed());
}

void VersionNumber::setVersion(const QVersionNumber &version, const QString &suffix)
{
    if (version == m_version && version.segmentCount() == m_version.segmentCount() && suffix == m_suffix)
        return;
    m_version = version;
    m_suffix = suffix;
    emit versionChanged();
}

QString VersionNumber::versionString() const
{
    return m_version.toString() + m_suffix;
}

void VersionNumber::setVersionString(const QString &text)
{
    const QString trimmed = text.trimmed();
    int suffixIndex = 0;
    const QVersionNumber version = QVersionNumber::fromString(trimmed, &suffixIndex);
    if (version.isNull() && !trimmed.isEmpty())
        qCWarning(lcCore) << Q_FUNC_INFO << "Not a version number:" << text;
    setVersion(version, version.isNull() ? QString() : trimmed.mid(suffixIndex));
}

int VersionNumber::majorVersion() const
{
    return m_version.majorVersion();
}

void VersionNumber::setMajorVersion(int value)
{
    setSegment(0, value);
}

int VersionNumber::minorVersion() const
{
    return m_version.minorVersion();
}

void VersionNumber::setMinorVersion(int value)
{
    setSegment(1, value);
}

int VersionNumber::microVersion() const
{
    return m_version.microVersion();
}

void VersionNumber::setMicroVersion(int value)
{
    setSegment(2, value);
}

QVariantList VersionNumber::segments() const
{
    QVariantList list;
    for (int segment : m_version.segments())
        list.append(segment);
    return list;
}

void VersionNumber::setSegments(const QVariantList &segments)
{
    const QVersionNumber version = toVersion(segments);
    if (version.isNull() && !segments.isEmpty()) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Not a list of segments:" << segments;
        return;
    }
    setVersion(version, m_suffix);
}

int VersionNumber::segmentCount() const
{
    return m_version.segmentCount();
}

QString VersionNumber::suffix() const
{
    return m_suffix;
}

bool VersionNumber::isNull() const
{
    return m_version.isNull();
}

bool VersionNumber::isNormalized() const
{
    return m_version.isNormalized();
}

int VersionNumber::compare(const QVariant &other) const
{
    return QVersionNumber::compare(m_version, toVersion(other));
}

bool VersionNumber::isPrefixOf(const QVariant &other) const
{
    return m_version.isPrefixOf(toVersion(other));
}

VersionNumber *VersionNumber::normalized() const
{
    return create(m_version.normalized());
}

QString VersionNumber::toString() const
{
    return versionString();
}

void VersionNumber::setSegment(int index, int value)
{
    if (value < 0) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Negative segment:" << value;
        return;
    }
    QVector<int> segments = m_version.segments();
    if (index < segments.size() && segments.at(index) == value)
        return;
    if (index >= segments.size())
        segments.resize(index + 1);
    segments[index] = value;
    setVersion(QVersionNumber(segments), m_suffix);
}
