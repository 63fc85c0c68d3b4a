#include "Network.h"
#include "LoomkitLogging.h"
#include "NetworkProxy.h"

#include <QGuiApplication>
#include <QHostAddress>
#include <QNetworkInterface>

QT_WARNING_DISABLE_DEPRECATED

Network::Network(QObject *parent)
    : LoomkitObject(parent)
{
    connect(&m_configurationManager, &QNetworkConfigurationManager::configurationAdded,
            this, &Network::onConfigurationAdded);
    connect(&m_configurationManager, &QNetworkConfigurationManager::configurationChanged,
            this, &Network::onConfigurationChanged);
    connect(&m_configurationManager, &QNetworkConfigurationManager::configurationRemoved,
            this, &Network::onConfigurationRemoved);
    connect(&m_configurationManager, &QNetworkConfigurationManager::updateCompleted,
            this, &Network::updateCompleted);
    // The manager's own view of the link is passed on; isOnline stays true.
    connect(&m_configurationManager, &QNetworkConfigurationManager::onlineStateChanged,
            this, &Network::onlineStateChanged);
    if (auto *app = qobject_cast<QGuiApplication *>(QCoreApplication::instance()))
        connect(app, &QGuiApplication::applicationStateChanged, this, &Network::onApplicationStateChanged);
}

NetworkProxy *Network::proxy()
{
    if (!m_proxy)
        m_proxy = new NetworkProxy(this);
    return m_proxy;
}

bool Network::isOnline() const
{
    qCCritical(lcNetwork) << "*** DEPRECATED. Use Networking.isOnline instead. ***";
    return true;
}

QVariantMap Network::defaultConfiguration() const
{
    return configurationToMap(m_configurationManager.defaultConfiguration());
}

QVariantList Network::addresses() const
{
    QVariantList result;
    const QList<QHostAddress> all = QNetworkInterface::allAddresses();
    for (const QHostAddress &address : all)
        result.append(addressToMap(address));
    return result;
}

QVariantList Network::interfaces() const
{
    QVariantList result;
    const QList<QNetworkInterface> all = QNetworkInterface::allInterfaces();
    for (const QNetworkInterface &networkInterface : all)
        result.append(interfaceToMap(networkInterface));
    return result;
}

QVariantList Network::getConfigurations(int filter)
{
    QVariantList result;
    const QList<QNetworkConfiguration> all = m_configurationManager.allConfigurations(
        QNetworkConfiguration::StateFlags(filter));
    for (const QNetworkConfiguration &configuration : all)
        result.append(configurationToMap(configuration));
    return result;
}

QVariantList Network::getConfigurations()
{
    return getConfigurations(0);
}

void Network::updateConfigurations()
{
    m_configurationManager.updateConfigurations();
}

QVariantMap Network::configurationToMap(const QNetworkConfiguration &configuration)
{
    QVariantList children;
    const QList<QNetworkConfiguration> childList = configuration.children();
    for (const QNetworkConfiguration &child : childList)
        children.append(configurationToMap(child));

    QVariantMap map;
    map.insert(QStringLiteral("bearerType"), int(configuration.bearerType()));
    map.insert(QStringLiteral("bearerTypeFamily"), int(configuration.bearerTypeFamily()));
    map.insert(QStringLiteral("bearerTypeName"), configuration.bearerTypeName());
    map.insert(QStringLiteral("children"), children);
    map.insert(QStringLiteral("identifier"), configuration.identifier());
    map.insert(QStringLiteral("isRoamingAvailable"), configuration.isRoamingAvailable());
    map.insert(QStringLiteral("isValid"), configuration.isValid());
    map.insert(QStringLiteral("name"), configuration.name());
    map.insert(QStringLiteral("purpose"), int(configuration.purpose()));
    map.insert(QStringLiteral("state"), int(configuration.state()));
    map.insert(QStringLiteral("type"), int(configuration.type()));
    return map;
}

QVariantMap Network::addressToMap(const QHostAddress &address)
{
    QVariantMap map;
    map.insert(QStringLiteral("address"), address.toString());
    map.insert(QStringLiteral("isLoopback"), address.isLoopback());
    map.insert(QStringLiteral("scopeId"), address.scopeId());
    map.insert(QStringLiteral("protocol"), int(address.protocol()));
    return map;
}

QVariantMap Network::interfaceToMap(const QNetworkInterface &networkInterface)
{
    QVariantList entries;
    const QList<QNetworkAddressEntry> addressEntries = networkInterface.addressEntries();
    for (const QNetworkAddressEntry &entry : addressEntries) {
        QVariantMap entryMap;
        entryMap.insert(QStringLiteral("broadcast"), addressToMap(entry.broadcast()));
        entryMap.insert(QStringLiteral("ip"), addressToMap(entry.ip()));
        entryMap.insert(QStringLiteral("netmask"), addressToMap(entry.netmask()));
        entryMap.insert(QStringLiteral("prefixLength"), entry.prefixLength());
        entries.append(entryMap);
    }

    QVariantMap map;
    map.insert(QStringLiteral("isValid"), networkInterface.isValid());
    map.insert(QStringLiteral("name"), networkInterface.name());
    map.insert(QStringLiteral("hardwareAddress"), networkInterface.hardwareAddress());
    map.insert(QStringLiteral("humanReadableName"), networkInterface.humanReadableName());
    map.insert(QStringLiteral("addressEntries"), entries);
    return map;
}

void Network::onConfigurationAdded(const QNetworkConfiguration &configuration)
{
    emit configurationAdded(configurationToMap(configuration));
}

void Network::onConfigurationChanged(const QNetworkConfiguration &configuration)
{
    emit configurationChanged(configurationToMap(configuration));
}

void Network::onConfigurationRemoved(const QNetworkConfiguration &configuration)
{
    emit configurationRemoved(configurationToMap(configuration));
}

void Network::onApplicationStateChanged(Qt::ApplicationState state)
{
    // Configurations may have moved on while the application slept.
    qCDebug(lcNetwork) << Q_FUNC_INFO << state;
    if (state == Qt::ApplicationActive)
        m_configurationManager.updateConfigurations();
}
