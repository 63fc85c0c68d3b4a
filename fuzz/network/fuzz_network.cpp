// Fuzzes what reads network data or data that shapes a request: response
// decoding by type, the Cookie header merge, the URL/form query merge, and
// the multipart file windows (offset/size), whose bytes are checked.
#include "NetworkFilePart.h"
#include "NetworkFormData.h"
#include "NetworkRequest.h"
#include "RequestQuery.h"

#include <QCoreApplication>
#include <QFile>
#include <QNetworkAccessManager>
#include <QNetworkCookieJar>
#include <QTemporaryDir>

#include <cstdint>
#include <cstdlib>

namespace {

QCoreApplication *app = nullptr;
QTemporaryDir *folder = nullptr;
QNetworkAccessManager *manager = nullptr;

void check(bool condition)
{
    if (!condition)
        std::abort();
}

void decode(const QByteArray &data)
{
    for (const char *type : { "json", "JSON", "base64", "binary", "text", "", "xml" })
        NetworkRequest::decodeResponse(data, QString::fromLatin1(type));
}

void cookies(const QByteArray &data)
{
    QVariantMap headers;
    headers.insert(QStringLiteral("Cookie"), QString::fromUtf8(data));
    // A fresh jar for each input, so that memory does not grow with the run.
    manager->setCookieJar(new QNetworkCookieJar);
    NetworkRequest::setCookies(manager, QUrl(QStringLiteral("http://127.0.0.1:8080/a/b")), headers);
}

void query(const QByteArray &data)
{
    const int split = data.indexOf('\n');
    const QUrl url(QString::fromUtf8(split < 0 ? data : data.left(split)));
    QVariantMap form;
    const QList<QByteArray> lines = split < 0 ? QList<QByteArray>() : data.mid(split + 1).split('\n');
    for (const QByteArray &line : lines) {
        const int eq = line.indexOf('=');
        form.insert(QString::fromUtf8(line.left(eq)), QString::fromUtf8(eq < 0 ? QByteArray() : line.mid(eq + 1)));
    }
    const RequestQuery requestQuery(url, form);
    check(!requestQuery.url().hasQuery());
    requestQuery.urlWithQuery();
}

// A window on a file read in fuzzed pieces, with rewinds: every byte must
// be the file's byte at that place, and the total must be size().
void window(const QByteArray &data)
{
    if (data.size() < 12)
        return;
    const qint64 offset = qint64(qint16((uchar(data[0]) << 8) | uchar(data[1])));
    const qint64 size = qint64(qint16((uchar(data[2]) << 8) | uchar(data[3])));
    const QByteArray content = data.mid(12);
    const QString path = folder->filePath(QStringLiteral("window.bin"));
    {
        QFile file(path);
        file.open(QIODevice::WriteOnly | QIODevice::Truncate);
        file.write(content);
    }
    NetworkFormData body;
    body.appendData(data.mid(4, 3));
    check(body.appendPath(path, offset, size));
    body.appendData(data.mid(7, 2));

    const qint64 start = qBound<qint64>(0, offset, content.size());
    const qint64 length = size == -1 ? content.size() - start
                                     : qBound<qint64>(0, qMin<qint64>(size, content.size() - start), content.size());
    const QByteArray expected = data.mid(4, 3) + content.mid(int(start), int(size < -1 ? 0 : length)) + data.mid(7, 2);
    check(body.size() == expected.size());

    for (int round = 0; round < 2; ++round) {
        QByteArray read;
        int step = 1 + uchar(data[9 + round]) % 64;
        for (;;) {
            const QByteArray piece = body.read(step);
            if (piece.isEmpty())
                break;
            read += piece;
            step = 1 + (step * 7) % 97;
        }
        check(read == expected);
        const qint64 middle = expected.isEmpty() ? 0 : uchar(data[11]) % expected.size();
        check(body.seek(middle));
        check(body.read(expected.size()) == expected.mid(int(middle)));
        check(body.seek(0));
    }
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int *argc, char ***argv)
{
    app = new QCoreApplication(*argc, *argv);
    folder = new QTemporaryDir;
    manager = new QNetworkAccessManager;
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *bytes, size_t size)
{
    if (size < 1)
        return 0;
    const QByteArray data(reinterpret_cast<const char *>(bytes) + 1, int(size - 1));
    switch (bytes[0] % 4) {
    case 0: decode(data); break;
    case 1: cookies(data); break;
    case 2: query(data); break;
    default: window(data); break;
    }
    return 0;
}
