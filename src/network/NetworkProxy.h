#ifndef NETWORKPROXY_H
#define NETWORKPROXY_H

#include "LoomkitObject.h"

#include <QNetworkProxy>
#include <QUrl>

// Edits the process-wide proxy. It keeps nothing of its own: every read
// asks QNetworkProxy and QNetworkProxyFactory.
class NetworkProxy : public LoomkitObject
{
    Q_OBJECT

    Q_PROPERTY(ProxyType type READ type WRITE setType NOTIFY typeChanged)
    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY urlChanged)
    Q_PROPERTY(bool useSystemProxy READ useSystemProxy WRITE setUseSystemProxy NOTIFY useSystemProxyChanged)

public:
    enum ProxyType {
        DefaultProxy = QNetworkProxy::DefaultProxy,
        Socks5Proxy = QNetworkProxy::Socks5Proxy,
        NoProxy = QNetworkProxy::NoProxy,
        HttpProxy = QNetworkProxy::HttpProxy,
        HttpCachingProxy = QNetworkProxy::HttpCachingProxy,
        FtpCachingProxy = QNetworkProxy::FtpCachingProxy
    };
    Q_ENUM(ProxyType)

    explicit NetworkProxy(QObject *parent = nullptr);

    ProxyType type() const;
    void setType(ProxyType type);
    QUrl url() const;
    void setUrl(const QUrl &url);
    bool useSystemProxy() const;
    void setUseSystemProxy(bool useSystemProxy);

    // The endpoint whose system proxy stands for "the" proxy.
    static QUrl defaultPortalEndpoint();
    static QNetworkProxy currentProxy();

signals:
    void typeChanged();
    void urlChanged();
    void useSystemProxyChanged();
};

#endif // NETWORKPROXY_H
