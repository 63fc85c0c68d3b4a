#include "JsonUtility.h"

#include <QTemporaryDir>
#include <QtTest>

class tst_JsonUtility : public QObject
{
    Q_OBJECT

private slots:
    void toVariant_data();
    void toVariant();
    void toVariantMap_data();
    void toVariantMap();
    void normalizeTurnsContainersPlain();
    void fromString();
    void toJsonDropsInvalid();
    void fileRoundTrip();
};

void tst_JsonUtility::toVariant_data()
{
    QTest::addColumn<QByteArray>("json");
    QTest::addColumn<QVariant>("expected");
    QTest::newRow("empty") << QByteArray() << QVariant();
    QTest::newRow("array") << QByteArray("[1,2]") << QVariant(QVariantList { 1.0, 2.0 });
    QTest::newRow("object") << QByteArray("{\"a\":\"b\"}") << QVariant(QVariantMap { { "a", "b" } });
    QTest::newRow("broken gives empty map") << QByteArray("{\"a\":") << QVariant(QVariantMap());
}

void tst_JsonUtility::toVariant()
{
    QFETCH(QByteArray, json);
    QFETCH(QVariant, expected);
    const QVariant result = JsonUtility::toVariant(json, false);
    QCOMPARE(result.isValid(), expected.isValid());
    QCOMPARE(result, expected);
}

void tst_JsonUtility::toVariantMap_data()
{
    QTest::addColumn<QByteArray>("json");
    QTest::addColumn<QVariantMap>("expected");
    QTest::newRow("empty") << QByteArray() << QVariantMap();
    QTest::newRow("array is a failure") << QByteArray("[1,2]") << QVariantMap();
    QTest::newRow("garbage") << QByteArray("nope") << QVariantMap();
    QTest::newRow("object") << QByteArray("{\"n\":1,\"s\":\"x\",\"z\":null}")
                            << QVariantMap { { "n", 1.0 }, { "s", "x" }, { "z", QVariant::fromValue(nullptr) } };
}

void tst_JsonUtility::toVariantMap()
{
    QFETCH(QByteArray, json);
    QFETCH(QVariantMap, expected);
    const QVariantMap result = JsonUtility::toVariantMap(json, false);
    QCOMPARE(result.keys(), expected.keys());
    for (const QString &key : expected.keys())
        QCOMPARE(result.value(key).toString(), expected.value(key).toString());
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
    QCOMPARE(map.value("list").toList().first().toMap().value("y").toInt(), 2);
    QVERIFY(!map.value("invalid").isValid());
    QCOMPARE(map.value("text").userType(), int(QMetaType::QString));
}

void tst_JsonUtility::fromString()
{
    QCOMPARE(JsonUtility::fromString(QString()), QVariantMap());
    const QVariantMap map = JsonUtility::fromString(QStringLiteral("{\"a\":{\"b\":[1,{\"c\":NULL_is_text}]}}"));
    QVERIFY(map.isEmpty()); // not JSON
    const QVariantMap good = JsonUtility::fromString(QStringLiteral("{\"a\":{\"b\":[1,{\"c\":null}]}}"));
    QCOMPARE(good.value("a").toMap().value("b").toList().at(1).userType(), int(QMetaType::QVariantMap));
}

void tst_JsonUtility::toJsonDropsInvalid()
{
    const QVariantMap map {
        { "keep", 1 },
        { "drop", QVariant() },
        { "nested", QVariantMap { { "gone", QVariant() }, { "here", "x" } } }
    };
    const QByteArray json = JsonUtility::toJson(map);
    QVERIFY(!json.contains("drop"));
    QVERIFY(!json.contains("gone"));
    QVERIFY(!json.contains("null"));
    QVERIFY(json.contains("\n    ")); // indented
    const QVariantMap back = JsonUtility::toVariantMap(json, false);
    QCOMPARE(back.value("keep").toInt(), 1);
    QCOMPARE(back.value("nested").toMap().value("here").toString(), QStringLiteral("x"));
    QCOMPARE(back.value("nested").toMap().size(), 1);
}

void tst_JsonUtility::fileRoundTrip()
{
    QTemporaryDir dir;
    QVERIFY(dir.isValid());
    const QString path = dir.filePath("a.json");
    QVERIFY(JsonUtility::toFile(path, QVariantMap { { "k", "v" } }));
    QCOMPARE(JsonUtility::fromFile(path).value("k").toString(), QStringLiteral("v"));
    QVERIFY(!JsonUtility::toFile(dir.filePath("missing/a.json"), QVariantMap { { "k", "v" } }));
    QCOMPARE(JsonUtility::fromFile(dir.filePath("missing/a.json")), QVariantMap());
}

QTEST_GUILESS_MAIN(tst_JsonUtility)
#include "tst_JsonUtility.moc"
