#ifndef NETWORKINGPRIVATE_H
#define NETWORKINGPRIVATE_H

#include <QList>
#include <QNetworkConfiguration>
#include <QNetworkProxy>
#include <QObject>
#include <QUrl>

QT_WARNING_PUSH
QT_WARNING_DISABLE_DEPRECATED

// The host's network service: the effective proxy for one request URL and
// the configuration state. It may live on a thread of its own; requests
// reach it only by name, through NetworkingPrivateInvoker.
class NetworkingPrivate : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QUrl requestUrl READ queryRequestUrl WRITE setRequestUrl NOTIFY requestUrlChanged)
    Q_PROPERTY(QNetworkProxy proxy READ queryProxy WRITE setProxy NOTIFY proxyChanged)
    Q_PROPERTY(bool useSystemProxy READ queryUseSystemProxy WRITE setUseSystemProxy NOTIFY useSystemProxyChanged)
    Q_PROPERTY(QList<QNetworkConfiguration> allConfigurations READ queryAllConfigurations
               WRITE setAllConfigurations NOTIFY allConfigurationsChanged)

public:
    // Name of the application's dynamic property that publishes the service.
    static const char *const propertyName;

    explicit NetworkingPrivate(QObject *parent = nullptr);

    // Creates the service with the application as parent and publishes it.
    static NetworkingPrivate *publish();

    Q_INVOKABLE void updateAllConfigurations();
    Q_INVOKABLE void updateDefaultConfiguration();
    Q_INVOKABLE void updateProxy();
    Q_INVOKABLE QNetworkProxy queryProxy() const;
    Q_INVOKABLE void setProxy(const QNetworkProxy &proxy);
    Q_INVOKABLE QUrl queryRequestUrl() const;
    Q_INVOKABLE void setRequestUrl(const QUrl &url);
    Q_INVOKABLE bool queryUseSystemProxy() const;
    Q_INVOKABLE void setUseSystemProxy(bool useSystemProxy);
    Q_INVOKABLE QList<QNetworkConfiguration> queryAllConfigurations() const;
    Q_INVOKABLE void setAllConfigurations(const QList<QNetworkConfiguration> &configurations);
    Q_INVOKABLE QNetworkConfiguration queryDefaultConfiguration() const;
    Q_INVOKABLE void setDefaultConfiguration(const QNetworkConfiguration &configuration);
    Q_INVOKABLE void emitAccessCacheClearing();
    Q_INVOKABLE void emitAccessCacheCleared();

signals:
    void requestUrlChanged();
    void proxyChanged();
    void useSystemProxyChanged();
    void allConfigurationsChanged();
    void defaultConfigurationChanged();
    void accessCacheClearing();
    void accessCacheCleared();

protected slots:
    void onApplicationStateChanged(Qt::ApplicationState state);
    void onConfigurationAdded(const QNetworkConfiguration &config);
    void onConfigurationRemoved(const QNetworkConfiguration &config);
    void onConfigurationChanged(const QNetworkConfiguration &config);
    void onUpdateCompleted();

private:
    void refreshConfigurations();

    QUrl m_requestUrl;
    QNetworkProxy m_proxy;
    bool m_useSystemProxy = false;
    QList<QNetworkConfiguration> m_allConfigurations;
    QNetworkConfiguration m_defaultConfiguration;
};

QT_WARNING_POP

#endif // NETWORKINGPRIVATE_H
