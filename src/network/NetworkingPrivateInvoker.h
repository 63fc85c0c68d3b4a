#ifndef NETWORKINGPRIVATEINVOKER_H
#define NETWORKINGPRIVATEINVOKER_H

#include <QNetworkConfiguration>
#include <QObject>
#include <QPointer>
#include <QUrl>

QT_WARNING_PUSH
QT_WARNING_DISABLE_DEPRECATED

// Reaches the host's network service by name, so that nothing here depends
// on its type or its thread. Its signals relay the service's.
class NetworkingPrivateInvoker : public QObject
{
    Q_OBJECT

public:
    explicit NetworkingPrivateInvoker(QObject *parent = nullptr);

    QObject *target() const;
    void setTarget(QObject *target);

    QNetworkConfiguration queryDefaultConfiguration();
    void setRequestUrl(const QUrl &url);

signals:
    void requestUrlChanged();
    void proxyChanged();
    void useSystemProxyChanged();
    void allConfigurationsChanged();
    void defaultConfigurationChanged();
    void accessCacheClearing();
    void accessCacheCleared();

private:
    void connectTarget(bool connectIt);

    // Not owned; guarded so that a service that dies does not leave us dangling.
    QPointer<QObject> m_target;
};

QT_WARNING_POP

#endif // NETWORKINGPRIVATEINVOKER_H
