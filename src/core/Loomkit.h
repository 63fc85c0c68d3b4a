#ifndef LOOMKIT_H
#define LOOMKIT_H

#include <QColor>
#include <QDir>
#include <QJSValue>
#include <QObject>
#include <QRect>
#include <QStringList>
#include <QUrl>
#include <QVariant>
#include <QVariantMap>

#include "Environment.h"
#include "File.h"
#include "FileFolder.h"
#include "FileInfo.h"
#include "StandardPaths.h"

class QQmlEngine;
class QQuickItem;
class QQuickWindow;
class QImage;
class AppUtilsPrivate;

// The module's one QML singleton, shared by every engine of the process.
class Loomkit : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QString userHomePath READ userHomePath WRITE setUserHomePath NOTIFY userHomePathChanged)
    Q_PROPERTY(QString offlineStoragePath READ offlineStoragePath WRITE setOfflineStoragePath NOTIFY offlineStoragePathChanged)
    Q_PROPERTY(QString version READ version CONSTANT)
    Q_PROPERTY(QString sslLibraryVersion READ sslLibraryVersion CONSTANT)
    Q_PROPERTY(QString sslLibraryBuildVersion READ sslLibraryBuildVersion CONSTANT)
    Q_PROPERTY(QString osName READ osName CONSTANT)
    Q_PROPERTY(QString osDisplayName READ osDisplayName CONSTANT)
    Q_PROPERTY(QString osVersion READ osVersion CONSTANT)
    Q_PROPERTY(QString kernelType READ kernelType CONSTANT)
    Q_PROPERTY(QString kernelVersion READ kernelVersion CONSTANT)
    Q_PROPERTY(QString qtVersion READ qtVersion CONSTANT)
    Q_PROPERTY(QString buildAbi READ buildAbi CONSTANT)
    Q_PROPERTY(QString buildCpuArchitecture READ buildCpuArchitecture CONSTANT)
    Q_PROPERTY(QString currentCpuArchitecture READ currentCpuArchitecture CONSTANT)
    Q_PROPERTY(QVariantMap systemInformation READ systemInformation CONSTANT)
    Q_PROPERTY(double displayScaleFactor READ displayScaleFactor WRITE setDisplayScaleFactor NOTIFY displayScaleFactorChanged)
    Q_PROPERTY(QStringList importPathList READ importPathList WRITE setImportPathList NOTIFY importPathListChanged)
    Q_PROPERTY(QString defaultLocale READ defaultLocale WRITE setDefaultLocale NOTIFY defaultLocaleChanged)
    Q_PROPERTY(QStringList availableLocaleNames READ availableLocaleNames CONSTANT)
    Q_PROPERTY(QString systemLocale READ systemLocale CONSTANT)

    // Files, folders, storage and the environment
    Q_PROPERTY(FileFolder *userHomeFolder READ userHomeFolder NOTIFY userHomePathChanged)
    Q_PROPERTY(FileFolder *temporaryFolder READ temporaryFolder CONSTANT)
    Q_PROPERTY(StandardPaths *standardPaths READ standardPaths CONSTANT)
    Q_PROPERTY(Environment *environment READ environment CONSTANT)

