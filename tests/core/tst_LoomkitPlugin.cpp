#include <QGuiApplication>
#include <QImage>
#include <QQmlComponent>
#include <QQmlEngine>
#include <QTranslator>
#include <QtTest>

static void addImportPath(QQmlEngine &engine)
{
    engine.addImportPath(qEnvironmentVariable("LOOMKIT_BINARY_DIR") + QStringLiteral("/qml"));
}

static QObject *loomkitOf(QQmlEngine &engine)
{
    addImportPath(engine);
    QQmlComponent component(&engine);
    component.setData("import QtQml 2.15\nimport Orvane.Loomkit 1.0\nQtObject { property QtObject loomkit: Loomkit }\n",
                      QUrl());
    QScopedPointer<QObject> probe(component.create());
    if (!probe)
        qWarning() << component.errors();
    return probe ? probe->property("loomkit").value<QObject *>() : nullptr;
}

static QStringList debugLines;

static void captureMessages(QtMsgType type, const QMessageLogContext &context, const QString &message)
{
    if (type == QtDebugMsg && context.category && QByteArray(context.category).startsWith("Orvane."))
        debugLines << message;
}

class tst_LoomkitPlugin : public QObject
{
    Q_OBJECT

private slots:
    void newLoomkitAfterFirstEngineDies();
    void twoEnginesShareOneLoomkit();
    void uncreatableMessages_data();
    void uncreatableMessages();
    void compiledInResources();
};

void tst_LoomkitPlugin::newLoomkitAfterFirstEngineDies()
{
    // Runs first: loading the plug-in, too, must print no debug lines by default.
    QPointer<QObject> old;
    const QtMessageHandler previous = qInstallMessageHandler(captureMessages);
    {
        QQmlEngine engine;
        old = loomkitOf(engine);
        QVERIFY(old);
    }
    qInstallMessageHandler(previous);
    QCOMPARE(debugLines, QStringList());
    QVERIFY(old.isNull());
    QQmlEngine later;
    QObject *fresh = loomkitOf(later);
    QVERIFY(fresh);
    QCOMPARE(fresh->parent(), &later);
}

void tst_LoomkitPlugin::twoEnginesShareOneLoomkit()
{
    QQmlEngine first;
    QQmlEngine second;
    QObject *a = loomkitOf(first);
    QVERIFY(a);
    QCOMPARE(loomkitOf(second), a);
    QCOMPARE(a->parent(), &first);
    // Each engine still gets a translator of its own.
    QCOMPARE(first.findChildren<QTranslator *>(QString(), Qt::FindDirectChildrenOnly).size(), 1);
    QCOMPARE(second.findChildren<QTranslator *>(QString(), Qt::FindDirectChildrenOnly).size(), 1);
}

void tst_LoomkitPlugin::uncreatableMessages_data()
{
    QTest::addColumn<QString>("type");
    QTest::newRow("LoomkitObject") << "LoomkitObject";
    QTest::newRow("LoomkitError") << "LoomkitError";
}

void tst_LoomkitPlugin::uncreatableMessages()
{
    QFETCH(QString, type);
    QQmlEngine engine;
    addImportPath(engine);
    QQmlComponent component(&engine);
    component.setData(QStringLiteral("import Orvane.Loomkit 1.0\n%1 {}\n").arg(type).toUtf8(), QUrl());
    QVERIFY(component.isError());
    QCOMPARE(component.errors().first().description(), QStringLiteral("The Orvane type %1 is not creatable").arg(type));
}

void tst_LoomkitPlugin::compiledInResources()
{
    QQmlEngine engine;
    QVERIFY(loomkitOf(engine)); // loads the library, and with it the resources

    QFile qmldir(QStringLiteral(":/Orvane/imports/Orvane/Loomkit/qmldir"));
    QVERIFY(qmldir.open(QIODevice::ReadOnly));
    QCOMPARE(qmldir.readAll(), QByteArray("module Orvane.Loomkit\r\nplugin LoomkitPlugin\r\n"
                                          "classname LoomkitPlugin\r\ntypeinfo LoomkitPlugin.qmltypes\r\n"));
    QVERIFY(QImage(QStringLiteral(":/images/defaultThumbnail.png")).width() >= 200);

    const QStringList languages = QDir(QStringLiteral("://languages")).entryList(QDir::Files);
    QCOMPARE(languages.size(), 39);
    QVERIFY(languages.contains(QStringLiteral("LoomkitPlugin_de.qm")));
    QVERIFY(languages.contains(QStringLiteral("LoomkitPlugin_zh_TW.qm")));
    QTranslator german;
    QVERIFY(german.load(QStringLiteral("LoomkitPlugin_de"), QStringLiteral("://languages")));
    QCOMPARE(german.translate("QObject", "Cancel"), QStringLiteral("Abbrechen"));
    QVERIFY(!german.translate("QObject", "Open in ").isEmpty());
    QTranslator english;
    QVERIFY(english.load(QStringLiteral("LoomkitPlugin_en"), QStringLiteral("://languages")));
    QVERIFY(english.isEmpty());
}

QTEST_MAIN(tst_LoomkitPlugin)
#include "tst_LoomkitPlugin.moc"
