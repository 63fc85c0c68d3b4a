#include "TestHttpServer.h"

#include <QCryptographicHash>
#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QProcess>
#include <QSslSocket>
#include <QTimer>
#include <QUrlQuery>

namespace {

QByteArray reasonFor(int status)
{
    switch (status) {
    case 200: return "OK";
    case 201: return "Created";
    case 204: return "No Content";
    case 301: return "Moved Permanently";
    case 302: return "Found";
    case 303: return "See Other";
    case 304: return "Not Modified";
    case 305: return "Use Proxy";
    case 307: return "Temporary Redirect";
    case 308: return "Permanent Redirect";
    case 400: return "Bad Request";
    case 401: return "Unauthorized";
    case 403: return "Forbidden";
    case 404: return "Not Found";
    case 500: return "Internal Server Error";
    default: return "Status";
    }
}

// Bytes whose value depends on their offset, so that a slice can be checked.
QByteArray pattern(qint64 size)
{
    QByteArray bytes(int(size), Qt::Uninitialized);
    for (int i = 0; i < bytes.size(); ++i)
        bytes[i] = char('a' + (i % 26));
    return bytes;
}

QByteArray parameter(const QByteArray &headerValue, const QByteArray &name)
{
    // name="value" or name=value inside a header such as Content-Disposition.
    const QList<QByteArray> pieces = headerValue.split(';');
    for (QByteArray piece : pieces) {
        piece = piece.trimmed();
        if (!piece.startsWith(name + '='))
            continue;
        QByteArray value = piece.mid(name.size() + 1);
        if (value.size() >= 2 && value.startsWith('"') && value.endsWith('"'))
            value = value.mid(1, value.size() - 2);
        return value;
    }
    return QByteArray();
}

} // namespace

QByteArray TestHttpRequest::header(const QByteArray &name) const
{
    QByteArray result;
    for (const auto &pair : headerList) {
        if (pair.first.compare(name, Qt::CaseInsensitive) == 0)
            result = pair.second;
    }
    return result;
}

QString TestHttpRequest::query(const QString &key) const
{
    return QUrlQuery(url).queryItemValue(key, QUrl::FullyDecoded);
}

TestHttpServer::TestHttpServer(QObject *parent)
    : QTcpServer(parent)
{
}

TestHttpServer::~TestHttpServer()
{
    close();
}

bool TestHttpServer::start()
{
    return listen(QHostAddress::LocalHost, 0);
}

bool TestHttpServer::startTls(const QSslCertificate &certificate, const QSslKey &key)
{
    m_certificate = certificate;
    m_key = key;
    m_tls = true;
    return start();
}

QUrl TestHttpServer::url() const
{
    QUrl result;
    result.setScheme(m_tls ? QStringLiteral("https") : QStringLiteral("http"));
    result.setHost(QStringLiteral("127.0.0.1"));
    result.setPort(serverPort());
    result.setPath(QStringLiteral("/"));
    return result;
}

QString TestHttpServer::urlFor(const QString &pathAndQuery) const
{
    QString base = url().toString();
    base.chop(1);
    return base + pathAndQuery;
}

void TestHttpServer::route(const QString &path, const Handler &handler)
{
    m_routes.insert(path, handler);
}

QVariantMap TestHttpServer::lastRequest() const
{
    QVariantMap map;
    if (m_requests.isEmpty())
        return map;
    const TestHttpRequest &request = m_requests.last();
    map.insert(QStringLiteral("method"), QString::fromLatin1(request.method));
    map.insert(QStringLiteral("target"), QString::fromUtf8(request.target));
    map.insert(QStringLiteral("body"), QString::fromUtf8(request.body));
    QVariantMap headers;
    for (const auto &pair : request.headerList)
        headers.insert(QString::fromLatin1(pair.first).toLower(), QString::fromUtf8(pair.second));
    map.insert(QStringLiteral("headers"), headers);
    return map;
}

