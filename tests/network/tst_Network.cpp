#include "Loomkit.h"
#include "Network.h"

#include <QNetworkInterface>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTest>

QT_WARNING_DISABLE_DEPRECATED

class tst_Network : public QObject
{
    Q_OBJECT

private slots:
    void addressesAndInterfaces()
    {
        Network network;
        QVariantMap loopback;
        for (const QVariant &entry : network.addresses()) {
            QCOMPARE(entry.toMap().keys(), QStringList({ "address", "isLoopback", "protocol", "scopeId" }));
            if (entry.toMap().value("address") == QLatin1String("127.0.0.1"))
                loopback = entry.toMap();
        }
        QVERIFY(loopback.value("isLoopback").toBool());
        QCOMPARE(loopback.value("protocol").toInt(), int(Network::ProtocolIPv4));

        if (!QNetworkInterface::interfaceFromName("lo").isValid())
            QSKIP("no loopback interface named lo");
        QVariantMap lo;
        for (const QVariant &entry : network.interfaces()) {
            QCOMPARE(entry.toMap().keys(),
                     QStringList({ "addressEntries", "hardwareAddress", "humanReadableName", "isValid", "name" }));
            if (entry.toMap().value("name") == QLatin1String("lo"))
                lo = entry.toMap();
        }
        const QVariantList entries = lo.value("addressEntries").toList();
        QVERIFY(!entries.isEmpty());
        const QVariantMap first = entries.first().toMap();
        QCOMPARE(first.keys(), QStringList({ "broadcast", "ip", "netmask", "prefixLength" }));
        QCOMPARE(first.value("ip").toMap().value("address").toString(), QStringLiteral("127.0.0.1"));
        QCOMPARE(first.value("prefixLength").toInt(), 8);
    }

    void configurationMaps()
    {
        const QStringList keys = { "bearerType", "bearerTypeFamily", "bearerTypeName", "children", "identifier",
                                   "isRoamingAvailable", "isValid", "name", "purpose", "state", "type" };
        const QVariantMap invalid = Network::configurationToMap(QNetworkConfiguration());
        QCOMPARE(invalid.keys(), keys);
        QCOMPARE(invalid.value("type").toInt(), int(Network::ConfigurationTypeInvalid));

        Network network;
        const QVariantList all = network.getConfigurations();
        QCOMPARE(all.size(), QNetworkConfigurationManager().allConfigurations().size());
        for (const QVariant &entry : network.getConfigurations(Network::ConfigurationStateActive))
            QCOMPARE(entry.toMap().value("state").toInt() & Network::ConfigurationStateActive,
                     int(Network::ConfigurationStateActive));
    }

    void frameworkRelaysOnlineState()
    {
        QQmlEngine engine;
        Loomkit *framework = Loomkit::instance(&engine);
        QVERIFY(framework->network());
        QSignalSpy spy(framework, &Loomkit::onlineStateChanged);
        emit framework->network()->onlineStateChanged(false);
        QCOMPARE(spy.count(), 1);
        QCOMPARE(spy.first().first().toBool(), false);
        // The old property still answers, with a warning.
        QTest::ignoreMessage(QtCriticalMsg, "*** DEPRECATED. Use Networking.isOnline instead. ***");
        QVERIFY(framework->property("isOnline").toBool());
    }
};

QTEST_MAIN(tst_Network)

#include "tst_Network.moc"
