#ifndef FILEUTILITY_H
#define FILEUTILITY_H

#include <QDateTime>
#include <QDir>
#include <QString>
#include <QStringList>
#include <QUrl>

// Turns what QML writes for a location (~/x, $NAME/x, qrc:, file: URLs)
// into a path on disk, and keeps the path variables.
class FileUtility
{
public:
    enum PathVariableOrigin : qint32 {
        PathVariableOriginNone = 0,
        PathVariableOriginApplicationProperty = 1,
        PathVariableOriginSettings = 2,
        PathVariableOriginEnvironment = 3
    };

    static QString resolvedPath(const QString &path, bool useEnvironment = true);
    static QString resolvedPath(const QUrl &url, bool useEnvironment = true);
    static QUrl resolvedPathUrl(const QString &path, bool useEnvironment = true);
    static QUrl pathUrl(const QString &path);
    static QUrl qrcUrl(const QString &path);

    static QString pathVariable(const QString &name, const QString &defaultValue = QString(), bool useEnvironment = true);
    static void setPathVariable(const QString &name, const QString &value);
    static PathVariableOrigin pathVariableOrigin(const QString &name, bool useEnvironment = true);

    static QString homePath();
    static bool setHomePath(const QString &path);
    static QStringList homePaths();
    static QStringList appDataLocations();

    static bool makePath(const QDir &dir);
    static bool makeFolder(const QString &folderPath);
    static void setHidden(const QString &path, bool hidden);
    static bool setDateTime(const QString &path, const QDateTime &accessed, const QDateTime &modified);

private:
    static QByteArray propertyName(const QString &name);
    static QString settingsValue(const QString &name);
};

#endif // FILEUTILITY_H
