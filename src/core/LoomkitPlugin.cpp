#include "LoomkitPlugin.h"
#include "Environment.h"
#include "ExifInfo.h"
#include "File.h"
#include "FileFolder.h"
#include "FileInfo.h"
#include "ImageAttributes.h"
#include "Loomkit.h"
#include "LoomkitError.h"
#include "LoomkitLogging.h"
#include "LoomkitObject.h"
#include "StandardPaths.h"
#include "StorageInfo.h"

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
    registerUncreatable<Environment>(uri, "Environment", "The Orvane type Environment is not creatable");
    qmlRegisterType<File>(uri, 1, 0, "File");
    qmlRegisterType<FileInfo>(uri, 1, 0, "FileInfo");
    qmlRegisterType<FileFolder>(uri, 1, 0, "FileFolder");
    qmlRegisterType<ExifInfo>(uri, 1, 0, "ExifInfo");
    qmlRegisterType<ImageAttributes>(uri, 1, 0, "ImageAttributes");
    qmlRegisterType<StorageInfo>(uri, 1, 0, "StorageInfo");
    registerUncreatable<StandardPaths>(uri, "StandardPaths", "The Orvane type StandardPaths is not creatable");
    qRegisterMetaType<StorageInfo::StorageType>("StorageInfo::StorageType");
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
