#include "NetworkProxy.h"

#include <QNetworkProxyFactory>
#include <QSignalSpy>
#include <QTest>

class tst_NetworkProxy : public QObject
{
    Q_OBJECT

private slots:
    void init()
    {
        // Setting an application proxy drops the system factory: in this order.
        QNetworkProxy::setApplicationProxy(QNetworkProxy(QNetworkProxy::DefaultProxy));
        QNetworkProxyFactory::setUseSystemConfiguration(true);
    }

    void urlSetsProxy_data()
    {
        QTest::addColumn<QUrl>("url");
        QTest::addColumn<QUrl>("readBack"); // empty: no proxy
        QTest::newRow("host and port") << QUrl("http://proxy.example:3128") << QUrl("http://proxy.example:3128");
        QTest::newRow("no port is 65535") << QUrl("http://proxy.example") << QUrl("http://proxy.example:65535");
        QTest::newRow("empty") << QUrl() << QUrl();
        QTest::newRow("port 0") << QUrl("http://proxy.example:0") << QUrl();
    }

    void urlSetsProxy()
    {
        QFETCH(QUrl, url);
        QFETCH(QUrl, readBack);
        NetworkProxy proxy;
        QSignalSpy urlSpy(&proxy, &NetworkProxy::urlChanged);
        proxy.setUrl(url);
        QCOMPARE(urlSpy.count(), 1);
        QVERIFY(!QNetworkProxyFactory::usesSystemConfiguration());
        QCOMPARE(QNetworkProxy::applicationProxy().type(),
                 readBack.isEmpty() ? QNetworkProxy::NoProxy : QNetworkProxy::HttpProxy);
        QCOMPARE(proxy.url(), readBack);
    }

    void typeAndSystemSwitch()
    {
        NetworkProxy proxy;
        QSignalSpy systemSpy(&proxy, &NetworkProxy::useSystemProxyChanged);
        QSignalSpy urlSpy(&proxy, &NetworkProxy::urlChanged);
        proxy.setUseSystemProxy(true); // unchanged: nothing fires
        QCOMPARE(systemSpy.count(), 0);
        proxy.setUseSystemProxy(false);
        QCOMPARE(systemSpy.count(), 1);
        QCOMPARE(urlSpy.count(), 0);

        // Another type keeps the host; only an HTTP proxy reads back as a URL.
        proxy.setUrl(QUrl("http://proxy.example:8080"));
        proxy.setType(NetworkProxy::Socks5Proxy);
        QCOMPARE(QNetworkProxy::applicationProxy().type(), QNetworkProxy::Socks5Proxy);
        QCOMPARE(QNetworkProxy::applicationProxy().hostName(), QStringLiteral("proxy.example"));
        QVERIFY(proxy.url().isEmpty());

        // Back to the system: the URL read from the application proxy goes.
        QNetworkProxy::setApplicationProxy(QNetworkProxy(QNetworkProxy::HttpProxy, "app.example", 1080));
        QCOMPARE(proxy.url(), QUrl("http://app.example:1080"));
        urlSpy.clear();
        proxy.setUseSystemProxy(true);
        QCOMPARE(systemSpy.count(), 2);
        QCOMPARE(urlSpy.count(), 1);
        QVERIFY(proxy.url().isEmpty());
        QVERIFY(QNetworkProxyFactory::usesSystemConfiguration());
    }
};

QTEST_MAIN(tst_NetworkProxy)

#include "tst_NetworkProxy.moc"
