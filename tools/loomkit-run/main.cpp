// loomkit-run: runs a QML file with the Orvane.Loomkit module, as a host
// application would. Without a display it runs offscreen; it can save a PNG
// of the window and quit after a given time, so that demos run headless.
#include "LocalHttpServer.h"
#include "NetworkingPrivate.h"
#include "TranslatorManager.h"

#include <QCommandLineParser>
#include <QDir>
#include <QFileInfo>
#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQmlComponent>
#include <QQmlContext>
#include <QQuickItem>
#include <QQuickWindow>
#include <QPixmap>
#include <QScreen>
#include <QTimer>

#include <cstdio>

namespace {

bool hasDisplay()
{
    return !qEnvironmentVariableIsEmpty("DISPLAY") || !qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY");
}

} // namespace

int main(int argc, char *argv[])
{
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM") && !hasDisplay())
        qputenv("QT_QPA_PLATFORM", "offscreen");
    // The offscreen platform has no OpenGL: render with the software backend.
    if (qgetenv("QT_QPA_PLATFORM") == "offscreen" && qEnvironmentVariableIsEmpty("QT_QUICK_BACKEND"))
        QQuickWindow::setSceneGraphBackend(QSGRendererInterface::Software);

    QGuiApplication app(argc, argv);
    QCoreApplication::setApplicationName(QStringLiteral("loomkit-run"));
    QCoreApplication::setOrganizationName(QStringLiteral("Orvane"));

    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral("Runs a QML file with the Orvane.Loomkit module."));
    parser.addHelpOption();
    parser.addPositionalArgument(QStringLiteral("file"), QStringLiteral("The QML file to run."));
    QCommandLineOption importOption({ QStringLiteral("I"), QStringLiteral("import") },
                                    QStringLiteral("Adds a QML import folder."), QStringLiteral("folder"));
    QCommandLineOption screenshotOption(QStringLiteral("screenshot"),
                                        QStringLiteral("Saves a PNG of the window before quitting."), QStringLiteral("png"));
    QCommandLineOption quitOption(QStringLiteral("quit-after"),
                                  QStringLiteral("Quits after this many milliseconds."), QStringLiteral("ms"));
    QCommandLineOption serveOption(QStringLiteral("serve"),
                                   QStringLiteral("Serves a folder over HTTP on 127.0.0.1 (QML: hostServer.url)."),
                                   QStringLiteral("folder"));
    parser.addOption(importOption);
    parser.addOption(serveOption);
    parser.addOption(screenshotOption);
    parser.addOption(quitOption);
    parser.process(app);

    const QStringList positional = parser.positionalArguments();
    if (positional.size() != 1)
        parser.showHelp(2);
    const QString file = positional.first();

    // The host's side of the module's contracts.
    auto *translatorManager = new TranslatorManager(&app);
    app.setProperty("Orvane.Loomkit.TranslatorManager", QVariant::fromValue<QObject *>(translatorManager));
    // The network service lives on this thread, so that requests can ask it
    // for the default configuration directly; it must exist before any
    // request does.
    NetworkingPrivate::publish();

    auto *server = new LocalHttpServer(&app);
    if (parser.isSet(serveOption)) {
        const QUrl served = server->serve(parser.value(serveOption));
        std::printf("Serving %s at %s\n", qPrintable(parser.value(serveOption)), qPrintable(served.toString()));
        std::fflush(stdout);
    }

    QQmlApplicationEngine engine;
#ifdef LOOMKIT_QML_DIR
    engine.addImportPath(QStringLiteral(LOOMKIT_QML_DIR));
#endif
    engine.rootContext()->setContextProperty(QStringLiteral("hostServer"), server);
    for (const QString &folder : parser.values(importOption))
        engine.addImportPath(QDir(folder).absolutePath());

    engine.load(QUrl::fromLocalFile(QFileInfo(file).absoluteFilePath()));
    if (engine.rootObjects().isEmpty()) {
        std::fprintf(stderr, "loomkit-run: could not load %s\n", qPrintable(file));
        return 1;
    }

    QObject *root = engine.rootObjects().first();
    QQuickWindow *window = qobject_cast<QQuickWindow *>(root);
    QScopedPointer<QQuickWindow> ownWindow;
    if (!window) {
        if (auto *item = qobject_cast<QQuickItem *>(root)) {
            ownWindow.reset(new QQuickWindow);
            window = ownWindow.data();
            item->setParentItem(window->contentItem());
            window->resize(int(item->width() > 0 ? item->width() : 800), int(item->height() > 0 ? item->height() : 600));
        }
    }
    if (!window) {
        std::fprintf(stderr, "loomkit-run: the root object is neither a Window nor an Item\n");
        return 1;
    }
    window->show();

    int exitCode = 0;
    if (parser.isSet(quitOption)) {
        const int delay = parser.value(quitOption).toInt();
        const QString screenshot = parser.value(screenshotOption);
        QTimer::singleShot(delay, &app, [&]() {
            if (!screenshot.isEmpty()) {
                QImage image = window->grabWindow();
                // The software backend cannot always grab; the screen holds
                // what was last painted.
                if (image.isNull() && window->screen())
                    image = window->screen()->grabWindow(window->winId()).toImage();
                if (image.isNull() || !image.save(screenshot)) {
                    std::fprintf(stderr, "loomkit-run: could not save %s\n", qPrintable(screenshot));
                    exitCode = 1;
                } else {
                    std::printf("Saved %s\n", qPrintable(screenshot));
                }
            }
            app.exit(exitCode);
        });
    }

    const int result = app.exec();
    return result != 0 ? result : exitCode;
}
