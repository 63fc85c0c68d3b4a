#include "Loomkit.h"
#include "Settings.h"

#include <QJsonDocument>
#include <QJsonObject>
#include <QQmlComponent>
#include <QQmlEngine>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

// A settings element declared in C++, to reach a property without a notify
// signal, which QML cannot declare.
class BoundSettings : public Settings
{
    Q_OBJECT
    Q_PROPERTY(int plain READ plain WRITE setPlain)
    Q_PROPERTY(QString watched READ watched WRITE setWatched NOTIFY watchedChanged)

public:
    using Settings::Settings;
    int plain() const { return m_plain; }
    void setPlain(int plain) { m_plain = plain; }
    QString watched() const { return m_watched; }
    void setWatched(const QString &watched)
    {
        if (watched == m_watched)
            return;
        m_watched = watched;
        emit watchedChanged();
    }

signals:
    void watchedChanged();

private:
    int m_plain = 1;
    QString m_watched = QStringLiteral("declared");
};

class tst_Settings : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void storeRules_data();
    void storeRules();
    void blankReadsAsDefault();
    void persistsAcrossInstances_data();
    void persistsAcrossInstances();
    void jsonFileIsJson();
    void damagedJsonIsEmpty_data();
    void damagedJsonIsEmpty();
    void wideIntegersKeepTheirDigits();
    void colors_data();
    void colors();
    void typedValues();
    void bindingFromQml();
    void bindingWithoutNotify();
    void loomkitSettings();

private:
    QTemporaryDir m_dir;
};

