#include "LocalHttpServer.h"

#include <QFile>
#include <QFileInfo>
#include <QMimeDatabase>
#include <QTcpSocket>

LocalHttpServer::LocalHttpServer(QObject *parent)
    : QTcpServer(parent)
{
}

QUrl LocalHttpServer::url() const
{
    if (!isListening())
        return QUrl();
    return QUrl(QStringLiteral("http://127.0.0.1:%1/").arg(serverPort()));
}

QUrl LocalHttpServer::serve(const QString &folder)
{
    const QUrl asUrl(folder);
    const QString path = asUrl.isLocalFile() ? asUrl.toLocalFile() : folder;
    m_root = QDir(QFileInfo(path).canonicalFilePath());
    if (!isListening()) {
        if (!listen(QHostAddress::LocalHost, 0))
            return QUrl();
        emit urlChanged();
    }
    return url();
}

void LocalHttpServer::incomingConnection(qintptr socketDescriptor)
{
    auto *socket = new QTcpSocket(this);
    if (!socket->setSocketDescriptor(socketDescriptor)) {
        delete socket;
        return;
    }
    auto buffer = QSharedPointer<QByteArray>::create();
    connect(socket, &QTcpSocket::readyRead, this, [this, socket, buffer]() {
        *buffer += socket->readAll();
        const int end = buffer->indexOf("\r\n\r\n");
        if (end < 0) {
            if (buffer->size() > 65536)
                socket->abort();
            return;
        }
        const QList<QByteArray> requestLine = buffer->left(buffer->indexOf("\r\n")).split(' ');
        buffer->clear();
        answer(socket, requestLine.size() >= 2 ? requestLine.at(1) : QByteArray());
    });
    connect(socket, &QTcpSocket::disconnected, socket, &QObject::deleteLater);
}

void LocalHttpServer::answer(QTcpSocket *socket, const QByteArray &target)
{
    const QString relative = QUrl::fromPercentEncoding(target.split('?').first()).mid(1);
    const QString root = m_root.absolutePath();
    const QString path = QFileInfo(m_root.filePath(relative)).canonicalFilePath();
    QFile file(path);
    // Only regular files below the served folder.
    const bool inside = !path.isEmpty() && (path + QLatin1Char('/')).startsWith(root + QLatin1Char('/'))
                        && path != root;
    if (!inside || !QFileInfo(path).isFile() || !file.open(QIODevice::ReadOnly)) {
        socket->write("HTTP/1.1 404 Not Found\r\nContent-Length: 9\r\nConnection: close\r\n\r\nnot found");
        socket->disconnectFromHost();
        return;
    }
    static const QMimeDatabase mimeDatabase;
    socket->write("HTTP/1.1 200 OK\r\nContent-Type: " + mimeDatabase.mimeTypeForFile(path).name().toUtf8()
                  + "\r\nContent-Length: " + QByteArray::number(file.size()) + "\r\nConnection: close\r\n\r\n");
    while (!file.atEnd())
        socket->write(file.read(256 * 1024));
    socket->disconnectFromHost();
}
