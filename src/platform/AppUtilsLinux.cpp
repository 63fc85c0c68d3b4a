#include "AppUtilsLinux.h"
#include "LoomkitLogging.h"

#include <QDesktopServices>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStandardPaths>
#include <QThread>

#include <unistd.h>

AppUtilsLinux::AppUtilsLinux(QObject *parent)
    : AppUtilsPrivate(parent)
    , m_dmiFolder(QStringLiteral("/sys/class/dmi/id"))
{
}

QString AppUtilsLinux::osName() const
{
    return QStringLiteral("Linux");
}

bool AppUtilsLinux::openUrlExternally(const QUrl &url)
{
    if (!url.isValid()) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Invalid url:" << url;
        return false;
    }
    // Goes through the platform theme, which uses xdg-open or the portal.
    return QDesktopServices::openUrl(url);
}

QString AppUtilsLinux::readDmiValue(const QString &dmiFolder, const QString &name)
{
    QFile file(dmiFolder + QLatin1Char('/') + name);
    if (!file.open(QIODevice::ReadOnly))
        return QString();
    // Some firmware pads these with blanks or NULs.
    QString value = QString::fromUtf8(file.read(4096));
    value.remove(QChar(0));
    return value.trimmed();
}

QString AppUtilsLinux::model() const
{
    return readDmiValue(m_dmiFolder, QStringLiteral("product_name"));
}

QString AppUtilsLinux::manufacturer() const
{
    return readDmiValue(m_dmiFolder, QStringLiteral("sys_vendor"));
}

QString AppUtilsLinux::family() const
{
    return readDmiValue(m_dmiFolder, QStringLiteral("product_family"));
}

QVariantMap AppUtilsLinux::parseCpuInfo(const QByteArray &cpuInfo)
{
    QVariantMap info;
    int processors = 0;
    const QList<QByteArray> lines = cpuInfo.split('\n');
    for (const QByteArray &line : lines) {
        const int colon = line.indexOf(':');
        if (colon < 0)
            continue;
        const QByteArray key = line.left(colon).trimmed();
        const QString value = QString::fromUtf8(line.mid(colon + 1).trimmed());
        if (key == "processor") {
            ++processors;
        } else if (processors <= 1) {
            // The first processor describes the machine; the others repeat it.
            if (key == "vendor_id" || key == "CPU implementer")
                info.insert(QStringLiteral("linuxProcessorVendor"), value);
            else if (key == "model name" || key == "Model")
                info.insert(QStringLiteral("linuxProcessorModelName"), value);
            else if (key == "cpu family" || key == "CPU architecture")
                info.insert(QStringLiteral("linuxProcessorFamily"), value.toInt());
            else if (key == "model" || key == "CPU part")
                info.insert(QStringLiteral("linuxProcessorModel"), value);
            else if (key == "stepping" || key == "CPU revision")
                info.insert(QStringLiteral("linuxProcessorRevision"), value.toInt());
        }
    }
    info.insert(QStringLiteral("linuxNumberOfProcessors"), processors);
    return info;
}

QVariantMap AppUtilsLinux::processorInformation() const
{
    QVariantMap info;
    QFile cpuInfo(QStringLiteral("/proc/cpuinfo"));
    if (cpuInfo.open(QIODevice::ReadOnly))
        info = parseCpuInfo(cpuInfo.readAll());
    if (info.value(QStringLiteral("linuxNumberOfProcessors")).toInt() <= 0)
        info.insert(QStringLiteral("linuxNumberOfProcessors"), QThread::idealThreadCount());
    info.insert(QStringLiteral("linuxProcessorArchitecture"), QSysInfo::currentCpuArchitecture());
    info.insert(QStringLiteral("linuxPageSize"), qlonglong(::sysconf(_SC_PAGESIZE)));
    return info;
}

bool AppUtilsLinux::isDesktopEntryInstalled(const QString &appIdentifier, const QStringList &applicationFolders)
{
    QString entry = appIdentifier;
    if (!entry.endsWith(QLatin1String(".desktop")))
        entry += QLatin1String(".desktop");
    for (const QString &folder : applicationFolders) {
        if (QFileInfo(QDir(folder).filePath(entry)).isFile())
            return true;
    }
    return false;
}

bool AppUtilsLinux::isAppInstalled(const QString &appIdentifier) const
{
    // An application is installed if it has a desktop entry of that id, or if
    // the name is an executable on PATH. URL schemes ("mailto:") count when a
    // handler is registered for them.
    QString identifier = appIdentifier.trimmed();
    if (identifier.isEmpty())
        return false;
    if (identifier.contains(QLatin1Char('/')))
        return QFileInfo(identifier).isExecutable() && QFileInfo(identifier).isFile();

    const QStringList applicationFolders = QStandardPaths::standardLocations(QStandardPaths::ApplicationsLocation);
    if (identifier.endsWith(QLatin1Char(':'))) {
        const QString mime = QLatin1String("x-scheme-handler/") + identifier.chopped(1);
        for (const QString &folder : applicationFolders) {
            QFile cache(QDir(folder).filePath(QStringLiteral("mimeinfo.cache")));
            if (cache.open(QIODevice::ReadOnly) && cache.readAll().contains((mime + QLatin1Char('=')).toUtf8()))
                return true;
        }
        return false;
    }

    if (isDesktopEntryInstalled(identifier, applicationFolders))
        return true;
    return !QStandardPaths::findExecutable(identifier).isEmpty();
}
