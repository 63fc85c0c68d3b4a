#include "FileTestSupport.h"
#include "Loomkit.h"
#include "Settings.h"

#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QQmlComponent>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTemporaryDir>

using namespace FileTestSupport;

// Declared in C++ to reach a property without a notify signal, which QML cannot declare.
class BoundSettings : public Settings
{
    Q_OBJECT
    Q_PROPERTY(int plain MEMBER m_plain)
    Q_PROPERTY(QString watched MEMBER m_watched NOTIFY watchedChanged)

public:
    int m_plain = 1;
    QString m_watched = QStringLiteral("declared");

signals:
    void watchedChanged();
};

static const QList<QSettings::Format> kFormats { QSettings::IniFormat, Settings::jsonFormat() };

class tst_Settings : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void storeRules_data();
    void storeRules();
    void typedValues();
    void persistsAcrossInstances();
    void damagedJsonIsEmpty_data();
    void damagedJsonIsEmpty();
    void wideIntegersKeepTheirDigits();
    void colors_data();
    void colors();
    void bindingFromQml();
    void bindingWithoutNotify();

private:
    QTemporaryDir m_dir;
};

void tst_Settings::initTestCase()
{
    QCoreApplication::setOrganizationName(QStringLiteral("LoomkitTest"));
    QCoreApplication::setApplicationName(QStringLiteral("tst_Settings"));
    qmlRegisterType<Settings>("LoomkitTest", 1, 0, "Settings");
    QVERIFY(m_dir.isValid());

    Loomkit loomkit;
    QCOMPARE(loomkit.settings(), loomkit.settings());
    QVERIFY(loomkit.settings()->path().endsWith(QLatin1String("LoomkitTest/tst_Settings.conf")));
}

void tst_Settings::init()
{
    Settings store;
    store.clear();
    store.sync();
}

void tst_Settings::storeRules_data()
{
    QTest::addColumn<QVariant>("value");
    QTest::addColumn<QVariant>("defaultValue");
    QTest::addColumn<bool>("stored");

    QTest::newRow("equal to default") << QVariant(1) << QVariant(1) << false;
    QTest::newRow("equal to default as double") << QVariant(1.0) << QVariant(1) << false;
    QTest::newRow("blank") << QVariant("  ") << QVariant() << false;
    QTest::newRow("null string") << QVariant(QString()) << QVariant() << false;
    QTest::newRow("invalid") << QVariant() << QVariant() << false;
    QTest::newRow("zero") << QVariant(0) << QVariant() << true;
    QTest::newRow("differs from default") << QVariant(2) << QVariant(1) << true;
    QTest::newRow("text with blanks") << QVariant(" x ") << QVariant() << true;
    QTest::newRow("false") << QVariant(false) << QVariant(true) << true;
}

void tst_Settings::storeRules()
{
    QFETCH(QVariant, value);
    QFETCH(QVariant, defaultValue);
    QFETCH(bool, stored);

    for (const QSettings::Format format : kFormats) {
        Settings settings(m_dir.filePath(QStringLiteral("rules")), format);
        settings.setValue(QStringLiteral("a"), QStringLiteral("old"));
        QSignalSpy spy(&settings, &Settings::valueChanged);
        settings.setValue(QStringLiteral("a"), value, defaultValue);
        QCOMPARE(settings.contains(QStringLiteral("a")), stored);
        QCOMPARE(spy.count(), stored ? 1 : 0);
        if (stored) {
            QCOMPARE(spy.at(0).at(0).toString(), QStringLiteral("a"));
            QCOMPARE(settings.value(QStringLiteral("a")).toString(), value.toString());
        }
    }
}

void tst_Settings::typedValues()
{
    // Blank text read from a file counts as missing, as it would never have been stored.
    const QString path = m_dir.filePath(QStringLiteral("typed.ini"));
    QVERIFY(writeBytes(path, "[General]\nyes=true\nno=false\nnumber=2.5\nblank=\"  \"\ntext=\" x \"\n"));
    Settings settings(path, QSettings::IniFormat);
    QCOMPARE(settings.value(QStringLiteral("blank"), 5).toInt(), 5);
    QCOMPARE(settings.value(QStringLiteral("text"), 5).toString(), QStringLiteral(" x "));
    QCOMPARE(settings.value(QStringLiteral("missing"), QStringLiteral("d")).toString(), QStringLiteral("d"));
    QCOMPARE(settings.boolValue(QStringLiteral("yes")), true);
    QCOMPARE(settings.boolValue(QStringLiteral("no"), true), false);
    QCOMPARE(settings.boolValue(QStringLiteral("blank"), true), true);
    QCOMPARE(settings.numberValue(QStringLiteral("number")), 2.5);
    QCOMPARE(settings.numberValue(QStringLiteral("missing"), 7), 7.0);
}