bool TestHttpServer::makeCertificate(const QString &folder, QSslCertificate *certificate, QSslKey *key)
{
    const QString keyPath = QDir(folder).filePath(QStringLiteral("key.pem"));
    const QString certificatePath = QDir(folder).filePath(QStringLiteral("certificate.pem"));
    QProcess openssl;
    openssl.start(QStringLiteral("openssl"),
                  { QStringLiteral("req"), QStringLiteral("-x509"), QStringLiteral("-newkey"), QStringLiteral("rsa:2048"),
                    QStringLiteral("-nodes"), QStringLiteral("-keyout"), keyPath, QStringLiteral("-out"), certificatePath,
                    QStringLiteral("-days"), QStringLiteral("2"),
                    QStringLiteral("-subj"), QStringLiteral("/O=Loomkit Tests/CN=127.0.0.1") });
    if (!openssl.waitForFinished(60000) || openssl.exitCode() != 0)
        return false;
    QFile keyFile(keyPath);
    QFile certificateFile(certificatePath);
    if (!keyFile.open(QIODevice::ReadOnly) || !certificateFile.open(QIODevice::ReadOnly))
        return false;
    *key = QSslKey(keyFile.readAll(), QSsl::Rsa);
    *certificate = QSslCertificate(certificateFile.readAll());
    return !key->isNull() && !certificate->isNull();
}

QList<TestMultipartPart> TestHttpServer::parseMultipart(const QByteArray &contentType, const QByteArray &body,
                                                        bool *wellFormed)
{
    QList<TestMultipartPart> parts;
    bool ok = false;
    const QByteArray boundary = parameter(contentType, "boundary");
    if (boundary.isEmpty() || !contentType.startsWith("multipart/form-data")) {
        if (wellFormed)
            *wellFormed = false;
        return parts;
    }
    const QByteArray delimiter = "--" + boundary;
    int position = 0;
    if (body.startsWith(delimiter + "\r\n")) {
        position = delimiter.size() + 2;
        for (;;) {
            const int headerEnd = body.indexOf("\r\n\r\n", position);
            if (headerEnd < 0)
                break;
            TestMultipartPart part;
            const QList<QByteArray> lines = body.mid(position, headerEnd - position).split('\n');
            for (QByteArray line : lines) {
                line = line.trimmed();
                const int colon = line.indexOf(':');
                if (colon < 0)
                    continue;
                const QByteArray name = line.left(colon).trimmed().toLower();
                const QByteArray value = line.mid(colon + 1).trimmed();
                if (name == "content-disposition") {
                    part.name = parameter(value, "name");
                    part.hasFileName = value.contains("filename=");
                    part.fileName = parameter(value, "filename");
                } else if (name == "content-type") {
                    part.contentType = value;
                }
            }
            const int contentStart = headerEnd + 4;
            const int next = body.indexOf("\r\n" + delimiter, contentStart);
            if (next < 0)
                break;
            part.content = body.mid(contentStart, next - contentStart);
            parts.append(part);
            position = next + 2 + delimiter.size();
            if (body.mid(position) == "--\r\n") {
                ok = true;
                break;
            }
            if (body.mid(position, 2) != "\r\n")
                break;
            position += 2;
        }
    } else if (body == delimiter + "--\r\n") {
        ok = true;
    }
    if (wellFormed)
        *wellFormed = ok;
    return parts;
}

void TestHttpServer::incomingConnection(qintptr socketDescriptor)
{
    QTcpSocket *socket = nullptr;
    if (m_tls) {
        auto *sslSocket = new QSslSocket(this);
        if (!sslSocket->setSocketDescriptor(socketDescriptor)) {
            delete sslSocket;
            return;
        }
        sslSocket->setLocalCertificate(m_certificate);
        sslSocket->setPrivateKey(m_key);
        sslSocket->startServerEncryption();
        socket = sslSocket;
    } else {
        socket = new QTcpSocket(this);
        if (!socket->setSocketDescriptor(socketDescriptor)) {
            delete socket;
            return;
        }
    }
    new TestHttpConnection(socket, this);
}

