#include "NetworkRequest.h"
#include "NetworkTestFixture.h"
#include "NetworkingPrivate.h"
#include "NetworkingPrivateInvoker.h"
#include "TestHttpServer.h"

#include <QNetworkConfigurationManager>
#include <QNetworkProxyFactory>
#include <QRegularExpression>
#include <QSignalSpy>
#include <QTest>
#include <QThread>

QT_WARNING_DISABLE_DEPRECATED

class tst_NetworkingPrivate : public QObject
{
    Q_OBJECT

    static void publish(const QVariant &service)
    {
        QCoreApplication::instance()->setProperty(NetworkingPrivate::propertyName, service);
    }

private slots:
    void proxyFollowsSettings()
    {
        NetworkingPrivate service;
        QSignalSpy proxySpy(&service, &NetworkingPrivate::proxyChanged);
        QNetworkProxy::setApplicationProxy(QNetworkProxy(QNetworkProxy::HttpProxy, "app.example", 8080));
        service.setUseSystemProxy(false);
        QCOMPARE(service.queryProxy().hostName(), QStringLiteral("app.example"));
        service.setRequestUrl(QUrl("http://x.example/"));
        QCOMPARE(proxySpy.count(), 1); // the same proxy again: no signal

        // The system's answer for a URL, with no proxy in the environment.
        qunsetenv("http_proxy");
        service.setUseSystemProxy(true);
        QVERIFY(service.queryProxy().type() == QNetworkProxy::NoProxy
                || service.queryProxy().type() == QNetworkProxy::DefaultProxy);
        QNetworkProxy::setApplicationProxy(QNetworkProxy());
    }

    void invokerFindsAndRelays()
    {
        // No service, or something that is no object: no target, and no crash.
        for (const QVariant &published : { QVariant(), QVariant(QStringLiteral("text")) }) {
            publish(published);
            NetworkingPrivateInvoker invoker;
            QVERIFY(!invoker.target());
            QVERIFY(!invoker.queryDefaultConfiguration().isValid());
            invoker.setRequestUrl(QUrl("http://nowhere/"));
        }

        NetworkingPrivate service;
        publish(QVariant::fromValue<QObject *>(&service));
        NetworkingPrivateInvoker invoker;
        QCOMPARE(invoker.target(), &service);
        QSignalSpy clearingSpy(&invoker, &NetworkingPrivateInvoker::accessCacheClearing);
        QSignalSpy clearedSpy(&invoker, &NetworkingPrivateInvoker::accessCacheCleared);
        QSignalSpy urlSpy(&invoker, &NetworkingPrivateInvoker::requestUrlChanged);
        service.emitAccessCacheClearing();
        service.emitAccessCacheCleared();
        invoker.setRequestUrl(QUrl("http://a.example/"));
        QCOMPARE(clearingSpy.count(), 1);
        QCOMPARE(clearedSpy.count(), 1);
        QCOMPARE(urlSpy.count(), 1);
        QCOMPARE(service.queryRequestUrl(), QUrl("http://a.example/"));

        // A new target: the old one is no longer heard.
        NetworkingPrivate other;
        invoker.setTarget(&other);
        service.emitAccessCacheClearing();
        other.emitAccessCacheClearing();
        QCOMPARE(clearingSpy.count(), 2);
        publish(QVariant());
    }

    void serviceOnAnotherThread()
    {
        QThread thread;
        auto *service = new NetworkingPrivate;
        service->moveToThread(&thread);
        thread.start();
        NetworkingPrivateInvoker invoker;
        invoker.setTarget(service);

        // Fire-and-forget works across threads; a query with a result does not.
        invoker.setRequestUrl(QUrl("http://threaded.example/"));
        QTRY_COMPARE(service->property("requestUrl").toUrl(), QUrl("http://threaded.example/"));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Unable to invoke methods with return values"));
        QVERIFY(!invoker.queryDefaultConfiguration().isValid());
        QSignalSpy clearingSpy(&invoker, &NetworkingPrivateInvoker::accessCacheClearing);
        QMetaObject::invokeMethod(service, "emitAccessCacheClearing", Qt::QueuedConnection);
        QTRY_COMPARE(clearingSpy.count(), 1);

        QMetaObject::invokeMethod(service, "deleteLater", Qt::QueuedConnection);
        thread.quit();
        thread.wait();
    }

    void configurationChangeAbortsRequest()
    {
        QNetworkConfigurationManager manager;
        QNetworkConfiguration valid = manager.defaultConfiguration();
        if (!valid.isValid() && !manager.allConfigurations().isEmpty())
            valid = manager.allConfigurations().first();
        if (!valid.isValid())
            QSKIP("this machine has no network configuration");

        NetworkingPrivate *service = NetworkingPrivate::publish();
        service->setDefaultConfiguration(valid);
        QQmlEngine engine;
        TestHttpServer server;
        QVERIFY(server.start());
        QScopedPointer<NetworkRequest> quiet(makeRequest(&engine));
        QScopedPointer<NetworkRequest> live(makeRequest(&engine));
        quiet->setUrl(QUrl(server.urlFor("/hang")));
        live->setUrl(QUrl(server.urlFor("/hang")));
        live->send();

        // The same configuration again changes nothing; another aborts.
        QSignalSpy errorSpy(live.data(), &NetworkRequest::error);
        service->setDefaultConfiguration(valid);
        QCOMPARE(live->readyState(), NetworkRequest::ReadyStateSending);
        service->setDefaultConfiguration(QNetworkConfiguration());
        QCOMPARE(live->readyState(), NetworkRequest::ReadyStateComplete);
        QCOMPARE(live->errorCode(), int(QNetworkReply::OperationCanceledError));
        QCOMPARE(errorSpy.count(), 1);
        QCOMPARE(quiet->readyState(), NetworkRequest::ReadyStateInitialized);
    }
};

QTEST_MAIN(tst_NetworkingPrivate)

#include "tst_NetworkingPrivate.moc"
