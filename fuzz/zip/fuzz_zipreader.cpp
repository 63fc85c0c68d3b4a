// Opens arbitrary bytes as a zip archive, lists it, reads its first entry
// and extracts it twice (ZipReader and UnZipFile) into a scratch folder.
// Anything that appears beside the scratch folder is an escape: abort.

#include "UnZipFile.h"
#include "ZipReader.h"

#include <QCoreApplication>
#include <QDir>
#include <QFile>
#include <QTemporaryDir>

#include <cstdint>
#include <cstdlib>

namespace {

QTemporaryDir *workDir = nullptr;

void quiet(QtMsgType, const QMessageLogContext &, const QString &)
{
}

void checkNothingEscaped()
{
    const QStringList entries = QDir(workDir->path()).entryList(QDir::AllEntries | QDir::NoDotAndDotDot | QDir::Hidden | QDir::System);
    for (const QString &entry : entries) {
        if (entry != QLatin1String("input.zip") && entry != QLatin1String("out"))
            abort();
    }
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int *argc, char ***argv)
{
    static QCoreApplication app(*argc, *argv);
    qInstallMessageHandler(quiet);
    const QByteArray shm("/dev/shm");
    workDir = QDir(QString::fromLatin1(shm)).exists() ? new QTemporaryDir(QStringLiteral("/dev/shm/fuzz_zipreader-XXXXXX"))
                                                      : new QTemporaryDir();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QString input = workDir->filePath(QStringLiteral("input.zip"));
    {
        QFile file(input);
        if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate))
            abort();
        file.write(reinterpret_cast<const char *>(data), qint64(size));
    }
    const QString out = workDir->filePath(QStringLiteral("out"));

    {
        ZipReader reader;
        reader.setPath(input);
        const QStringList files = reader.fileNames();
        reader.folderNames();
        if (!files.isEmpty()) {
            reader.exists(files.first());
            delete reader.fileInfo(files.first());
            reader.readTextFile(files.first());
        }
        reader.extractAll(out);
        reader.extractAll(out, QStringLiteral("a"));
    }
    checkNothingEscaped();
    QDir(out).removeRecursively();

    {
        UnZipFile unzip;
        if (unzip.open(input)) {
            unzip.fileNames();
            QDir dir(out);
            dir.mkpath(out);
            unzip.extractAll(dir);
        }
    }
    checkNothingEscaped();
    QDir(out).removeRecursively();
    return 0;
}
