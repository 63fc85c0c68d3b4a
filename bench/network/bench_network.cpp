// One NetworkRequest exchange, timed: prints bytes, seconds and MB/s.
//   bench_network download <url> <responsePath>
//   bench_network upload <url> <file>
#include "NetworkRequest.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFileInfo>
#include <QNetworkAccessManager>

#include <cstdio>

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() != 4 || (args.at(1) != QLatin1String("download") && args.at(1) != QLatin1String("upload"))) {
        std::fprintf(stderr, "usage: bench_network download|upload <url> <path>\n");
        return 2;
    }
    const bool download = args.at(1) == QLatin1String("download");

    QNetworkAccessManager manager;
    NetworkRequest request;
    request.setNetworkAccessManager(&manager);
    QVariant body;
    qint64 bytes = 0;
    if (download) {
        request.setResponsePath(args.at(3));
        request.open(QStringLiteral("GET"), QUrl(args.at(2)));
    } else {
        QVariantMap form;
        form.insert(QStringLiteral("file"), QStringLiteral("@") + args.at(3));
        body = form;
        bytes = QFileInfo(args.at(3)).size();
        request.open(QStringLiteral("POST"), QUrl(args.at(2)));
    }

    QElapsedTimer clock;
    QObject::connect(&request, &NetworkRequest::readyStateChanged, &app, [&]() {
        if (request.readyState() == NetworkRequest::ReadyStateComplete)
            app.quit();
    });
    clock.start();
    request.send(body);
    app.exec();
    const double seconds = clock.nsecsElapsed() / 1e9;

    if (request.errorCode() != 0 || request.status() != 200) {
        std::fprintf(stderr, "bench_network: failed: %d %s (status %d)\n", request.errorCode(),
                     qPrintable(request.errorText()), request.status());
        return 1;
    }
    if (download)
        bytes = QFileInfo(args.at(3)).size();
    std::printf("%lld %.3f %.1f\n", static_cast<long long>(bytes), seconds, bytes / seconds / 1e6);
    return 0;
}
