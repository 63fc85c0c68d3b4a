#ifndef VERSIONNUMBER_H
#define VERSIONNUMBER_H

#include "LoomkitObject.h"

#include <QVariant>
#include <QVariantList>
#include <QVersionNumber>

// A version number such as "5.15.2-beta" for QML: numeric segments compared
// segment by segment, with any text after them kept as the suffix.
class VersionNumber : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(QString versionString READ versionString WRITE setVersionString NOTIFY versionChanged)
    Q_PROPERTY(int majorVersion READ majorVersion WRITE setMajorVersion NOTIFY versionChanged)
    Q_PROPERTY(int minorVersion READ minorVersion WRITE setMinorVersion NOTIFY versionChanged)
    Q_PROPERTY(int microVersion READ microVersion WRITE setMicroVersion NOTIFY versionChanged)
    Q_PROPERTY(QVariantList segments READ segments WRITE setSegments NOTIFY versionChanged)
    Q_PROPERTY(int segmentCount READ segmentCount NOTIFY versionChanged)
    Q_PROPERTY(QString suffix READ suffix NOTIFY versionChanged)
    Q_PROPERTY(bool isNull READ isNull NOTIFY versionChanged)
    Q_PROPERTY(bool isNormalized READ isNormalized NOTIFY versionChanged)

public:
    explicit VersionNumber(QObject *parent = nullptr);
    explicit VersionNumber(const QVersionNumber &version, QObject *parent = nullptr);

    // Unparented, in JavaScript ownership.
    static VersionNumber *create(const QVersionNumber &version);

    // A VersionNumber object, text ("1.2.3"), a number (1.5 reads "1.5") or
    // a list of segments. Anything else gives a null version.
    static QVersionNumber toVersion(const QVariant &value);

    QVersionNumber version() const { return m_version; }
    void setVersion(const QVersionNumber &version, const QString &suffix = QString());

    QString versionString() const;
    void setVersionString(const QString &text);
    int majorVersion() const;
    void setMajorVersion(int value);
    int minorVersion() const;
    void setMinorVersion(int value);
    int microVersion() const;
    void setMicroVersion(int value);
    QVariantList segments() const;
    void setSegments(const QVariantList &segments);
    int segmentCount() const;
    QString suffix() const;
    bool isNull() const;
    bool isNormalized() const;

    // Negative, zero or positive as this version is lower, equal or higher.
    Q_INVOKABLE int compare(const QVariant &other) const;
    Q_INVOKABLE bool isPrefixOf(const QVariant &other) const;
    Q_INVOKABLE VersionNumber *normalized() const;
    Q_INVOKABLE QString toString() const;

signals:
    void versionChanged();

private:
    void setSegment(int index, int value);

    QVersionNumber m_version;
    QString m_suffix;
};

#endif // VERSIONNUMBER_H
