#include "NetworkProxy.h"
#include "LoomkitLogging.h"

#include <QNetworkProxyFactory>

NetworkProxy::NetworkProxy(QObject *parent)
    : LoomkitObject(parent)
{
}

QUrl NetworkProxy::defaultPortalEndpoint()
{
    return QUrl(QStringLiteral("https://portal.orvane.com"));
}

QNetworkProxy NetworkProxy::currentProxy()
{
    if (QNetworkProxyFactory::usesSystemConfiguration()) {
        const QList<QNetworkProxy> proxies =
            QNetworkProxyFactory::systemProxyForQuery(QNetworkProxyQuery(defaultPortalEndpoint()));
        return proxies.isEmpty() ? QNetworkProxy() : proxies.first();
    }
    return QNetworkProxy::applicationProxy();
}

NetworkProxy::ProxyType NetworkProxy::type() const
{
    return ProxyType(currentProxy().type());
}

void NetworkProxy::setType(ProxyType type)
{
    QNetworkProxy proxy = currentProxy();
    proxy.setType(QNetworkProxy::ProxyType(type));
    QNetworkProxyFactory::setUseSystemConfiguration(false);
    QNetworkProxy::setApplicationProxy(proxy);
    qCDebug(lcNetwork) << Q_FUNC_INFO << proxy;
    emit typeChanged();
}

QUrl NetworkProxy::url() const
{
    const QNetworkProxy proxy = currentProxy();
    if (proxy.type() != QNetworkProxy::HttpProxy)
        return QUrl();
    QUrl result;
    result.setScheme(QStringLiteral("http"));
    result.setHost(proxy.hostName());
    result.setPort(proxy.port());
    return result;
}

void NetworkProxy::setUrl(const QUrl &url)
{
    const QString host = url.host(QUrl::FullyDecoded);
    // No port reads as -1, which becomes 65535 as a 16-bit port.
    const int port = url.port(-1);
    QNetworkProxy proxy;
    if (!host.isEmpty() && port != 0)
        proxy = QNetworkProxy(QNetworkProxy::HttpProxy, host, quint16(port));
    else
        proxy = QNetworkProxy(QNetworkProxy::NoProxy);
    QNetworkProxyFactory::setUseSystemConfiguration(false);
    QNetworkProxy::setApplicationProxy(proxy);
    qCDebug(lcNetwork) << Q_FUNC_INFO << proxy;
    emit urlChanged();
}

bool NetworkProxy::useSystemProxy() const
{
    return QNetworkProxyFactory::usesSystemConfiguration();
}

void NetworkProxy::setUseSystemProxy(bool useSystemProxy)
{
    const bool oldSetting = QNetworkProxyFactory::usesSystemConfiguration();
    const QUrl oldUrl = url();
    QNetworkProxyFactory::setUseSystemConfiguration(useSystemProxy);
    if (oldSetting != QNetworkProxyFactory::usesSystemConfiguration())
        emit useSystemProxyChanged();
    if (url() != oldUrl)
        emit urlChanged();
}
