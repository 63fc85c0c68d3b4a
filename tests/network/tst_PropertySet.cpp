#include "PropertySet.h"

#include <QQmlComponent>
#include <QQmlContext>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QRegularExpression>
#include <QTest>

class tst_PropertySet : public QObject
{
    Q_OBJECT

private slots:
    void valuesAndSignals();
    void clearAndJson();
    void reservedKeysRefused_data();
    void reservedKeysRefused();
    void replaceVariables_data();
    void replaceVariables();
    void qmlWritesReport();
};

void tst_PropertySet::valuesAndSignals()
{
    PropertySet set;
    QSignalSpy valueSpy(&set, &PropertySet::valueChanged);
    QSignalSpy jsonSpy(&set, &PropertySet::jsonChanged);
    QVERIFY(set.setValue("Any-Key", "one"));
    QVERIFY(!set.setValue("Any-Key", "one"));
    QVERIFY(set.setValue("Any-Key", 1));      // another type is another value
    QCOMPARE(valueSpy.count(), 2);
    QCOMPARE(jsonSpy.count(), 2);
    QCOMPARE(valueSpy.last().at(0).toString(), QStringLiteral("Any-Key"));
    QCOMPARE(valueSpy.last().at(1), QVariant(1));
    QVERIFY(set.containsKey("Any-Key"));
    QVERIFY(!set.containsKey("any-key"));
    QVERIFY(set.containsValue(1));
    QVERIFY(!set.containsValue("1"));
    QCOMPARE(set.value("missing", "fallback").toString(), QStringLiteral("fallback"));
    QVERIFY(!set.value("missing").isValid());
    QCOMPARE(set.keys(), QStringList { "Any-Key" });
}

void tst_PropertySet::clearAndJson()
{
    PropertySet set;
    set.setValue("a", 1);
    set.setValue("b", "two");
    QSignalSpy valueSpy(&set, &PropertySet::valueChanged);
    set.clear("a");
    QVERIFY(!set.containsKey("a"));
    QCOMPARE(set.keys(), QStringList { "b" });
    set.clear("a"); // already gone: no signal
    QCOMPARE(valueSpy.count(), 1);

    QVariantMap json;
    json.insert("b", "two");
    json.insert("c", true);
    set.setJson(json);
    QCOMPARE(set.json(), json);
    set.setValue("a", 5);
    json.remove("b");
    set.setJson(json);
    QCOMPARE(set.keys(), QStringList { "c" });
    set.clear();
    QVERIFY(set.keys().isEmpty());
    QVERIFY(set.json().isEmpty());
}

void tst_PropertySet::reservedKeysRefused_data()
{
    QTest::addColumn<QString>("key");
    QTest::newRow("empty") << "";
    QTest::newRow("property") << "json";
    QTest::newRow("method") << "replaceVariables";
    QTest::newRow("signal") << "valueChanged";
    QTest::newRow("QObject") << "objectName";
}

void tst_PropertySet::reservedKeysRefused()
{
    QFETCH(QString, key);
    PropertySet set;
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid key"));
    QVERIFY(!set.setValue(key, 1));
    QVERIFY(set.keys().isEmpty());
}

void tst_PropertySet::replaceVariables_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("expected");
    QTest::newRow("one") << "Hello ${name}!" << "Hello Ann!";
    QTest::newRow("two and number") << "${name} is ${age}" << "Ann is 42";
    QTest::newRow("unknown stays") << "${nobody} ${name}" << "${nobody} Ann";
    QTest::newRow("unclosed") << "${name" << "${name";
    QTest::newRow("no variables") << "plain" << "plain";
    QTest::newRow("value with a variable is not expanded again") << "${loop}" << "${name}";
}

void tst_PropertySet::replaceVariables()
{
    QFETCH(QString, text);
    QFETCH(QString, expected);
    PropertySet set;
    set.setValue("name", "Ann");
    set.setValue("age", 42);
    set.setValue("loop", "${name}");
    QCOMPARE(set.replaceVariables(text), expected);
}

void tst_PropertySet::qmlWritesReport()
{
    QQmlEngine engine;
    PropertySet set;
    set.setValue("count", 1);
    engine.rootContext()->setContextProperty("set", &set);
    QSignalSpy valueSpy(&set, &PropertySet::valueChanged);
    QQmlComponent component(&engine);
    component.setData("import QtQml 2.15\nQtObject { Component.onCompleted: { set.count = 2; set.clear('count'); "
                      "objectName = String(set.containsKey('count')) + set.value('x', 'd') } }",
                      QUrl());
    QScopedPointer<QObject> object(component.create());
    QVERIFY2(object, qPrintable(component.errorString()));
    QCOMPARE(object->objectName(), QStringLiteral("falsed"));
    QCOMPARE(valueSpy.count(), 2);
    QCOMPARE(valueSpy.first().at(1), QVariant(2));
}

QTEST_MAIN(tst_PropertySet)

#include "tst_PropertySet.moc"
