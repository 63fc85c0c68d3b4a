#ifndef TESTHTTPSERVER_H
#define TESTHTTPSERVER_H

#include <QByteArray>
#include <QList>
#include <QMap>
#include <QObject>
#include <QPair>
#include <QPointer>
#include <QSslCertificate>
#include <QSslKey>
#include <QTcpServer>
#include <QUrl>
#include <QVariantMap>

#include <functional>

class QTcpSocket;
class TestHttpConnection;

// One request as the server read it.
struct TestHttpRequest
{
    QByteArray method;
    QByteArray target;              // path and query as sent
    QUrl url;                       // target parsed against the server's base
    QList<QPair<QByteArray, QByteArray>> headerList;
    QByteArray body;

    // Header by name, any case; the last one of that name.
    QByteArray header(const QByteArray &name) const;
    QString path() const { return url.path(); }
    QString query(const QString &key) const;
};

// One part of a multipart/form-data body.
struct TestMultipartPart
{
    QByteArray name;
    QByteArray fileName;
    QByteArray contentType;
    QByteArray content;
    bool hasFileName = false;
};

// A loopback HTTP/1.1 server for tests, on 127.0.0.1 and an ephemeral port.
// Handlers answer by path; what no handler takes goes to built-in routes
// (see defaultRoutes() in the source) that QML tests use as well. With a
// certificate and key it speaks TLS. It stops when destroyed.
class TestHttpServer : public QTcpServer
{
    Q_OBJECT
    Q_PROPERTY(QUrl url READ url CONSTANT)
    Q_PROPERTY(int requestCount READ requestCount)

public:
    using Handler = std::function<void(const TestHttpRequest &request, TestHttpConnection *connection)>;

    explicit TestHttpServer(QObject *parent = nullptr);
    ~TestHttpServer() override;

    bool start();
    bool startTls(const QSslCertificate &certificate, const QSslKey &key);

    QUrl url() const;
    Q_INVOKABLE QString urlFor(const QString &pathAndQuery) const;

    // Handler for an exact path, ahead of the built-in routes.
    void route(const QString &path, const Handler &handler);

    QList<TestHttpRequest> requests() const { return m_requests; }
    int requestCount() const { return m_requests.size(); }
    Q_INVOKABLE QVariantMap lastRequest() const;
    Q_INVOKABLE void clearRequests() { m_requests.clear(); }

    // Makes a self-signed certificate for 127.0.0.1 with the openssl tool.
    static bool makeCertificate(const QString &folder, QSslCertificate *certificate, QSslKey *key);
    static QList<TestMultipartPart> parseMultipart(const QByteArray &contentType, const QByteArray &body,
                                                   bool *wellFormed = nullptr);

protected:
    void incomingConnection(qintptr socketDescriptor) override;

private:
    friend class TestHttpConnection;
    void dispatch(const TestHttpRequest &request, TestHttpConnection *connection);
    void defaultRoutes(const TestHttpRequest &request, TestHttpConnection *connection);

    QMap<QString, Handler> m_routes;
    QList<TestHttpRequest> m_requests;
    QSslCertificate m_certificate;
    QSslKey m_key;
    bool m_tls = false;
};

// The server side of one connection. A handler answers with respond(), or
// writes raw bytes, and may keep the pointer to answer later.
class TestHttpConnection : public QObject
{
    Q_OBJECT

public:
    TestHttpConnection(QTcpSocket *socket, TestHttpServer *server);

    void respond(int status, const QByteArray &body,
                 const QList<QPair<QByteArray, QByteArray>> &headers = {},
                 const QByteArray &reason = QByteArray());
    void write(const QByteArray &bytes);
    // Sends `body` in pieces, one every `intervalMs`, then keeps the connection.
    void writeSlowly(const QByteArray &bytes, int pieces, int intervalMs, bool closeAfter = false);
    void close();       // orderly close after what was written
    void reset();       // abort: the peer sees a reset
    QTcpSocket *socket() const { return m_socket; }

private:
    void onReadyRead();
    bool parseOne();

    QTcpSocket *m_socket;
    QPointer<TestHttpServer> m_server;
    QByteArray m_buffer;
    bool m_busy = false;
};

#endif // TESTHTTPSERVER_H