public:
    explicit Loomkit(QObject *parent = nullptr);
    ~Loomkit() override;

    static Loomkit *instance(QQmlEngine *engine);

    QString userHomePath();
    void setUserHomePath(const QString &path);
    QString offlineStoragePath() const;
    void setOfflineStoragePath(const QString &path);
    QString version() const;
    QString sslLibraryVersion() const;
    QString sslLibraryBuildVersion() const;
    QString osName() const;
    QString osDisplayName() const;
    QString osVersion() const;
    QString kernelType() const;
    QString kernelVersion() const;
    QString qtVersion() const;
    QString buildAbi() const;
    QString buildCpuArchitecture() const;
    QString currentCpuArchitecture() const;
    QVariantMap systemInformation() const;
    double displayScaleFactor() const;
    void setDisplayScaleFactor(double factor);
    QStringList importPathList() const;
    void setImportPathList(const QStringList &list);
    QString defaultLocale() const;
    void setDefaultLocale(const QString &name);
    QStringList availableLocaleNames();
    QString systemLocale() const;

    Q_INVOKABLE QString resolvedPath(const QString &path);
    Q_INVOKABLE QString resolvedPath(const QUrl &pathUrl);
    Q_INVOKABLE QUrl resolvedPathUrl(const QString &pathUrl);
    Q_INVOKABLE QString pathVariable(const QString &name);
    Q_INVOKABLE void setPathVariable(const QString &name, const QString &value);
    Q_INVOKABLE QUrl resolvedUrl(const QUrl &url);
    Q_INVOKABLE bool openUrlExternally(const QUrl &url);
    Q_INVOKABLE QColor contrastColor(const QColor &color, const QColor &tintColor);
    Q_INVOKABLE QColor contrastColor(const QColor &color);
    Q_INVOKABLE QColor alphaColor(const QColor &color, double alpha);
    Q_INVOKABLE QString createId();
    Q_INVOKABLE QString createUuidString(int format);
    Q_INVOKABLE QString createUuidString();
    Q_INVOKABLE void clearComponentCache();
    Q_INVOKABLE void trimComponentCache();
    Q_INVOKABLE void addImportPath(const QString &path);
    Q_INVOKABLE void removeImportPath(const QString &path);
    Q_INVOKABLE void collectGarbage();
    Q_INVOKABLE QString typeOf(const QJSValue &value, bool displayName);
    Q_INVOKABLE QString typeOf(const QJSValue &value);
    Q_INVOKABLE bool instanceOf(const QJSValue &value, const QJSValue &type);
    Q_INVOKABLE bool grabWindowToClipboard(const QRect &rect);
    Q_INVOKABLE bool grabWindowToClipboard();
    Q_INVOKABLE bool grabWindowToFile(const QString &path, const QRect &rect);
    Q_INVOKABLE bool grabWindowToFile(const QString &path);
    Q_INVOKABLE QString objectToString(QObject *object);
    Q_INVOKABLE void loadTranslator(const QJSValue &translations, const QString &appFolderPath,
                                    const QString &locale = QString(), bool retranslate = true);
    Q_INVOKABLE void sendKey(const QJSValue &key, QQuickItem *item);
    Q_INVOKABLE void sendKey(const QJSValue &key);
    Q_INVOKABLE void sendStandardKey(const QJSValue &key, QQuickItem *item);
    Q_INVOKABLE void sendStandardKey(const QJSValue &key);
    Q_INVOKABLE bool isAppInstalled(const QString &appIdentifier);
    Q_INVOKABLE bool isAppInstalled(const QStringList &appIdentifierValues);

    // Files, folders, storage and the environment
    FileFolder *userHomeFolder();
    FileFolder *temporaryFolder() const;
    StandardPaths *standardPaths();
    Environment *environment();
    Q_INVOKABLE File *file(const QString &path);
    Q_INVOKABLE File *file(const QUrl &pathUrl);
    Q_INVOKABLE FileFolder *fileFolder(const QString &path);
    Q_INVOKABLE FileFolder *fileFolder(const QUrl &pathUrl);
    Q_INVOKABLE FileInfo *fileInfo(const QString &path);
    Q_INVOKABLE FileInfo *fileInfo(const QUrl &pathUrl);

signals:
    void userHomePathChanged();
    void offlineStoragePathChanged();
    void displayScaleFactorChanged();
    void onlineStateChanged(bool online);
    void importPathListChanged();
    void defaultLocaleChanged();

private slots:
    void onLogicalDotsPerInchChanged(double dpi);

private:
    QQmlEngine *engine() const;
    QQuickWindow *window() const;
    QImage grabWindowImage(const QRect &rect) const;
    QQuickItem *keyTarget(QQuickItem *item, const char *function, const QJSValue &key) const;
    static void sendKeyPressAndRelease(QQuickItem *item, int key, int modifiers, const QString &text);

    QDir m_userHome;
    double m_displayScaleFactor = 0;
    QStringList m_availableLocaleNames;
    AppUtilsPrivate *m_appUtils = nullptr;
    Environment *m_environment = nullptr;
    StandardPaths *m_standardPaths = nullptr;
};

#endif // LOOMKIT_H
