// Drives a File through a random series of writes, reads, line reads and
// seeks, and checks every result against a model of the file's bytes.
#include "File.h"

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>

#include <cstdint>
#include <cstdlib>

namespace {

QTemporaryDir *folder()
{
    static int argc = 1;
    static char name[] = "fuzz_file_stream";
    static char *argv[] = { name, nullptr };
    static QCoreApplication app(argc, argv);
    static QTemporaryDir dir;
    return &dir;
}

void check(bool condition)
{
    if (!condition)
        std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QString path = folder()->filePath(QStringLiteral("stream.bin"));
    QFile::remove(path);

    File file(path);
    // Latin-1 maps each character to one byte, so the model stays exact.
    file.setTextEncoding(File::TextEncodingLatin1);
    check(file.open(File::OpenModeReadWrite));

    QByteArray model;
    qint64 position = 0;
    size_t i = 0;
    auto next = [&]() -> int { return i < size ? data[i++] : -1; };

    for (int op = next(); op >= 0; op = next()) {
        switch (op % 6) {
        case 0: { // write
            const int length = qMax(0, next()) % 64;
            QByteArray chunk;
            for (int n = 0; n < length && i < size; ++n)
                chunk.append(char(data[i++]));
            file.write(QJSValue(QString::fromLatin1(chunk.constData(), chunk.size())));
            model.replace(int(position), qMin(chunk.size(), model.size() - int(position)), chunk);
            position += chunk.size();
            break;
        }
        case 1: { // read
            const int length = qMax(0, next()) % 64;
            const QByteArray read = file.read(length).toByteArray();
            check(read == model.mid(int(position), length));
            position += read.size();
            break;
        }
        case 2: { // readLine
            const QString line = file.readLine();
            const int end = model.indexOf('\n', int(position));
            const QByteArray expected = model.mid(int(position), end < 0 ? -1 : end - int(position) + 1);
            // Lines decode as C strings: the text stops at a NUL byte.
            check(line.toLatin1() == QByteArray(expected.constData(), int(qstrnlen(expected.constData(), uint(expected.size())))));
            position += expected.size();
            break;
        }
        case 3: { // seek
            const int target = model.isEmpty() ? 0 : qMax(0, next()) % (model.size() + 1);
            file.setPosition(target);
            position = target;
            break;
        }
        case 4: { // writeLine
            const int length = qMax(0, next()) % 16;
            const QByteArray text(length, 'a' + char(length % 26));
            file.writeLine(QString::fromLatin1(text.constData(), text.size()));
            const QByteArray chunk = text + '\n';
            model.replace(int(position), qMin(chunk.size(), model.size() - int(position)), chunk);
            position += chunk.size();
            break;
        }
        case 5: // readAll
            check(file.readAll().toByteArray() == model.mid(int(position)));
            position = model.size();
            break;
        }
        check(file.position() == position);
        check(file.atEnd() == (position >= model.size()));
    }

    file.close();
    QFile raw(path);
    check(raw.open(QIODevice::ReadOnly));
    check(raw.readAll() == model);
    return 0;
}
