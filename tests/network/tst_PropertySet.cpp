#include "PropertySet.h"

#include <QQmlComponent>
#include <QQmlContext>
#include <QQmlEngine>
#include <QRegularExpression>
#include <QSignalSpy>
#include <QTest>

class tst_PropertySet : public QObject
{
    Q_OBJECT

private slots:
    void valuesSignalsAndJson()
    {
        PropertySet set;
        QSignalSpy valueSpy(&set, &PropertySet::valueChanged);
        QSignalSpy jsonSpy(&set, &PropertySet::jsonChanged);
        QVERIFY(set.setValue("Any-Key", "one"));
        QVERIFY(!set.setValue("Any-Key", "one"));
        QVERIFY(set.setValue("Any-Key", 1)); // another type is another value
        QCOMPARE(jsonSpy.count(), 2);
        QCOMPARE(valueSpy.last(), QVariantList({ "Any-Key", 1 }));
        QVERIFY(!set.containsKey("any-key"));
        QVERIFY(set.containsValue(1));
        QVERIFY(!set.containsValue("1"));
        QCOMPARE(set.value("missing", "fallback").toString(), QStringLiteral("fallback"));

        set.clear("Any-Key");
        set.clear("Any-Key"); // already gone: no signal
        QCOMPARE(valueSpy.count(), 3);
        QVERIFY(set.keys().isEmpty());

        // Setting the json replaces every value, dropping keys it lacks.
        set.setValue("a", 5);
        const QVariantMap json { { "b", "two" }, { "c", true } };
        set.setJson(json);
        QCOMPARE(set.json(), json);
        set.clear();
        QVERIFY(set.json().isEmpty());
    }

    void reservedKeysRefused_data()
    {
        QTest::addColumn<QString>("key");
        QTest::newRow("empty") << "";
        QTest::newRow("property") << "json";
        QTest::newRow("method") << "replaceVariables";
        QTest::newRow("signal") << "valueChanged";
        QTest::newRow("QObject") << "objectName";
    }

    void reservedKeysRefused()
    {
        QFETCH(QString, key);
        PropertySet set;
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Invalid key"));
        QVERIFY(!set.setValue(key, 1));
        QVERIFY(set.keys().isEmpty());
    }

    void replaceVariables_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<QString>("expected");
        QTest::newRow("two and number") << "${name} is ${age}!" << "Ann is 42!";
        QTest::newRow("unknown stays") << "${nobody} ${name}" << "${nobody} Ann";
        QTest::newRow("unclosed") << "${name" << "${name";
        QTest::newRow("value with a variable is not expanded again") << "${loop}" << "${name}";
    }

    void replaceVariables()
    {
        QFETCH(QString, text);
        QFETCH(QString, expected);
        PropertySet set;
        set.setJson({ { "name", "Ann" }, { "age", 42 }, { "loop", "${name}" } });
        QCOMPARE(set.replaceVariables(text), expected);
    }

    void qmlWritesReport()
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
};

QTEST_MAIN(tst_PropertySet)

#include "tst_PropertySet.moc"
