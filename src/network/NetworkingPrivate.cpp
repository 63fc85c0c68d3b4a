#include "NetworkingPrivate.h"
#include "LoomkitLogging.h"

#include <QGuiApplication>
#include <QNetworkConfigurationManager>
#include <QNetworkProxyFactory>

QT_WARNING_DISABLE_DEPRECATED

const char *const NetworkingPrivate::propertyName = "Orvane.Quorlo.Networking.Private";

NetworkingPrivate::NetworkingPrivate(QObject *parent)
    : QObject(parent)
    , m_useSystemProxy(QNetworkProxyFactory::usesSystemConfiguration())
{
    qRegisterMetaType<QNetworkConfiguration>();
    qRegisterMetaType<QList<QNetworkConfiguration>>();
    qRegisterMetaType<QNetworkProxy>();

    // The manager only feeds the slots; the state kept is ours.
    auto *manager = new QNetworkConfigurationManager(this);
    connect(manager, &QNetworkConfigurationManager::configurationAdded, this, &NetworkingPrivate::onConfigurationAdded);
    connect(manager, &QNetworkConfigurationManager::configurationRemoved, this, &NetworkingPrivate::onConfigurationRemoved);
    connect(manager, &QNetworkConfigurationManager::configurationChanged, this, &NetworkingPrivate::onConfigurationChanged);
    connect(manager, &QNetworkConfigurationManager::updateCompleted, this, &NetworkingPrivate::onUpdateCompleted);
    if (auto *app = qobject_cast<QGuiApplication *>(QCoreApplication::instance()))
        connect(app, &QGuiApplication::applicationStateChanged, this, &NetworkingPrivate::onApplicationStateChanged);

    refreshConfigurations();
    updateProxy();
}

NetworkingPrivate *NetworkingPrivate::publish()
{
    QCoreApplication *app = QCoreApplication::instance();
    if (!app)
        return nullptr;
    auto *service = new NetworkingPrivate(app);
    app->setProperty(propertyName, QVariant::fromValue<QObject *>(service));
    return service;
}

void NetworkingPrivate::updateAllConfigurations()
{
    QNetworkConfigurationManager manager;
    const QList<QNetworkConfiguration> configurations = manager.allConfigurations();
    setAllConfigurations(configurations);
}

void NetworkingPrivate::updateDefaultConfiguration()
{
    QNetworkConfigurationManager manager;
    setDefaultConfiguration(manager.defaultConfiguration());
}

void NetworkingPrivate::updateProxy()
{
    QNetworkProxy proxy;
    if (!m_useSystemProxy) {
        proxy = QNetworkProxy::applicationProxy();
    } else {
        const QList<QNetworkProxy> proxies =
            QNetworkProxyFactory::systemProxyForQuery(QNetworkProxyQuery(m_requestUrl, QNetworkProxyQuery::UrlRequest));
        if (!proxies.isEmpty())
            proxy = proxies.first();
        if (proxy.type() == QNetworkProxy::HttpProxy && proxy.hostName().isEmpty())
            proxy = QNetworkProxy(QNetworkProxy::NoProxy);
    }
    setProxy(proxy);
}

QNetworkProxy NetworkingPrivate::queryProxy() const
{
    return m_proxy;
}

void NetworkingPrivate::setProxy(const QNetworkProxy &proxy)
{
    if (proxy == m_proxy)
        return;
    m_proxy = proxy;
    emit proxyChanged();
}

QUrl NetworkingPrivate::queryRequestUrl() const
{
    return m_requestUrl;
}

void NetworkingPrivate::setRequestUrl(const QUrl &url)
{
    m_requestUrl = url;
    emit requestUrlChanged();
    updateProxy();
}

bool NetworkingPrivate::queryUseSystemProxy() const
{
    return m_useSystemProxy;
}

void NetworkingPrivate::setUseSystemProxy(bool useSystemProxy)
{
    m_useSystemProxy = useSystemProxy;
    emit useSystemProxyChanged();
    updateProxy();
}

QList<QNetworkConfiguration> NetworkingPrivate::queryAllConfigurations() const
{
    return m_allConfigurations;
}

void NetworkingPrivate::setAllConfigurations(const QList<QNetworkConfiguration> &configurations)
{
    if (configurations == m_allConfigurations)
        return;
    m_allConfigurations = configurations;
    emit allConfigurationsChanged();
}

QNetworkConfiguration NetworkingPrivate::queryDefaultConfiguration() const
{
    return m_defaultConfiguration;
}

void NetworkingPrivate::setDefaultConfiguration(const QNetworkConfiguration &configuration)
{
    if (configuration == m_defaultConfiguration)
        return;
    m_defaultConfiguration = configuration;
    emit defaultConfigurationChanged();
}

void NetworkingPrivate::emitAccessCacheClearing()
{
    emit accessCacheClearing();
}

void NetworkingPrivate::emitAccessCacheCleared()
{
    emit accessCacheCleared();
}

void NetworkingPrivate::refreshConfigurations()
{
    updateAllConfigurations();
    updateDefaultConfiguration();
}

void NetworkingPrivate::onApplicationStateChanged(Qt::ApplicationState state)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << state;
    updateProxy();
    refreshConfigurations();
}

void NetworkingPrivate::onConfigurationAdded(const QNetworkConfiguration &config)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << config.name();
    refreshConfigurations();
}

void NetworkingPrivate::onConfigurationRemoved(const QNetworkConfiguration &config)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << config.name();
    refreshConfigurations();
}

void NetworkingPrivate::onConfigurationChanged(const QNetworkConfiguration &config)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << config.name();
    refreshConfigurations();
}

void NetworkingPrivate::onUpdateCompleted()
{
    refreshConfigurations();
}
