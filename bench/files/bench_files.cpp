// Runs one folder or file operation of the module and prints
// "<seconds> <bytes> <entries>" for run.sh to compare with the usual tools.
// Usage: bench_files size|list|copy|lines|write FOLDER-OR-FILE [TARGET]
#include "File.h"
#include "FileFolder.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QJSValue>

#include <cstdio>

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() < 3) {
        std::fprintf(stderr, "usage: bench_files size|list|copy|lines|write PATH [TARGET]\n");
        return 2;
    }
    const QString mode = args.at(1);
    const QString path = args.at(2);
    const QString target = args.value(3);

    QElapsedTimer timer;
    qint64 bytes = 0;
    qint64 entries = 0;
    timer.start();

    if (mode == QLatin1String("size")) {
        FileFolder folder(path);
        bytes = folder.size();
    } else if (mode == QLatin1String("list")) {
        FileFolder folder(path);
        entries = folder.fileNames(QVariant(), true).size();
    } else if (mode == QLatin1String("copy")) {
        FileFolder folder(QFileInfo(path).absolutePath());
        if (!folder.copyFile(QFileInfo(path).fileName(), target))
            return 1;
        bytes = FileFolder(target).size();
    } else if (mode == QLatin1String("lines")) {
        File file(path);
        if (!file.open(File::OpenModeReadOnly))
            return 1;
        while (!file.atEnd()) {
            bytes += file.readLine().size();
            ++entries;
        }
    } else if (mode == QLatin1String("write")) {
        // Streams one file into another through writeFile's device path.
        File source(path);
        FileFolder folder(QFileInfo(target).absolutePath());
        if (!folder.writeFile(QFileInfo(target).fileName(), QVariant::fromValue<QObject *>(&source)))
            return 1;
        bytes = QFileInfo(target).size();
    } else {
        std::fprintf(stderr, "unknown mode\n");
        return 2;
    }

    std::printf("%.6f %lld %lld\n", timer.nsecsElapsed() / 1e9, static_cast<long long>(bytes),
                static_cast<long long>(entries));
    return 0;
}
