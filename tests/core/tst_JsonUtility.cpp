#include "JsonUtility.h"

#include <QtTest>

class tst_JsonUtility : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void normalizeTurnsContainersPlain();
    void writing();
};

void tst_JsonUtility::parse_data()
{
    QTest::addColumn<QByteArray>("json");
    QTest::addColumn<QVariant>("variant");
    QTest::addColumn<QVariantMap>("map"); // toVariantMap and fromString take only objects
    const QVariantMap object { { "n", 1.0 }, { "s", "x" }, { "z", QVariant::fromValue(nullptr) } };
    QTest::newRow("empty") << QByteArray() << QVariant() << QVariantMap();
    QTest::newRow("array") << QByteArray("[1,2]") << QVariant(QVariantList { 1.0, 2.0 }) << QVariantMap();
    QTest::newRow("object") << QByteArray("{\"n\":1,\"s\":\"x\",\"z\":null}") << QVariant(object) << object;
    QTest::newRow("broken gives empty map") << QByteArray("{\"a\":") << QVariant(QVariantMap()) << QVariantMap();
    QTest::newRow("garbage") << QByteArray("nope") << QVariant(QVariantMap()) << QVariantMap();
}

void tst_JsonUtility::parse()
{
    QFETCH(QByteArray, json);
    QFETCH(QVariant, variant);
    QFETCH(QVariantMap, map);
    const QVariant result = JsonUtility::toVariant(json, false);
    QCOMPARE(result.isValid(), variant.isValid());
    QCOMPARE(result, variant);
    QCOMPARE(JsonUtility::toVariantMap(json, false), map);
    QCOMPARE(JsonUtility::fromString(QString::fromUtf8(json)), map);
}

void tst_JsonUtility::normalizeTurnsContainersPlain()
{
    QVariantMap map {
        { "hash", QVariantHash { { "x", 1 } } },
        { "strings", QStringList { "a", "b" } },
        { "list", QVariantList { QVariantHash { { "y", 2 } }, 3 } },
        { "invalid", QVariant() },
        { "text", QStringLiteral("plain") }
    };
    JsonUtility::normalizeMap(map);
    QCOMPARE(map.value("hash").userType(), int(QMetaType::QVariantMap));
    QCOMPARE(map.value("strings").userType(), int(QMetaType::QVariantList));
    QCOMPARE(map.value("list").toList().first().userType(), int(QMetaType::QVariantMap));
    QVERIFY(!map.value("invalid").isValid());
    QCOMPARE(map.value("text").userType(), int(QMetaType::QString));
}

void tst_JsonUtility::writing()
{
    const QVariantMap map {
        { "keep", 1 },
        { "drop", QVariant() },
        { "nested", QVariantMap { { "gone", QVariant() }, { "here", "x" } } }
    };
    const QByteArray json = JsonUtility::toJson(map);
    QVERIFY(json.contains("\n    ")); // indented
    const QVariantMap expected { { "keep", 1.0 }, { "nested", QVariantMap { { "here", "x" } } } };
    QCOMPARE(JsonUtility::toVariantMap(json, false), expected);

    QTemporaryDir dir;
    const QString path = dir.filePath("a.json");
    QVERIFY(JsonUtility::toFile(path, QVariantMap { { "k", "v" } }));
    QCOMPARE(JsonUtility::fromFile(path).value("k").toString(), QStringLiteral("v"));
    QVERIFY(!JsonUtility::toFile(dir.filePath("missing/a.json"), QVariantMap { { "k", "v" } }));
    QCOMPARE(JsonUtility::fromFile(dir.filePath("missing/a.json")), QVariantMap());
}

QTEST_GUILESS_MAIN(tst_JsonUtility)
#include "tst_JsonUtility.moc"
