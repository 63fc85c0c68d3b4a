#ifndef APPUTILSLINUX_H
#define APPUTILSLINUX_H

#include "AppUtilsPrivate.h"

// Linux services: DMI data from sysfs, /proc/cpuinfo, desktop entries,
// executables on PATH, and xdg-open.
class AppUtilsLinux : public AppUtilsPrivate
{
    Q_OBJECT

public:
    explicit AppUtilsLinux(QObject *parent = nullptr);

    QString osName() const override;
    bool openUrlExternally(const QUrl &url) override;
    bool isAppInstalled(const QString &appIdentifier) const override;
    QString model() const override;
    QString manufacturer() const override;
    QString family() const override;
    QVariantMap processorInformation() const override;

    // Paths are parameters so that tests can point them at fixtures.
    static QString readDmiValue(const QString &dmiFolder, const QString &name);
    static QVariantMap parseCpuInfo(const QByteArray &cpuInfo);
    static bool isDesktopEntryInstalled(const QString &appIdentifier, const QStringList &applicationFolders);

private:
    QString m_dmiFolder;
};

#endif // APPUTILSLINUX_H
