// Run by ctest once per user-interface language, with the expected outcome in
// the environment: LOOMKIT_EXPECT_CANCEL is what "Cancel" becomes,
// LOOMKIT_EXPECT_INSTALL is "translations" (installed, with messages),
// "empty" (loaded but holding nothing, which Qt reports as a failed install)
// or "none" (no file for the language).
#include <QGuiApplication>
#include <QQmlComponent>
#include <QQmlEngine>
#include <QTranslator>
#include <QtTest>

class LanguageChangeCounter : public QObject
{
public:
    int count = 0;
protected:
    bool eventFilter(QObject *watched, QEvent *event) override
    {
        count += watched == qApp && event->type() == QEvent::LanguageChange;
        return false;
    }
};

static QStringList pluginLines;

static void capture(QtMsgType, const QMessageLogContext &context, const QString &message)
{
    if (context.category && qstrcmp(context.category, "Orvane.Loomkit.Plugin") == 0)
        pluginLines << message;
}

class tst_PluginTranslations : public QObject
{
    Q_OBJECT

private slots:
    void firstUiLanguageDecides();
};

void tst_PluginTranslations::firstUiLanguageDecides()
{
    const QString expectedCancel = qEnvironmentVariable("LOOMKIT_EXPECT_CANCEL");
    const QString expectInstall = qEnvironmentVariable("LOOMKIT_EXPECT_INSTALL");
    QVERIFY(!expectedCancel.isEmpty());
    QLoggingCategory::setFilterRules(QStringLiteral("Orvane.Loomkit.Plugin.debug=true"));
    qInstallMessageHandler(capture);
    LanguageChangeCounter counter;
    qApp->installEventFilter(&counter);

    QQmlEngine engine;
    engine.addImportPath(qEnvironmentVariable("LOOMKIT_BINARY_DIR") + QStringLiteral("/qml"));
    QQmlComponent component(&engine);
    component.setData("import QtQml 2.15\nimport Orvane.Loomkit 1.0\nQtObject { property string v: Loomkit.version }\n", QUrl());
    QScopedPointer<QObject> object(component.create());
    QVERIFY2(object, qPrintable(component.errorString()));
    qInstallMessageHandler(nullptr);

    QCOMPARE(counter.count, expectInstall == QLatin1String("translations") ? 1 : 0);
    QCOMPARE(pluginLines.filter(QStringLiteral("installTranslator() Failed")).size(), expectInstall == QLatin1String("empty") ? 1 : 0);
    QVERIFY(!pluginLines.filter(QStringLiteral("Offline storage path:")).isEmpty());
    QCOMPARE(QCoreApplication::translate("QObject", "Cancel"), expectedCancel);
    QCOMPARE(engine.findChildren<QTranslator *>().size(), 1);
}

QTEST_MAIN(tst_PluginTranslations)
#include "tst_PluginTranslations.moc"
