// Reads arbitrary bytes line by line in every text encoding. Each line must
// move the position forward, the lines must end exactly at the end of the
// file, and in Latin-1 they must give back every byte up to a NUL in the
// line (lines decode as C strings).
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
    static char name[] = "fuzz_file_lines";
    static char *argv[] = { name, nullptr };
    static QCoreApplication app(argc, argv);
    static QTemporaryDir dir;
    return &dir;
}

} // namespace

// The bytes of each line, cut at its first NUL.
static QByteArray expectedLatin1(const QByteArray &bytes)
{
    QByteArray result;
    int start = 0;
    while (start < bytes.size()) {
        int end = bytes.indexOf('\n', start);
        end = end < 0 ? bytes.size() : end + 1;
        const QByteArray line = bytes.mid(start, end - start);
        result += QByteArray(line.constData(), int(qstrnlen(line.constData(), uint(line.size()))));
        start = end;
    }
    return result;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    const QByteArray bytes(reinterpret_cast<const char *>(data), int(size));
    const QString path = folder()->filePath(QStringLiteral("input.txt"));
    {
        QFile raw(path);
        if (!raw.open(QIODevice::WriteOnly | QIODevice::Truncate) || raw.write(bytes) != bytes.size())
            std::abort();
    }

    for (int encoding = File::TextEncodingUtf8; encoding <= File::TextEncodingUtf16; ++encoding) {
        File file(path);
        file.setTextEncoding(File::TextEncoding(encoding));
        if (!file.open(File::OpenModeReadOnly))
            std::abort();
        QString joined;
        qlonglong position = 0;
        while (!file.atEnd()) {
            const QString line = file.readLine();
            if (file.position() <= position)
                std::abort();
            position = file.position();
            joined += line;
        }
        if (position != bytes.size())
            std::abort();
        if (encoding == File::TextEncodingLatin1 && joined.toLatin1() != expectedLatin1(bytes))
            std::abort();
        if (encoding == File::TextEncodingUtf8 && !bytes.contains('\n') && joined != QString::fromUtf8(bytes))
            std::abort();
    }
    return 0;
}