void TestHttpServer::dispatch(const TestHttpRequest &request, TestHttpConnection *connection)
{
    m_requests.append(request);
    const auto it = m_routes.constFind(request.path());
    if (it != m_routes.constEnd())
        it.value()(request, connection);
    else
        defaultRoutes(request, connection);
}

// The built-in routes, by path:
//  /echo                 the request as JSON, multipart parts with sha256
//  /status?code=N        that status, body "status N"
//  /redirect?code=N&to=U N with Location U (none without `to`)
//  /text?body=B&type=T   B as the body, T as its type
//  /bytes?size=N         N pattern bytes with Content-Length
//  /chunked?size=N&pieces=K  N pattern bytes, chunked
//  /slow?size=N&pieces=K&interval=MS  with Content-Length, sent slowly
//  /truncate?size=N      announces N bytes, sends half, closes
//  /close                chunked, closes in the middle of the body
//  /reset                resets the connection at once
//  /garbage              answers with something that is not HTTP
//  /hang                 never answers
//  /cookies?set=N=V      Set-Cookie N=V; the body is the Cookie received
//  /auth?user=U&password=P&realm=R  Basic authentication
void TestHttpServer::defaultRoutes(const TestHttpRequest &request, TestHttpConnection *connection)
{
    const QString path = request.path();
    if (path == QLatin1String("/echo")) {
        QJsonObject object;
        object.insert(QStringLiteral("method"), QString::fromLatin1(request.method));
        object.insert(QStringLiteral("target"), QString::fromUtf8(request.target));
        object.insert(QStringLiteral("query"), request.url.query(QUrl::FullyEncoded));
        QJsonObject headers;
        for (const auto &pair : request.headerList)
            headers.insert(QString::fromLatin1(pair.first).toLower(), QString::fromUtf8(pair.second));
        object.insert(QStringLiteral("headers"), headers);
        object.insert(QStringLiteral("body"), QString::fromUtf8(request.body.left(4096)));
        object.insert(QStringLiteral("bodySize"), request.body.size());
        object.insert(QStringLiteral("sha256"),
                      QString::fromLatin1(QCryptographicHash::hash(request.body, QCryptographicHash::Sha256).toHex()));
        bool wellFormed = false;
        const QList<TestMultipartPart> parts = parseMultipart(request.header("Content-Type"), request.body, &wellFormed);
        QJsonArray partArray;
        for (const TestMultipartPart &part : parts) {
            QJsonObject partObject;
            partObject.insert(QStringLiteral("name"), QString::fromUtf8(part.name));
            if (part.hasFileName)
                partObject.insert(QStringLiteral("filename"), QString::fromUtf8(part.fileName));
            partObject.insert(QStringLiteral("contentType"), QString::fromUtf8(part.contentType));
            partObject.insert(QStringLiteral("size"), part.content.size());
            partObject.insert(QStringLiteral("sha256"),
                              QString::fromLatin1(QCryptographicHash::hash(part.content, QCryptographicHash::Sha256).toHex()));
            partObject.insert(QStringLiteral("text"), QString::fromUtf8(part.content.left(256)));
            partArray.append(partObject);
        }
        object.insert(QStringLiteral("parts"), partArray);
        object.insert(QStringLiteral("multipartWellFormed"), wellFormed);
        connection->respond(200, QJsonDocument(object).toJson(QJsonDocument::Compact),
                            { { "Content-Type", "application/json" } });
    } else if (path == QLatin1String("/status")) {
        const int code = request.query(QStringLiteral("code")).toInt();
        connection->respond(code, "status " + QByteArray::number(code));
    } else if (path == QLatin1String("/redirect")) {
        const int code = request.query(QStringLiteral("code")).toInt();
        QList<QPair<QByteArray, QByteArray>> headers;
        const QString to = request.query(QStringLiteral("to"));
        if (!to.isEmpty())
            headers.append({ "Location", to.toUtf8() });
        connection->respond(code ? code : 302, "redirect body", headers);
    } else if (path == QLatin1String("/text")) {
        const QString type = request.query(QStringLiteral("type"));
        connection->respond(200, request.query(QStringLiteral("body")).toUtf8(),
                            { { "Content-Type", type.isEmpty() ? QByteArray("text/plain; charset=utf-8") : type.toUtf8() } });
    } else if (path == QLatin1String("/bytes")) {
        connection->respond(200, pattern(request.query(QStringLiteral("size")).toLongLong()),
                            { { "Content-Type", "application/octet-stream" } });
    } else if (path == QLatin1String("/chunked")) {
        const QByteArray body = pattern(request.query(QStringLiteral("size")).toLongLong());
        const int pieces = qMax(1, request.query(QStringLiteral("pieces")).toInt());
        QByteArray out = "HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\nContent-Type: text/plain\r\n\r\n";
        const int step = qMax(1, (body.size() + pieces - 1) / pieces);
        for (int i = 0; i < body.size(); i += step) {
            const QByteArray piece = body.mid(i, step);
            out += QByteArray::number(piece.size(), 16) + "\r\n" + piece + "\r\n";
        }
        out += "0\r\n\r\n";
        connection->write(out);
    } else if (path == QLatin1String("/slow")) {
        const QByteArray body = pattern(request.query(QStringLiteral("size")).toLongLong());
        connection->write("HTTP/1.1 200 OK\r\nContent-Length: " + QByteArray::number(body.size())
                          + "\r\nContent-Type: text/plain\r\n\r\n");
        connection->writeSlowly(body, qMax(1, request.query(QStringLiteral("pieces")).toInt()),
                                qMax(1, request.query(QStringLiteral("interval")).toInt()));
    } else if (path == QLatin1String("/truncate")) {
        const QByteArray body = pattern(request.query(QStringLiteral("size")).toLongLong());
        connection->write("HTTP/1.1 200 OK\r\nContent-Length: " + QByteArray::number(body.size())
                          + "\r\nContent-Type: text/plain\r\n\r\n" + body.left(body.size() / 2));
        connection->close();
    } else if (path == QLatin1String("/close")) {
        connection->write("HTTP/1.1 200 OK\r\nTransfer-Encoding: chunked\r\n\r\n10\r\n0123456789");
        connection->close();
    } else if (path == QLatin1String("/reset")) {
        connection->reset();
    } else if (path == QLatin1String("/garbage")) {
        connection->write("\x01\x02 this is not HTTP \xff\xfe\r\n\r\n");
        connection->close();
    } else if (path == QLatin1String("/hang")) {
        // Nothing: the client waits until it gives up.
    } else if (path == QLatin1String("/cookies")) {
        QList<QPair<QByteArray, QByteArray>> headers;
        const QString set = request.query(QStringLiteral("set"));
        if (!set.isEmpty())
            headers.append({ "Set-Cookie", set.toUtf8() + "; Path=/" });
        connection->respond(200, request.header("Cookie"), headers);
    } else if (path == QLatin1String("/auth")) {
        const QByteArray expected = "Basic "
            + (request.query(QStringLiteral("user")) + QLatin1Char(':') + request.query(QStringLiteral("password")))
                  .toUtf8().toBase64();
        if (request.header("Authorization") == expected) {
            connection->respond(200, "welcome");
        } else {
            const QByteArray realm = request.query(QStringLiteral("realm")).toUtf8();
            connection->respond(401, "who are you", { { "WWW-Authenticate", "Basic realm=\"" + realm + "\"" } });
        }
    } else {
        connection->respond(404, "no such route");
    }
}

