// Runs the tst_*.qml files against the plug-in in the build tree.
#include <QCoreApplication>
#include <QObject>
#include <QQmlContext>
#include <QQmlEngine>
#include <QVariant>
#include <QtQuickTest>

#include "NetworkingPrivate.h"
#include "TestHttpServer.h"

class TranslatorManager : public QObject
{
    Q_OBJECT
    Q_PROPERTY(QVariant lastTranslations READ lastTranslations NOTIFY loaded)
    Q_PROPERTY(QString lastFolder READ lastFolder NOTIFY loaded)
    Q_PROPERTY(QString lastLocale READ lastLocale NOTIFY loaded)
    Q_PROPERTY(int calls READ calls NOTIFY loaded)

public:
    using QObject::QObject;
    QVariant lastTranslations() const { return m_translations; }
    QString lastFolder() const { return m_folder; }
    QString lastLocale() const { return m_locale; }
    int calls() const { return m_calls; }

public slots:
    // The host's side of Loomkit.loadTranslator: records what it was given.
    void loadTranslator(const QVariant &translations, const QString &folder, const QString &locale)
    {
        m_translations = translations;
        m_folder = folder;
        m_locale = locale;
        ++m_calls;
        emit loaded();
    }

signals:
    void loaded();

private:
    QVariant m_translations;
    QString m_folder;
    QString m_locale;
    int m_calls = 0;
};

class Setup : public QObject
{
    Q_OBJECT

public slots:
    void applicationAvailable()
    {
        auto *manager = new TranslatorManager(QCoreApplication::instance());
        QCoreApplication::instance()->setProperty("Orvane.Loomkit.TranslatorManager",
                                                  QVariant::fromValue<QObject *>(manager));
        // The host publishes its network service before any request exists;
        // on this thread, so that requests can query it directly.
        NetworkingPrivate::publish();
        m_server = new TestHttpServer(QCoreApplication::instance());
        if (!m_server->start())
            qWarning("Cannot start the loopback HTTP server");
    }

    void qmlEngineAvailable(QQmlEngine *engine)
    {
        engine->addImportPath(QStringLiteral(LOOMKIT_QML_DIR));
        engine->rootContext()->setContextProperty(QStringLiteral("testTranslatorManager"),
            QCoreApplication::instance()->property("Orvane.Loomkit.TranslatorManager").value<QObject *>());
        engine->rootContext()->setContextProperty(QStringLiteral("testDataFolder"),
                                                  qEnvironmentVariable("LOOMKIT_TEST_DATA"));
        engine->rootContext()->setContextProperty(QStringLiteral("testHttpServer"), m_server);
    }

private:
    TestHttpServer *m_server = nullptr;
};

QUICK_TEST_MAIN_WITH_SETUP(loomkit, Setup)

#include "QmlTestMain.moc"
