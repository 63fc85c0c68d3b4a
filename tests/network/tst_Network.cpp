#include "Loomkit.h"
#include "Network.h"
#include "NetworkProxy.h"

#include <QHostAddress>
#include <QNetworkInterface>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTest>

QT_WARNING_DISABLE_DEPRECATED

class tst_Network : public QObject
{
    Q_OBJECT

private slots:
    void isOnlineIsDeprecatedAndTrue();
    void addressesAndInterfaces();
    void configurationMaps();
    void frameworkRelaysOnlineState();
};

void tst_Network::isOnlineIsDeprecatedAndTrue()
{
    Network network;
    QTest::ignoreMessage(QtCriticalMsg, "*** DEPRECATED. Use Networking.isOnline instead. ***");
    QVERIFY(network.isOnline());
    QVERIFY(network.proxy());
    QCOMPARE(network.proxy(), network.proxy());
}

void tst_Network::addressesAndInterfaces()
{
    Network network;
    const QVariantList addresses = network.addresses();
    bool loopback = false;
    for (const QVariant &entry : addresses) {
        const QVariantMap map = entry.toMap();
        QCOMPARE(map.keys(), QStringList({ "address", "isLoopback", "protocol", "scopeId" }));
        if (map.value("address") == QLatin1String("127.0.0.1")) {
            loopback = true;
            QVERIFY(map.value("isLoopback").toBool());
            QCOMPARE(map.value("protocol").toInt(), int(Network::ProtocolIPv4));
        }
    }
    QVERIFY(loopback);

    bool foundLo = false;
    for (const QVariant &entry : network.interfaces()) {
        const QVariantMap map = entry.toMap();
        QCOMPARE(map.keys(), QStringList({ "addressEntries", "hardwareAddress", "humanReadableName", "isValid", "name" }));
        if (map.value("name") != QLatin1String("lo"))
            continue;
        foundLo = true;
        const QVariantList entries = map.value("addressEntries").toList();
        QVERIFY(!entries.isEmpty());
        const QVariantMap first = entries.first().toMap();
        QCOMPARE(first.keys(), QStringList({ "broadcast", "ip", "netmask", "prefixLength" }));
        QCOMPARE(first.value("ip").toMap().value("address").toString(), QStringLiteral("127.0.0.1"));
        QCOMPARE(first.value("prefixLength").toInt(), 8);
    }
    if (!QNetworkInterface::interfaceFromName("lo").isValid())
        QSKIP("no loopback interface named lo");
    QVERIFY(foundLo);
}

void tst_Network::configurationMaps()
{
    const QStringList keys = { "bearerType", "bearerTypeFamily", "bearerTypeName", "children", "identifier",
                               "isRoamingAvailable", "isValid", "name", "purpose", "state", "type" };
    const QVariantMap invalid = Network::configurationToMap(QNetworkConfiguration());
    QCOMPARE(invalid.keys(), keys);
    QCOMPARE(invalid.value("isValid").toBool(), false);
    QCOMPARE(invalid.value("type").toInt(), int(Network::ConfigurationTypeInvalid));
    QVERIFY(invalid.value("children").toList().isEmpty());

    Network network;
    const QVariantList all = network.getConfigurations();
    QNetworkConfigurationManager manager;
    QCOMPARE(all.size(), manager.allConfigurations().size());
    for (const QVariant &entry : all) {
        const QVariantMap map = entry.toMap();
        QCOMPARE(map.keys(), keys);
        for (const QVariant &child : map.value("children").toList())
            QCOMPARE(child.toMap().keys(), keys);
    }
    // A filter of Active gives only active ones.
    for (const QVariant &entry : network.getConfigurations(Network::ConfigurationStateActive))
        QCOMPARE(entry.toMap().value("state").toInt() & Network::ConfigurationStateActive,
                 int(Network::ConfigurationStateActive));
}

void tst_Network::frameworkRelaysOnlineState()
{
    QQmlEngine engine;
    Loomkit *framework = Loomkit::instance(&engine);
    QVERIFY(framework->network());
    QSignalSpy spy(framework, &Loomkit::onlineStateChanged);
    emit framework->network()->onlineStateChanged(false);
    QCOMPARE(spy.count(), 1);
    QCOMPARE(spy.first().first().toBool(), false);
    QTest::ignoreMessage(QtCriticalMsg, "*** DEPRECATED. Use Networking.isOnline instead. ***");
    QVERIFY(framework->property("isOnline").toBool());
}

QTEST_MAIN(tst_Network)

#include "tst_Network.moc"