TestHttpConnection::TestHttpConnection(QTcpSocket *socket, TestHttpServer *server)
    : QObject(socket)
    , m_socket(socket)
    , m_server(server)
{
    connect(socket, &QTcpSocket::readyRead, this, &TestHttpConnection::onReadyRead);
    connect(socket, &QTcpSocket::disconnected, socket, &QObject::deleteLater);
}

void TestHttpConnection::onReadyRead()
{
    m_buffer += m_socket->readAll();
    while (!m_busy && parseOne()) {
    }
}

bool TestHttpConnection::parseOne()
{
    const int headerEnd = m_buffer.indexOf("\r\n\r\n");
    if (headerEnd < 0)
        return false;
    const QList<QByteArray> lines = m_buffer.left(headerEnd).split('\n');
    TestHttpRequest request;
    const QList<QByteArray> requestLine = lines.first().trimmed().split(' ');
    if (requestLine.size() < 2) {
        reset();
        return false;
    }
    request.method = requestLine.at(0);
    request.target = requestLine.at(1);
    qint64 contentLength = 0;
    for (int i = 1; i < lines.size(); ++i) {
        const QByteArray line = lines.at(i).trimmed();
        const int colon = line.indexOf(':');
        if (colon <= 0)
            continue;
        request.headerList.append({ line.left(colon).trimmed(), line.mid(colon + 1).trimmed() });
        if (line.left(colon).trimmed().compare("Content-Length", Qt::CaseInsensitive) == 0)
            contentLength = line.mid(colon + 1).trimmed().toLongLong();
    }
    if (m_buffer.size() < headerEnd + 4 + contentLength)
        return false;
    request.body = m_buffer.mid(headerEnd + 4, int(contentLength));
    m_buffer.remove(0, headerEnd + 4 + int(contentLength));
    request.url = m_server ? m_server->url().resolved(QUrl::fromEncoded(request.target)) : QUrl();
    if (m_server)
        m_server->dispatch(request, this);
    return true;
}

