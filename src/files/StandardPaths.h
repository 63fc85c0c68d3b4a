#ifndef STANDARDPATHS_H
#define STANDARDPATHS_H

#include "LoomkitObject.h"

#include <QStandardPaths>
#include <QStringList>
#include <QUrl>
#include <QVariant>

// The platform's standard locations, for QML. A location may be given as
// a StandardLocation value or by its name, in any case.
class StandardPaths : public LoomkitObject
{
    Q_OBJECT

public:
    enum StandardLocation {
        DesktopLocation = QStandardPaths::DesktopLocation,
        DocumentsLocation = QStandardPaths::DocumentsLocation,
        FontsLocation = QStandardPaths::FontsLocation,
        ApplicationsLocation = QStandardPaths::ApplicationsLocation,
        MusicLocation = QStandardPaths::MusicLocation,
        MoviesLocation = QStandardPaths::MoviesLocation,
        PicturesLocation = QStandardPaths::PicturesLocation,
        TempLocation = QStandardPaths::TempLocation,
        HomeLocation = QStandardPaths::HomeLocation,
        CacheLocation = QStandardPaths::CacheLocation,
        GenericDataLocation = QStandardPaths::GenericDataLocation,
        RuntimeLocation = QStandardPaths::RuntimeLocation,
        ConfigLocation = QStandardPaths::ConfigLocation,
        DownloadLocation = QStandardPaths::DownloadLocation,
        GenericCacheLocation = QStandardPaths::GenericCacheLocation,
        GenericConfigLocation = QStandardPaths::GenericConfigLocation,
        AppDataLocation = QStandardPaths::AppDataLocation,
        AppConfigLocation = QStandardPaths::AppConfigLocation,
        AppLocalDataLocation = QStandardPaths::AppLocalDataLocation
    };
    Q_ENUM(StandardLocation)

    enum LocateOption {
        LocateFile = QStandardPaths::LocateFile,
        LocateDirectory = QStandardPaths::LocateDirectory
    };
    Q_ENUM(LocateOption)

    explicit StandardPaths(QObject *parent = nullptr);

    Q_INVOKABLE QString writableLocation(const QVariant &type) const;
    Q_INVOKABLE QUrl writableLocationUrl(const QVariant &type) const;
    Q_INVOKABLE QStringList standardLocations(const QVariant &type) const;
    Q_INVOKABLE QString displayName(const QVariant &type) const;
    Q_INVOKABLE QString locate(const QVariant &type, const QString &fileName, const QVariant &option) const;
    Q_INVOKABLE QString locate(const QVariant &type, const QString &fileName) const;
    Q_INVOKABLE QStringList locateAll(const QVariant &type, const QString &fileName, const QVariant &option) const;
    Q_INVOKABLE QStringList locateAll(const QVariant &type, const QString &fileName) const;
    Q_INVOKABLE QString findExecutable(const QString &executableName, const QStringList &paths) const;
    Q_INVOKABLE QString findExecutable(const QString &executableName) const;

private:
    static bool location(const QVariant &type, QStandardPaths::StandardLocation *result, const char *function);
    static QStandardPaths::LocateOptions locateOptions(const QVariant &option, bool *ok, const char *function);
};

#endif // STANDARDPATHS_H
