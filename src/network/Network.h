#ifndef NETWORK_H
#define NETWORK_H

#include "LoomkitObject.h"

#include <QNetworkConfigurationManager>
#include <QVariantList>
#include <QVariantMap>

class NetworkProxy;
class QHostAddress;
class QNetworkInterface;

QT_WARNING_PUSH
QT_WARNING_DISABLE_DEPRECATED

// The machine's network as QML sees it: configurations, addresses,
// interfaces and the application's proxy.
class Network : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(NetworkProxy *proxy READ proxy CONSTANT)
    Q_PROPERTY(bool isOnline READ isOnline NOTIFY onlineStateChanged)
    Q_PROPERTY(QVariantMap defaultConfiguration READ defaultConfiguration NOTIFY configurationChanged)
    Q_PROPERTY(QVariantList addresses READ addresses)
    Q_PROPERTY(QVariantList interfaces READ interfaces)

public:
    enum ConfigurationType {
        ConfigurationTypeInternetAccessPoint = QNetworkConfiguration::InternetAccessPoint,
        ConfigurationTypeServiceNetwork = QNetworkConfiguration::ServiceNetwork,
        ConfigurationTypeUserChoice = QNetworkConfiguration::UserChoice,
        ConfigurationTypeInvalid = QNetworkConfiguration::Invalid
    };
    Q_ENUM(ConfigurationType)

    enum ConfigurationPurpose {
        ConfigurationPurposeUnknown = QNetworkConfiguration::UnknownPurpose,
        ConfigurationPurposePublic = QNetworkConfiguration::PublicPurpose,
        ConfigurationPurposePrivate = QNetworkConfiguration::PrivatePurpose,
        ConfigurationPurposeServiceSpecific = QNetworkConfiguration::ServiceSpecificPurpose
    };
    Q_ENUM(ConfigurationPurpose)

    enum ConfigurationState {
        ConfigurationStateUndefined = QNetworkConfiguration::Undefined,
        ConfigurationStateDefined = QNetworkConfiguration::Defined,
        ConfigurationStateDiscovered = QNetworkConfiguration::Discovered,
        ConfigurationStateActive = QNetworkConfiguration::Active
    };
    Q_ENUM(ConfigurationState)

    enum BearerType {
        BearerUnknown = QNetworkConfiguration::BearerUnknown,
        BearerEthernet = QNetworkConfiguration::BearerEthernet,
        BearerWLAN = QNetworkConfiguration::BearerWLAN,
        Bearer2G = QNetworkConfiguration::Bearer2G,
        BearerCDMA2000 = QNetworkConfiguration::BearerCDMA2000,
        BearerWCDMA = QNetworkConfiguration::BearerWCDMA,
        BearerHSPA = QNetworkConfiguration::BearerHSPA,
        BearerBluetooth = QNetworkConfiguration::BearerBluetooth,
        BearerWiMAX = QNetworkConfiguration::BearerWiMAX,
        BearerEVDO = QNetworkConfiguration::BearerEVDO,
        BearerLTE = QNetworkConfiguration::BearerLTE,
        Bearer3G = QNetworkConfiguration::Bearer3G,
        Bearer4G = QNetworkConfiguration::Bearer4G
    };
    Q_ENUM(BearerType)

    enum NetworkLayerProtocol {
        ProtocolUnknown = -1,
        ProtocolIPv4 = 0,
        ProtocolIPv6 = 1,
        ProtocolAny = 2
    };
    Q_ENUM(NetworkLayerProtocol)

    explicit Network(QObject *parent = nullptr);

    NetworkProxy *proxy();
    bool isOnline() const;
    QVariantMap defaultConfiguration() const;
    QVariantList addresses() const;
    QVariantList interfaces() const;

    Q_INVOKABLE QVariantList getConfigurations(int filter);
    Q_INVOKABLE QVariantList getConfigurations();
    Q_INVOKABLE void updateConfigurations();

    static QVariantMap configurationToMap(const QNetworkConfiguration &configuration);
    static QVariantMap addressToMap(const QHostAddress &address);
    static QVariantMap interfaceToMap(const QNetworkInterface &networkInterface);

signals:
    void onlineStateChanged(bool online);
    void configurationAdded(const QVariantMap &configuration);
    void configurationChanged(const QVariantMap &configuration);
    void configurationRemoved(const QVariantMap &configuration);
    void updateCompleted();

private slots:
    void onConfigurationAdded(const QNetworkConfiguration &configuration);
    void onConfigurationChanged(const QNetworkConfiguration &configuration);
    void onConfigurationRemoved(const QNetworkConfiguration &configuration);
    void onApplicationStateChanged(Qt::ApplicationState state);

private:
    QNetworkConfigurationManager m_configurationManager;
    NetworkProxy *m_proxy = nullptr;
};

QT_WARNING_POP

#endif // NETWORK_H