void tst_Settings::persistsAcrossInstances()
{
    for (const QSettings::Format format : kFormats) {
        const QString path = m_dir.filePath(QStringLiteral("persist-%1").arg(int(format)));
        {
            Settings first(path, format);
            first.setValue(QStringLiteral("group/name"), QStringLiteral("\u00e9t\u00e9"));
            first.setValue(QStringLiteral("count"), 42);
            first.setValue(QStringLiteral("ratio"), 0.25);
            first.setValue(QStringLiteral("list"), QVariantList { true, QStringLiteral("two") });
            first.synchronize();
            QCOMPARE(first.status(), QSettings::NoError);
        }
        Settings second(path, format);
        QCOMPARE(second.value(QStringLiteral("group/name")).toString(), QStringLiteral("\u00e9t\u00e9"));
        QCOMPARE(second.numberValue(QStringLiteral("count")), 42.0);
        QCOMPARE(second.numberValue(QStringLiteral("ratio")), 0.25);
        QCOMPARE(second.value(QStringLiteral("list")).toList().value(1).toString(), QStringLiteral("two"));
        second.remove(QStringLiteral("count"));
        second.sync();
        Settings third(path, format);
        QVERIFY(!third.contains(QStringLiteral("count")));
        QVERIFY(third.contains(QStringLiteral("ratio")));
    }

    // The json file is one flat, indented object of native JSON values.
    const QByteArray bytes = contents(m_dir.filePath(QStringLiteral("persist-%1").arg(int(Settings::jsonFormat()))));
    const QJsonObject object = QJsonDocument::fromJson(bytes).object();
    QVERIFY(bytes.contains('\n'));
    QCOMPARE(object.value(QStringLiteral("group/name")).toString(), QStringLiteral("\u00e9t\u00e9"));
    QVERIFY(!object.contains(QStringLiteral("group")));
    QCOMPARE(object.value(QStringLiteral("ratio")).toDouble(), 0.25);
    QCOMPARE(object.value(QStringLiteral("list")).toArray(), (QJsonArray { true, QStringLiteral("two") }));
}

void tst_Settings::damagedJsonIsEmpty_data()
{
    QTest::addColumn<QByteArray>("contents");
    QTest::newRow("array") << QByteArray("[1, 2]");
    QTest::newRow("empty") << QByteArray();
    QTest::newRow("truncated") << QByteArray("{\"a\": ");
    QTest::newRow("binary") << QByteArray("\x00\xff\xfe{", 4);
}

void tst_Settings::damagedJsonIsEmpty()
{
    QFETCH(QByteArray, contents);
    const QString path = m_dir.filePath(QStringLiteral("damaged-%1.json").arg(QTest::currentDataTag()));
    QVERIFY(writeBytes(path, contents));
    {
        Settings settings(path, Settings::jsonFormat());
        QVERIFY(settings.allKeys().isEmpty());
        QCOMPARE(settings.status(), QSettings::NoError);
        settings.setValue(QStringLiteral("k"), QStringLiteral("v"));
    }
    QCOMPARE(QJsonDocument::fromJson(FileTestSupport::contents(path)).object().value("k").toString(), QStringLiteral("v"));
}

void tst_Settings::wideIntegersKeepTheirDigits()
{
    // Found by fuzzing: each save rewrote integers beyond 2^53 through a double.
    const QString path = m_dir.filePath(QStringLiteral("wide.json"));
    QVERIFY(writeBytes(path, "{\"big\": 2222222222222222221, \"list\": [-9007199254740993, 1], \"small\": 5}"));
    const qint64 wide = (qint64(1) << 60) + 1;
    const QString marker = QString(QChar(1)) + QStringLiteral("0") + QChar(1);
    {
        Settings settings(path, Settings::jsonFormat());
        settings.setValue(QStringLiteral("id"), wide);
        settings.setValue(QStringLiteral("marker"), marker);
    }
    const QByteArray json = contents(path);
    QVERIFY2(json.contains("2222222222222222221"), json.constData());
    QVERIFY(json.contains("-9007199254740993"));
    QVERIFY(json.contains(QByteArray::number(wide)));

    Settings settings(path, Settings::jsonFormat());
    QCOMPARE(settings.value(QStringLiteral("big")).toLongLong(), 2222222222222222221LL);
    QCOMPARE(settings.value(QStringLiteral("id")).toLongLong(), wide);
    QCOMPARE(settings.value(QStringLiteral("list")).toList().value(0).toLongLong(), -9007199254740993LL);
    QCOMPARE(settings.value(QStringLiteral("small")).toInt(), 5);
    // Text that looks like the internal marker is kept as it was.
    QCOMPARE(settings.value(QStringLiteral("marker")).toString(), marker);
}