void TestHttpConnection::respond(int status, const QByteArray &body,
                                 const QList<QPair<QByteArray, QByteArray>> &headers, const QByteArray &reason)
{
    QByteArray out = "HTTP/1.1 " + QByteArray::number(status) + ' ' + (reason.isEmpty() ? reasonFor(status) : reason)
                     + "\r\nContent-Length: " + QByteArray::number(body.size()) + "\r\n";
    bool hasType = false;
    for (const auto &pair : headers) {
        out += pair.first + ": " + pair.second + "\r\n";
        hasType = hasType || pair.first.compare("Content-Type", Qt::CaseInsensitive) == 0;
    }
    if (!hasType)
        out += "Content-Type: text/plain; charset=utf-8\r\n";
    out += "\r\n" + body;
    write(out);
}

void TestHttpConnection::write(const QByteArray &bytes)
{
    m_socket->write(bytes);
}

void TestHttpConnection::writeSlowly(const QByteArray &bytes, int pieces, int intervalMs, bool closeAfter)
{
    m_busy = true;
    const int step = qMax(1, (bytes.size() + pieces - 1) / pieces);
    auto *timer = new QTimer(this);
    auto offset = QSharedPointer<int>::create(0);
    connect(timer, &QTimer::timeout, this, [this, timer, bytes, step, offset, closeAfter]() {
        if (m_socket->state() != QAbstractSocket::ConnectedState) {
            timer->deleteLater();
            return;
        }
        m_socket->write(bytes.mid(*offset, step));
        *offset += step;
        if (*offset >= bytes.size()) {
            timer->deleteLater();
            m_busy = false;
            if (closeAfter)
                close();
        }
    });
    timer->start(intervalMs);
}

void TestHttpConnection::close()
{
    m_socket->disconnectFromHost();
}

void TestHttpConnection::reset()
{
    m_socket->abort();
    m_socket->deleteLater();
}
