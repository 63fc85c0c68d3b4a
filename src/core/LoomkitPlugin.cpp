#include "LoomkitPlugin.h"
#include "Loomkit.h"
#include "LoomkitError.h"
#include "LoomkitLogging.h"
#include "LoomkitObject.h"
// Networking (subsystem 4) and property sets (subsystem 2)
#include "AuthenticationChallenge.h"
#include "Network.h"
#include "NetworkProxy.h"
#include "NetworkRequest.h"
#include "NetworkRequestHeaders.h"
#include "PropertySet.h"
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

    qmlRegisterSingletonType<Loomkit>(uri, 1, 0, "Loomkit", &LoomkitPlugin::loomkitProvider);
    registerUncreatable<LoomkitObject>(uri, "LoomkitObject", "The Orvane type LoomkitObject is not creatable");
    registerUncreatable<LoomkitError>(uri, "LoomkitError", "The Orvane type LoomkitError is not creatable");
    // rows 13-16 and 19: networking
    registerUncreatable<Network>(uri, "Network", "The Orvane type Network is not creatable");
    registerUncreatable<NetworkProxy>(uri, "NetworkProxy", "The Orvane type NetworkProxy is not creatable");
    qmlRegisterType<NetworkRequest>(uri, 1, 0, "NetworkRequest");
    qmlRegisterType<NetworkRequestHeaders>(uri, 1, 0, "NetworkRequestHeaders");
    qmlRegisterType<AuthenticationChallenge>(uri, 1, 0, "AuthenticationChallenge");
    // row 38
    qmlRegisterType<PropertySet>(uri, 1, 0, "PropertySet");

    qmlRegisterType<ZipReader>(uri, 1, 0, "ZipReader");
    qmlRegisterType<ZipWriter>(uri, 1, 0, "ZipWriter");
    qmlRegisterType<ZipFileInfo>(uri, 1, 0, "ZipFileInfo");
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