void tst_Settings::colors_data()
{
    QTest::addColumn<QColor>("color");
    QTest::addColumn<QString>("text");
    QTest::newRow("opaque") << QColor(255, 0, 16) << "#ff0010";
    QTest::newRow("half transparent") << QColor(255, 0, 16, 128) << "#80ff0010";
    QTest::newRow("transparent") << QColor(0, 0, 0, 0) << "#00000000";
}

void tst_Settings::colors()
{
    QFETCH(QColor, color);
    QFETCH(QString, text);
    for (const QSettings::Format format : kFormats) {
        const QString path = m_dir.filePath(QStringLiteral("colors"));
        Settings(path, format).setColorValue(QStringLiteral("c"), color);
        Settings settings(path, format);
        QCOMPARE(settings.QSettings::value(QStringLiteral("c")).toString(), text);
        QCOMPARE(settings.colorValue(QStringLiteral("c")), color);
        QCOMPARE(settings.colorValue(QStringLiteral("missing"), Qt::blue), QColor(Qt::blue));
        settings.setColorValue(QStringLiteral("c"), QColor());
        QVERIFY(!settings.contains(QStringLiteral("c")));
    }
}

void tst_Settings::bindingFromQml()
{
    QQmlEngine engine;
    QQmlComponent component(&engine);
    component.setData("import QtQuick 2.15\nimport LoomkitTest 1.0\nSettings {\n"
                      "    property string name: 'declared'\n    property int count: 3\n"
                      "    property color tint: '#80ff0000'\n    property var list: [1, 2]\n}\n",
                      QUrl());
    {
        QScopedPointer<QObject> object(component.create());
        auto *settings = qobject_cast<Settings *>(object.data());
        QVERIFY2(settings, qPrintable(component.errorString()));
        // Declared values go into the store on first load; the C++ side's own property is not bound.
        QCOMPARE(settings->value(QStringLiteral("name")).toString(), QStringLiteral("declared"));
        QCOMPARE(settings->value(QStringLiteral("tint")).toString(), QStringLiteral("#80ff0000"));
        QVERIFY(!settings->contains(QStringLiteral("fallbacksEnabled")));

        QSignalSpy spy(settings, &Settings::valueChanged);
        object->setProperty("name", QStringLiteral("changed"));
        object->setProperty("tint", QColor(Qt::green));
        object->setProperty("list", QVariantList { 7 });
        QCOMPARE(spy.count(), 3);
        QCOMPARE(settings->value(QStringLiteral("tint")).toString(), QStringLiteral("#00ff00"));
        object->setProperty("count", 9);
        object->setProperty("count", 3);
    }
    QScopedPointer<QObject> again(component.create());
    QCOMPARE(again->property("name").toString(), QStringLiteral("changed"));
    QCOMPARE(again->property("tint").value<QColor>(), QColor(Qt::green));
    QCOMPARE(again->property("count").toInt(), 3);
    QCOMPARE(again->property("list").value<QJSValue>().property(0).toInt(), 7);

    // Cleared text is not stored, so the declared value comes back next time.
    again->setProperty("name", QStringLiteral("   "));
    QScopedPointer<QObject> third(component.create());
    QCOMPARE(third->property("name").toString(), QStringLiteral("declared"));
}

void tst_Settings::bindingWithoutNotify()
{
    {
        Settings store;
        store.setValue(QStringLiteral("plain"), 5);
        store.setValue(QStringLiteral("watched"), QStringLiteral("stored"));
    }
    BoundSettings settings;
    settings.classBegin();
    // Before completion nothing is connected or loaded.
    settings.setProperty("watched", QStringLiteral("early"));
    QCOMPARE(settings.value(QStringLiteral("watched")).toString(), QStringLiteral("stored"));
    settings.componentComplete();
    QCOMPARE(settings.m_plain, 5);
    QCOMPARE(settings.m_watched, QStringLiteral("stored"));

    settings.setProperty("plain", 8);
    settings.setProperty("watched", QStringLiteral("later"));
    QCOMPARE(settings.value(QStringLiteral("plain")).toInt(), 5);
    QCOMPARE(settings.value(QStringLiteral("watched")).toString(), QStringLiteral("later"));
}

QTEST_MAIN(tst_Settings)
#include "tst_Settings.moc"
