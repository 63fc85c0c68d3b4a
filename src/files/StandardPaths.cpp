#include "StandardPaths.h"
#include "EnumUtility.h"
#include "LoomkitLogging.h"

#include <QJSValue>

namespace {

QVariant plain(const QVariant &value)
{
    if (value.userType() == qMetaTypeId<QJSValue>())
        return value.value<QJSValue>().toVariant();
    return value;
}

} // namespace

StandardPaths::StandardPaths(QObject *parent)
    : LoomkitObject(parent)
{
}

bool StandardPaths::location(const QVariant &type, QStandardPaths::StandardLocation *result, const char *function)
{
    const QMetaEnum metaEnum = QMetaEnum::fromType<StandardLocation>();
    const int value = EnumUtility::enumValue(metaEnum, plain(type), -1);
    if (value < 0) {
        qCWarning(lcFile) << function << "Unknown location:" << type;
        return false;
    }
    *result = QStandardPaths::StandardLocation(value);
    return true;
}

QStandardPaths::LocateOptions StandardPaths::locateOptions(const QVariant &option, bool *ok, const char *function)
{
    const QVariant value = plain(option);
    *ok = true;
    if (!value.isValid() || value.isNull())
        return QStandardPaths::LocateFile;
    const int result = EnumUtility::enumValue(QMetaEnum::fromType<LocateOption>(), value, -1);
    if (result < 0) {
        qCWarning(lcFile) << function << "Unknown locate option:" << option;
        *ok = false;
        return QStandardPaths::LocateFile;
    }
    return QStandardPaths::LocateOptions(result);
}

QString StandardPaths::writableLocation(const QVariant &type) const
{
    QStandardPaths::StandardLocation standardLocation;
    if (!location(type, &standardLocation, Q_FUNC_INFO))
        return QString();
    return QStandardPaths::writableLocation(standardLocation);
}

QUrl StandardPaths::writableLocationUrl(const QVariant &type) const
{
    const QString path = writableLocation(type);
    return path.isEmpty() ? QUrl() : QUrl::fromLocalFile(path);
}

QStringList StandardPaths::standardLocations(const QVariant &type) const
{
    QStandardPaths::StandardLocation standardLocation;
    if (!location(type, &standardLocation, Q_FUNC_INFO))
        return QStringList();
    return QStandardPaths::standardLocations(standardLocation);
}

QString StandardPaths::displayName(const QVariant &type) const
{
    QStandardPaths::StandardLocation standardLocation;
    if (!location(type, &standardLocation, Q_FUNC_INFO))
        return QString();
    return QStandardPaths::displayName(standardLocation);
}

QString StandardPaths::locate(const QVariant &type, const QString &fileName, const QVariant &option) const
{
    QStandardPaths::StandardLocation standardLocation;
    bool ok = false;
    const QStandardPaths::LocateOptions options = locateOptions(option, &ok, Q_FUNC_INFO);
    if (!ok || !location(type, &standardLocation, Q_FUNC_INFO))
        return QString();
    return QStandardPaths::locate(standardLocation, fileName, options);
}

QString StandardPaths::locate(const QVariant &type, const QString &fileName) const
{
    return locate(type, fileName, QVariant());
}

QStringList StandardPaths::locateAll(const QVariant &type, const QString &fileName, const QVariant &option) const
{
    QStandardPaths::StandardLocation standardLocation;
    bool ok = false;
    const QStandardPaths::LocateOptions options = locateOptions(option, &ok, Q_FUNC_INFO);
    if (!ok || !location(type, &standardLocation, Q_FUNC_INFO))
        return QStringList();
    return QStandardPaths::locateAll(standardLocation, fileName, options);
}

QStringList StandardPaths::locateAll(const QVariant &type, const QString &fileName) const
{
    return locateAll(type, fileName, QVariant());
}

QString StandardPaths::findExecutable(const QString &executableName, const QStringList &paths) const
{
    if (executableName.isEmpty())
        return QString();
    return QStandardPaths::findExecutable(executableName, paths);
}

QString StandardPaths::findExecutable(const QString &executableName) const
{
    return findExecutable(executableName, QStringList());
}
