// Tools for bench/zip/run.sh:
//   bench_zip generate <folder> [megabytes]   makes a tree of ~2000 files
//   bench_zip extract <archive> <folder>      ZipReader::extractAll
//   bench_zip write <folder> <archive>        ZipWriter::addFile for every file

#include "ZipReader.h"
#include "ZipWriter.h"

#include <QCoreApplication>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QRandomGenerator>
#include <QTextStream>

#include <cstdio>

namespace {

const char *const words[] = {"loom", "thread", "weave", "shuttle", "warp", "weft", "pattern", "cloth", "spindle",
                             "bobbin", "heddle", "reed", "treadle", "harness", "linen", "cotton", "wool", "silk",
                             "the", "and", "of", "to", "a", "in", "is", "it", "that", "with", "for", "on"};

QByteArray text(QRandomGenerator &random, qint64 size)
{
    QByteArray out;
    out.reserve(int(size) + 16);
    int column = 0;
    while (out.size() < size) {
        const char *word = words[random.bounded(int(sizeof(words) / sizeof(words[0])))];
        out.append(word);
        column += int(qstrlen(word)) + 1;
        if (column > 72) {
            out.append('\n');
            column = 0;
        } else {
            out.append(' ');
        }
    }
    out.truncate(int(size));
    return out;
}

QByteArray json(QRandomGenerator &random, qint64 size)
{
    QByteArray out("{\n  \"items\": [\n");
    int id = 0;
    while (out.size() < size) {
        out.append(QStringLiteral("    {\"id\": %1, \"name\": \"%2\", \"weight\": %3, \"tags\": [\"%4\", \"%5\"]},\n")
                       .arg(id++)
                       .arg(QString::fromLatin1(words[random.bounded(18)]))
                       .arg(random.generateDouble() * 1000, 0, 'f', 3)
                       .arg(QString::fromLatin1(words[random.bounded(30)]))
                       .arg(QString::fromLatin1(words[random.bounded(30)]))
                       .toUtf8());
    }
    out.append("    {}\n  ]\n}\n");
    return out;
}

QByteArray noise(QRandomGenerator &random, qint64 size)
{
    QByteArray out(int(size), Qt::Uninitialized);
    random.fillRange(reinterpret_cast<quint32 *>(out.data()), int(size / 4));
    return out;
}

bool writeFile(const QString &path, const QByteArray &data)
{
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(data) == data.size();
}

int generate(const QString &root, double megabytes)
{
    const double scale = megabytes / 300.0;
    QRandomGenerator random(20240611);
    qint64 total = 0;
    int count = 0;
    auto folder = [&](int i) {
        return QStringLiteral("%1/part-%2/set-%3").arg(root).arg(i % 7).arg(i % 13);
    };
    auto put = [&](const QString &path, const QByteArray &data) {
        if (!writeFile(path, data)) {
            std::fprintf(stderr, "cannot write %s\n", qPrintable(path));
            return false;
        }
        total += data.size();
        ++count;
        return true;
    };
    for (int i = 0; i < 1500; ++i) {
        if (!put(QStringLiteral("%1/note-%2.txt").arg(folder(i)).arg(i), text(random, qint64((2000 + random.bounded(76000)) * scale))))
            return 1;
    }
    for (int i = 0; i < 400; ++i) {
        if (!put(QStringLiteral("%1/data-%2.json").arg(folder(i + 3)).arg(i), json(random, qint64((1000 + random.bounded(48000)) * scale))))
            return 1;
    }
    for (int i = 0; i < 94; ++i) {
        if (!put(QStringLiteral("%1/blob-%2.bin").arg(folder(i + 5)).arg(i), noise(random, qint64((200000 + random.bounded(1600000)) * scale))))
            return 1;
    }
    for (int i = 0; i < 3; ++i) {
        if (!put(QStringLiteral("%1/large/book-%2.txt").arg(root).arg(i), text(random, qint64(30e6 * scale))))
            return 1;
        if (!put(QStringLiteral("%1/large/image-%2.raw").arg(root).arg(i), noise(random, qint64(15e6 * scale))))
            return 1;
    }
    put(QStringLiteral("%1/empty.txt").arg(root), QByteArray());
    std::printf("%d files, %.1f MB\n", count, double(total) / 1e6);
    return 0;
}

int extract(const QString &archive, const QString &folder)
{
    ZipReader reader;
    reader.setPath(archive);
    int errors = 0;
    QObject::connect(&reader, &ZipReader::error, [&errors] { ++errors; });
    if (!reader.extractAll(folder))
        return 1;
    return errors == 0 ? 0 : 2;
}

int write(const QString &folder, const QString &archive)
{
    QFile::remove(archive);
    ZipWriter writer;
    writer.setPath(archive);
    const QDir root(folder);
    QDirIterator it(folder, QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString path = it.next();
        if (!writer.addFile(path, root.relativeFilePath(path)))
            return 1;
    }
    return 0;
}

} // namespace

int main(int argc, char *argv[])
{
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() >= 3 && args.at(1) == QLatin1String("generate"))
        return generate(args.at(2), args.size() > 3 ? args.at(3).toDouble() : 300.0);
    if (args.size() == 4 && args.at(1) == QLatin1String("extract"))
        return extract(args.at(2), args.at(3));
    if (args.size() == 4 && args.at(1) == QLatin1String("write"))
        return write(args.at(2), args.at(3));
    std::fprintf(stderr, "usage: bench_zip generate <folder> [MB] | extract <archive> <folder> | write <folder> <archive>\n");
    return 64;
}
