#include "LoomkitPlugin.h"
#include "AuthenticationChallenge.h"
#include "BinaryData.h"
#include "CryptographicHash.h"
#include "Environment.h"
#include "ExifInfo.h"
#include "File.h"
#include "FileFolder.h"
#include "FileInfo.h"
#include "ImageAttributes.h"
#include "InputValidator.h"
#include "LocaleInfo.h"
#include "Loomkit.h"
#include "LoomkitError.h"
#include "LoomkitLogging.h"
#include "LoomkitObject.h"
#include "MessageAuthenticationCode.h"
#include "Network.h"
#include "NetworkProxy.h"
#include "NetworkRequest.h"
#include "NetworkRequestHeaders.h"
#include "PropertySet.h"
#include "Settings.h"
#include "SettingsBase.h"
#include "StandardPaths.h"
#include "StorageInfo.h"
#include "UrlInfo.h"
#include "Uuid.h"
#include "VersionNumber.h"
#include "ZipFileInfo.h"
#include "ZipReader.h"
#include "ZipWriter.h"

#include <QCoreApplication>
#include <QLocale>
#include <QNetworkProxyFactory>
#include <QQmlEngine>
#include <QTranslator>
#include <qqml.h>

static void initResources()
{
    // Registers the thumbnail's resource tree with the arguments of its
    // static initialiser, so that it is there even after an unregister.
    Q_INIT_RESOURCE(images);
}

namespace {

template <typename T>
void registerUncreatable(const char *uri, const char *qmlName, const char *message)
{
    qmlRegisterUncreatableType<T>(uri, 1, 0, qmlName, QLatin1String(message));
}

} // namespace

LoomkitPlugin::LoomkitPlugin(QObject *parent)
    : QQmlExtensionPlugin(parent)
{
}

QObject *LoomkitPlugin::loomkitProvider(QQmlEngine *engine, QJSEngine *scriptEngine)
{
    Q_UNUSED(scriptEngine)
    qCDebug(lcPlugin) << Q_FUNC_INFO;
    return Loomkit::instance(engine);
}

void LoomkitPlugin::registerTypes(const char *uri)
{
    qCDebug(lcPlugin) << Q_FUNC_INFO << uri;

    initResources();

    // The table of types, top to bottom. "Settings" is registered twice on
    // purpose: first the uncreatable base, then the creatable element.
    qmlRegisterSingletonType<Loomkit>(uri, 1, 0, "Loomkit", &LoomkitPlugin::loomkitProvider);
    registerUncreatable<LoomkitObject>(uri, "LoomkitObject", "The Orvane type LoomkitObject is not creatable");
    registerUncreatable<LoomkitError>(uri, "LoomkitError", "The Orvane type LoomkitError is not creatable");
    registerUncreatable<Environment>(uri, "Environment", "The Orvane type Environment is not creatable");
    registerUncreatable<SettingsBase>(uri, "Settings", "The Orvane type Settings is not creatable");
    registerUncreatable<Network>(uri, "Network", "The Orvane type Network is not creatable");
    registerUncreatable<NetworkProxy>(uri, "NetworkProxy", "The Orvane type NetworkProxy is not creatable");
    qmlRegisterType<NetworkRequest>(uri, 1, 0, "NetworkRequest");
    qmlRegisterType<NetworkRequestHeaders>(uri, 1, 0, "NetworkRequestHeaders");
    qmlRegisterType<CryptographicHash>(uri, 1, 0, "CryptographicHash");
    qmlRegisterType<MessageAuthenticationCode>(uri, 1, 0, "MessageAuthenticationCode");
    qmlRegisterType<AuthenticationChallenge>(uri, 1, 0, "AuthenticationChallenge");
    qmlRegisterType<UrlInfo>(uri, 1, 0, "UrlInfo");
    qmlRegisterType<LocaleInfo>(uri, 1, 0, "LocaleInfo");
    qmlRegisterType<File>(uri, 1, 0, "File");
    qmlRegisterType<FileInfo>(uri, 1, 0, "FileInfo");
    qmlRegisterType<FileFolder>(uri, 1, 0, "FileFolder");
    qmlRegisterType<Settings>(uri, 1, 0, "Settings");
    qmlRegisterType<ExifInfo>(uri, 1, 0, "ExifInfo");
    qmlRegisterType<ImageAttributes>(uri, 1, 0, "ImageAttributes");
    qmlRegisterType<StorageInfo>(uri, 1, 0, "StorageInfo");
    qmlRegisterType<ZipReader>(uri, 1, 0, "ZipReader");
    qmlRegisterType<ZipWriter>(uri, 1, 0, "ZipWriter");
    qmlRegisterType<ZipFileInfo>(uri, 1, 0, "ZipFileInfo");
    registerUncreatable<StandardPaths>(uri, "StandardPaths", "The Orvane type StandardPaths is not creatable");
    qRegisterMetaType<StorageInfo::StorageType>("StorageInfo::StorageType");
    qmlRegisterType<PropertySet>(uri, 1, 0, "PropertySet");
    qmlRegisterType<BinaryData>(uri, 1, 0, "BinaryData");
    qmlRegisterType<InputValidator>(uri, 1, 0, "InputValidator");
    qmlRegisterType<VersionNumber>(uri, 1, 0, "VersionNumber");
    Uuid::registerMetaType();
}

void LoomkitPlugin::initializeNetwork()
{
    qCDebug(lcPlugin) << Q_FUNC_INFO << "Using system network proxy configuration";
    QNetworkProxyFactory::setUseSystemConfiguration(true);
}

void LoomkitPlugin::initializeEngine(QQmlEngine *engine, const char *uri)
{
    qCDebug(lcPlugin) << Q_FUNC_INFO << uri;
    qCDebug(lcPlugin) << Q_FUNC_INFO << "Offline storage path:" << engine->offlineStoragePath();

    initializeNetwork();

    auto *translator = new QTranslator(engine);
    const QStringList uiLanguages = QLocale::system().uiLanguages();
    const QString name = QLocale(uiLanguages.isEmpty() ? QString() : uiLanguages.at(0)).name();
    if (translator->load(QLatin1String("LoomkitPlugin_") + name, QStringLiteral("://languages"),
                         QString(), QString())) {
        if (!QCoreApplication::installTranslator(translator))
            qCDebug(lcPlugin) << Q_FUNC_INFO << "installTranslator() Failed";
    }

    QQmlExtensionPlugin::initializeEngine(engine, uri);
}
