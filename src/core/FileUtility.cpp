#include "FileUtility.h"
#include "LoomkitLogging.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QSettings>
#include <QStandardPaths>

#include <cerrno>
#include <utime.h>

namespace {

const QLatin1String kPropertyPrefix("Orvane/Runtime/pathVariables.");
const QLatin1String kSettingsGroup("Orvane/Runtime/pathVariables");
const QLatin1String kHome("HOME");
const QLatin1String kTemp("TEMP");

QVariant applicationProperty(const QByteArray &name)
{
    QCoreApplication *app = QCoreApplication::instance();
    return app ? app->property(name.constData()) : QVariant();
}

} // namespace

QByteArray FileUtility::propertyName(const QString &name)
{
    return QString(kPropertyPrefix + name).toUtf8();
}

QString FileUtility::settingsValue(const QString &name)
{
    QSettings settings;
    settings.beginGroup(kSettingsGroup);
    return settings.value(name).toString().trimmed();
}

QString FileUtility::resolvedPath(const QString &path, bool useEnvironment)
{
    if (QFile::exists(path))
        return path;
    if (path.startsWith(QLatin1String("content:")))
        return path;

    const bool tilde = path.startsWith(QLatin1Char('~'));
    if (!tilde && !path.startsWith(QLatin1Char('$')))
        return path;

    int separator = path.indexOf(QLatin1Char('/'));
    if (separator < 0)
        separator = path.indexOf(QLatin1Char('\\'));

    QString name;
    int end;
    if (separator < 0) {
        name = path.mid(1);
        end = path.size();
        if (name.isEmpty() && tilde)
            name = kHome;
    } else if (separator >= 2) {
        name = path.mid(1, separator - 1);
        end = separator;
    } else {
        end = 1;
        if (tilde)
            name = kHome;
    }

    QString value;
    if (!name.isEmpty()) {
        value = pathVariable(name, QString(), useEnvironment);
        if (pathVariableOrigin(name, useEnvironment) == PathVariableOriginNone)
            qCWarning(lcRuntimeUtility) << Q_FUNC_INFO << "Nonexistent Path variable" << name;
    } else {
        qCWarning(lcRuntimeUtility) << Q_FUNC_INFO << "Path variable name not specified";
    }

    QString result = path;
    result.replace(0, end, value);
    return result;
}

QString FileUtility::resolvedPath(const QUrl &url, bool useEnvironment)
{
    const QString scheme = url.scheme();
    if (scheme == QLatin1String("qrc"))
        return QLatin1Char(':') + url.path(QUrl::FullyDecoded);
    if (scheme == QLatin1String("content") || scheme == QLatin1String("assets-library"))
        return url.toString();
    if (url.isLocalFile())
        return resolvedPath(url.toLocalFile(), useEnvironment);

    const QString path = url.path(QUrl::FullyDecoded);
    if (path.isEmpty())
        return QString();
    return resolvedPath(path, useEnvironment);
}

QUrl FileUtility::resolvedPathUrl(const QString &path, bool useEnvironment)
{
    return pathUrl(resolvedPath(path, useEnvironment));
}

QUrl FileUtility::pathUrl(const QString &path)
{
    const QFileInfo fileInfo(path);
    if (fileInfo.exists()) {
        if (!fileInfo.isNativePath())
            return qrcUrl(path);
    } else if (path.startsWith(QLatin1String(":/"))) {
        return qrcUrl(path);
    }
    return QUrl::fromLocalFile(path);
}

QUrl FileUtility::qrcUrl(const QString &path)
{
    return QUrl(QLatin1String("qrc") + QLatin1String(":///") + path.mid(2), QUrl::TolerantMode);
}

QString FileUtility::pathVariable(const QString &name, const QString &defaultValue, bool useEnvironment)
{
    if (name.isEmpty()) {
        qCWarning(lcRuntimeUtility) << Q_FUNC_INFO << "Empty name";
        return defaultValue;
    }

    QString value;
    const QVariant property = applicationProperty(propertyName(name));
    if (property.isValid() && !property.isNull())
        value = property.toString();

    if (useEnvironment) {
        if (value.isEmpty())
            value = settingsValue(name);
        if (value.isEmpty()) {
            const QByteArray environment = qgetenv(name.toUtf8().constData());
            if (!environment.isEmpty())
                value = QString::fromUtf8(environment);
        }
    }

    if (value.isEmpty()) {
        QString builtIn;
        if (name == kHome)
            builtIn = QDir::homePath();
        else if (name == kTemp)
            builtIn = QDir::tempPath();
        if (!builtIn.isEmpty()) {
            qCDebug(lcRuntimeUtility) << Q_FUNC_INFO << "Setting default" << name << builtIn;
            setPathVariable(name, builtIn);
            value = builtIn;
        }
    }

    return value;
}

void FileUtility::setPathVariable(const QString &name, const QString &value)
{
    if (name.isEmpty()) {
        qCWarning(lcRuntimeUtility) << Q_FUNC_INFO << "Empty name, value=" << value;
        return;
    }
    QCoreApplication *app = QCoreApplication::instance();
    if (!app)
        return;
    app->setProperty(propertyName(name).constData(), value.isEmpty() ? QVariant() : QVariant(value));
}

FileUtility::PathVariableOrigin FileUtility::pathVariableOrigin(const QString &name, bool useEnvironment)
{
    const QVariant property = applicationProperty(propertyName(name));
    if (property.isValid() && !property.isNull())
        return PathVariableOriginApplicationProperty;
    if (!useEnvironment)
        return PathVariableOriginNone;
    if (!settingsValue(name).isEmpty())
        return PathVariableOriginSettings;
    if (!qgetenv(name.toUtf8().constData()).isEmpty())
        return PathVariableOriginEnvironment;
    return PathVariableOriginNone;
}

QString FileUtility::homePath()
{
    return pathVariable(kHome, QString(), true);
}

bool FileUtility::setHomePath(const QString &path)
{
    setPathVariable(kHome, path);
    return QFileInfo(path).exists();
}

QStringList FileUtility::homePaths()
{
    return QStringList { pathVariable(kHome, QString(), true) };
}

QStringList FileUtility::appDataLocations()
{
    return QStandardPaths::standardLocations(QStandardPaths::AppLocalDataLocation);
}

bool FileUtility::makePath(const QDir &dir)
{
    if (dir.exists())
        return true;
    const QString parent = QFileInfo(dir.path()).path();
    return QDir(parent).mkpath(dir.dirName());
}

bool FileUtility::makeFolder(const QString &folderPath)
{
    const QDir dir(folderPath);
    if (dir.exists())
        return true;
    const QString parent = QFileInfo(dir.path()).path();
    return QDir(parent).mkpath(dir.dirName());
}

void FileUtility::setHidden(const QString &path, bool hidden)
{
    // On Linux a file is hidden by its leading dot, which is part of its name:
    // there is no attribute to set or clear.
    Q_UNUSED(path)
    Q_UNUSED(hidden)
}

bool FileUtility::setDateTime(const QString &path, const QDateTime &accessed, const QDateTime &modified)
{
    struct utimbuf times;
    times.actime = time_t(accessed.toSecsSinceEpoch());
    times.modtime = time_t(modified.toSecsSinceEpoch());
    if (::utime(QFile::encodeName(path).constData(), &times) == 0)
        return true;

    const int error = errno;
    qCWarning(lcRuntimeUtility) << Q_FUNC_INFO << "error:" << error << "file:" << path
                                << "times:" << accessed << modified;
    return false;
}
