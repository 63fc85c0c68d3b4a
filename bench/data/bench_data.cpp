// Times the module's hashing, Base64/hex views and JSON settings store.
// Usage:
//   bench_data hash <algorithm name> <file>
//   bench_data base64 <file>
//   bench_data hex <file>
//   bench_data settings <key count> <folder>
// Prints one line: "<what> <seconds> <MB/s or items/s>".
#include "BinaryData.h"
#include "CryptographicHash.h"
#include "Settings.h"

#include <QCoreApplication>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QMetaEnum>
#include <QTextStream>

static int fail(const QString &message)
{
    QTextStream(stderr) << message << '\n';
    return 1;
}

static void report(const QString &what, qint64 nanoseconds, double amount, const char *unit)
{
    const double seconds = nanoseconds / 1e9;
    QTextStream(stdout) << what << ' ' << QString::number(seconds, 'f', 3) << ' '
                        << QString::number(amount / seconds, 'f', 1) << ' ' << unit << '\n';
}

int main(int argc, char **argv)
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() < 3)
        return fail(QStringLiteral("usage: bench_data hash|base64|hex|settings ..."));
    const QString mode = args.at(1);

    if (mode == QLatin1String("hash") && args.size() == 4) {
        bool ok = false;
        const int algorithm = QMetaEnum::fromType<CryptographicHash::Algorithm>().keyToValue(qPrintable(args.at(2)), &ok);
        if (!ok)
            return fail(QStringLiteral("unknown algorithm"));
        CryptographicHash hash;
        hash.setAlgorithm(CryptographicHash::Algorithm(algorithm));
        QElapsedTimer timer;
        timer.start();
        if (!hash.addFile(args.at(3)))
            return fail(QStringLiteral("cannot read file"));
        const QString hex = hash.hex();
        const qint64 elapsed = timer.nsecsElapsed();
        QTextStream(stderr) << hex << '\n';
        report(args.at(2), elapsed, QFileInfo(args.at(3)).size() / 1e6, "MB/s");
        return 0;
    }

    if ((mode == QLatin1String("base64") || mode == QLatin1String("hex")) && args.size() == 3) {
        QElapsedTimer timer;
        timer.start();
        QFile file(args.at(2));
        if (!file.open(QIODevice::ReadOnly))
            return fail(QStringLiteral("cannot read file"));
        BinaryData bytes;
        bytes.setData(file.readAll());
        const QString text = mode == QLatin1String("hex") ? bytes.hex() : bytes.base64();
        QFile out(args.at(2) + QLatin1String(".out"));
        if (!out.open(QIODevice::WriteOnly))
            return fail(QStringLiteral("cannot write"));
        out.write(text.toLatin1());
        const qint64 elapsed = timer.nsecsElapsed();
        report(mode, elapsed, bytes.size() / 1e6, "MB/s");
        return 0;
    }

    if (mode == QLatin1String("settings") && args.size() == 4) {
        const int count = args.at(2).toInt();
        const QString path = QDir(args.at(3)).filePath(QStringLiteral("bench.json"));
        QFile::remove(path);
        QElapsedTimer timer;
        timer.start();
        {
            Settings settings(path, Settings::jsonFormat());
            for (int i = 0; i < count; ++i)
                settings.setValue(QStringLiteral("group/key%1").arg(i), QStringLiteral("value %1").arg(i));
        }
        report(QStringLiteral("settings-write"), timer.nsecsElapsed(), count, "keys/s");
        timer.restart();
        Settings settings(path, Settings::jsonFormat());
        int found = 0;
        for (int i = 0; i < count; ++i)
            found += settings.contains(QStringLiteral("group/key%1").arg(i));
        report(QStringLiteral("settings-read"), timer.nsecsElapsed(), count, "keys/s");
        return found == count ? 0 : fail(QStringLiteral("keys lost"));
    }
    return fail(QStringLiteral("bad arguments"));
}