void tst_Settings::initTestCase()
{
    QCoreApplication::setOrganizationName(QStringLiteral("LoomkitTest"));
    QCoreApplication::setApplicationName(QStringLiteral("tst_Settings"));
    qmlRegisterType<Settings>("LoomkitTest", 1, 0, "Settings");
    QVERIFY(m_dir.isValid());
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
    QTest::newRow("empty") << QVariant("") << QVariant() << false;
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

    for (const QSettings::Format format : { QSettings::IniFormat, Settings::jsonFormat() }) {
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

void tst_Settings::blankReadsAsDefault()
{
    Settings settings(m_dir.filePath(QStringLiteral("blank.ini")), QSettings::IniFormat);
    settings.QSettings::setValue(QStringLiteral("a"), QStringLiteral("   "));
    QCOMPARE(settings.value(QStringLiteral("a"), 5).toInt(), 5);
    QVERIFY(!settings.value(QStringLiteral("a")).isValid());
    settings.QSettings::setValue(QStringLiteral("b"), QStringLiteral(" x "));
    QCOMPARE(settings.value(QStringLiteral("b"), 5).toString(), QStringLiteral(" x "));
    QCOMPARE(settings.value(QStringLiteral("missing"), QStringLiteral("d")).toString(), QStringLiteral("d"));
}

void tst_Settings::persistsAcrossInstances_data()
{
    QTest::addColumn<bool>("json");
    QTest::newRow("ini") << false;
    QTest::newRow("json") << true;
}

void tst_Settings::persistsAcrossInstances()
{
    QFETCH(bool, json);
    const QString path = m_dir.filePath(json ? QStringLiteral("persist.json") : QStringLiteral("persist.ini"));
    const QSettings::Format format = json ? Settings::jsonFormat() : QSettings::IniFormat;
    {
        Settings first(path, format);
        QCOMPARE(first.path(), path);
        first.setValue(QStringLiteral("group/name"), QStringLiteral("\u00e9t\u00e9"));
        first.setValue(QStringLiteral("count"), 42);
        first.setValue(QStringLiteral("ratio"), 0.25);
        first.synchronize();
        QCOMPARE(first.status(), QSettings::NoError);
    }
    QVERIFY(QFileInfo(path).size() > 0);
    Settings second(path, format);
    QCOMPARE(second.value(QStringLiteral("group/name")).toString(), QStringLiteral("\u00e9t\u00e9"));
    QCOMPARE(second.numberValue(QStringLiteral("count")), 42.0);
    QCOMPARE(second.numberValue(QStringLiteral("ratio")), 0.25);
    second.remove(QStringLiteral("count"));
    second.sync();

    Settings third(path, format);
    QVERIFY(!third.contains(QStringLiteral("count")));
    QVERIFY(third.contains(QStringLiteral("ratio")));
}

void tst_Settings::jsonFileIsJson()
{
    const QString path = m_dir.filePath(QStringLiteral("format.json"));
    {
        Settings settings(path, Settings::jsonFormat());
        settings.setValue(QStringLiteral("window/width"), 640);
        settings.setValue(QStringLiteral("title"), QStringLiteral("Caf\u00e9"));
        settings.setValue(QStringLiteral("flag"), true);
        settings.setValue(QStringLiteral("list"), QVariantList { 1, QStringLiteral("two") });
        settings.setValue(QStringLiteral("map"), QVariantMap { { QStringLiteral("k"), QStringLiteral("v") } });
    }
    QFile file(path);
    QVERIFY(file.open(QIODevice::ReadOnly));
    const QByteArray bytes = file.readAll();
    QJsonParseError error;
    const QJsonDocument document = QJsonDocument::fromJson(bytes, &error);
    QCOMPARE(error.error, QJsonParseError::NoError);
    QVERIFY(bytes.contains('\n'));
    const QJsonObject object = document.object();
    // Keys with slashes stay whole; there is no nesting by group.
    QCOMPARE(object.value(QStringLiteral("window/width")).toInt(), 640);
    QVERIFY(!object.contains(QStringLiteral("window")));
    QCOMPARE(object.value(QStringLiteral("title")).toString(), QStringLiteral("Caf\u00e9"));
    QCOMPARE(object.value(QStringLiteral("flag")).toBool(), true);
    QCOMPARE(object.value(QStringLiteral("list")).toArray().size(), 2);
    QCOMPARE(object.value(QStringLiteral("map")).toObject().value(QStringLiteral("k")).toString(), QStringLiteral("v"));
    QCOMPARE(Settings::jsonFormat(), Settings::jsonFormat());
    QVERIFY(Settings::jsonFormat() > QSettings::InvalidFormat);
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
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write(contents);
    file.close();

    {
        Settings settings(path, Settings::jsonFormat());
        QVERIFY(settings.allKeys().isEmpty());
        QCOMPARE(settings.status(), QSettings::NoError);
        settings.setValue(QStringLiteral("k"), QStringLiteral("v"));
    }
    QVERIFY(file.open(QIODevice::ReadOnly));
    QCOMPARE(QJsonDocument::fromJson(file.readAll()).object().value(QStringLiteral("k")).toString(),
             QStringLiteral("v"));
}

void tst_Settings::wideIntegersKeepTheirDigits()
{
    // Found by fuzzing: each save rewrote integers beyond 2^53 through a double.
    const QString path = m_dir.filePath(QStringLiteral("wide.json"));
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write("{\"big\": 2222222222222222221, \"list\": [-9007199254740993, 1], \"small\": 5}");
    file.close();

    const qint64 wide = (qint64(1) << 60) + 1;
    {
        Settings settings(path, Settings::jsonFormat());
        settings.setValue(QStringLiteral("id"), wide);
        settings.setValue(QStringLiteral("marker"), QString(QChar(1)) + QStringLiteral("0") + QChar(1));
    }
    QVERIFY(file.open(QIODevice::ReadOnly));
    const QByteArray json = file.readAll();
    file.close();
    QVERIFY2(json.contains("2222222222222222221"), json.constData());
    QVERIFY(json.contains("-9007199254740993"));
    QVERIFY(json.contains(QByteArray::number(wide)));

    Settings settings(path, Settings::jsonFormat());
    QCOMPARE(settings.value(QStringLiteral("big")).toLongLong(), 2222222222222222221LL);
    QCOMPARE(settings.value(QStringLiteral("id")).toLongLong(), wide);
    QCOMPARE(settings.value(QStringLiteral("list")).toList().value(0).toLongLong(), -9007199254740993LL);
    QCOMPARE(settings.value(QStringLiteral("small")).toInt(), 5);
    // Text that looks like the internal marker is kept as it was.
    QCOMPARE(settings.value(QStringLiteral("marker")).toString(),
             QString(QChar(1)) + QStringLiteral("0") + QChar(1));
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
    for (const QSettings::Format format : { QSettings::IniFormat, Settings::jsonFormat() }) {
        const QString path = m_dir.filePath(QStringLiteral("colors"));
        {
            Settings settings(path, format);
            settings.setColorValue(QStringLiteral("c"), color);
            QCOMPARE(settings.QSettings::value(QStringLiteral("c")).toString(), text);
        }
        Settings settings(path, format);
        QCOMPARE(settings.colorValue(QStringLiteral("c")), color);
        QCOMPARE(settings.colorValue(QStringLiteral("missing"), Qt::blue), QColor(Qt::blue));
        settings.setColorValue(QStringLiteral("c"), QColor());
        QVERIFY(!settings.contains(QStringLiteral("c")));
    }
}

void tst_Settings::typedValues()
{
    const QString path = m_dir.filePath(QStringLiteral("typed.ini"));
    QFile file(path);
    QVERIFY(file.open(QIODevice::WriteOnly));
    file.write("[General]\nyes=true\nno=false\nnumber=2.5\nblank=\"  \"\n");
    file.close();

    Settings settings(path, QSettings::IniFormat);
    QCOMPARE(settings.boolValue(QStringLiteral("yes")), true);
    QCOMPARE(settings.boolValue(QStringLiteral("no"), true), false);
    QCOMPARE(settings.boolValue(QStringLiteral("blank"), true), true);
    QCOMPARE(settings.boolValue(QStringLiteral("missing")), false);
    QCOMPARE(settings.numberValue(QStringLiteral("number")), 2.5);
    QCOMPARE(settings.numberValue(QStringLiteral("missing"), 7), 7.0);
    QCOMPARE(settings.numberValue(QStringLiteral("blank")), 0.0);

    QSignalSpy spy(&settings, &Settings::fallbacksEnabledChanged);
    settings.setFallbacks(false);
    settings.setFallbacks(false);
    QCOMPARE(spy.count(), 1);
    QVERIFY(!settings.fallbacksEnabled());
}

void tst_Settings::bindingFromQml()
{
    const QByteArray source = "import QtQuick 2.15\nimport LoomkitTest 1.0\n"
                              "Settings {\n"
                              "    property string name: 'declared'\n"
                              "    property int count: 3\n"
                              "    property color tint: '#80ff0000'\n"
                              "    property var list: [1, 2]\n"
                              "}\n";
    QQmlEngine engine;
    QQmlComponent component(&engine);
    component.setData(source, QUrl());

    {
        QScopedPointer<QObject> object(component.create());
        QVERIFY2(object, qPrintable(component.errorString()));
        auto *settings = qobject_cast<Settings *>(object.data());
        QVERIFY(settings);
        // Declared values go into the store on first load.
        QCOMPARE(settings->value(QStringLiteral("name")).toString(), QStringLiteral("declared"));
        QCOMPARE(settings->value(QStringLiteral("count")).toInt(), 3);
        QCOMPARE(settings->value(QStringLiteral("tint")).toString(), QStringLiteral("#80ff0000"));
        // The C++ side's own property is not bound.
        QVERIFY(!settings->contains(QStringLiteral("fallbacksEnabled")));

        QSignalSpy spy(settings, &Settings::valueChanged);
        object->setProperty("name", QStringLiteral("changed"));
        object->setProperty("tint", QColor(Qt::green));
        object->setProperty("list", QVariantList { 7 });
        QCOMPARE(spy.count(), 3);
        QCOMPARE(settings->value(QStringLiteral("name")).toString(), QStringLiteral("changed"));
        QCOMPARE(settings->value(QStringLiteral("tint")).toString(), QStringLiteral("#00ff00"));

        // Cleared text is not stored, so the declared value comes back next time.
        object->setProperty("count", 9);
        object->setProperty("count", 3);
    }

    QScopedPointer<QObject> again(component.create());
    QVERIFY(again);
    QCOMPARE(again->property("name").toString(), QStringLiteral("changed"));
    QCOMPARE(again->property("tint").value<QColor>(), QColor(Qt::green));
    QCOMPARE(again->property("count").toInt(), 3);
    QCOMPARE(again->property("list").value<QJSValue>().property(0).toInt(), 7);

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
    settings.setWatched(QStringLiteral("early"));
    QCOMPARE(settings.value(QStringLiteral("watched")).toString(), QStringLiteral("stored"));
    settings.componentComplete();
    QCOMPARE(settings.plain(), 5);
    QCOMPARE(settings.watched(), QStringLiteral("stored"));

    settings.setPlain(8);
    settings.setWatched(QStringLiteral("later"));
    QCOMPARE(settings.value(QStringLiteral("plain")).toInt(), 5);
    QCOMPARE(settings.value(QStringLiteral("watched")).toString(), QStringLiteral("later"));
}

void tst_Settings::loomkitSettings()
{
    Loomkit loomkit;
    Settings *settings = loomkit.settings();
    QVERIFY(settings);
    QCOMPARE(settings, loomkit.settings());
    QCOMPARE(settings->parent(), &loomkit);
    QVERIFY(settings->path().endsWith(QLatin1String("LoomkitTest/tst_Settings.conf")));
}

QTEST_MAIN(tst_Settings)
#include "tst_Settings.moc"
