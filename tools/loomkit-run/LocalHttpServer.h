#ifndef LOCALHTTPSERVER_H
#define LOCALHTTPSERVER_H

#include <QDir>
#include <QTcpServer>
#include <QUrl>

// A small read-only HTTP server for demos: serves the files of one folder on
// 127.0.0.1 and an ephemeral port, never anything outside that folder. QML
// reaches it as the context property `hostServer`.
class LocalHttpServer : public QTcpServer
{
    Q_OBJECT
    Q_PROPERTY(QUrl url READ url NOTIFY urlChanged)

public:
    explicit LocalHttpServer(QObject *parent = nullptr);

    QUrl url() const;
    // Serves `folder` (a path or a file: URL); returns the base URL, or an
    // empty one if the server cannot listen. A second call changes the folder.
    Q_INVOKABLE QUrl serve(const QString &folder);

signals:
    void urlChanged();

protected:
    void incomingConnection(qintptr socketDescriptor) override;

private:
    void answer(QTcpSocket *socket, const QByteArray &target);

    QDir m_root;
};

#endif // LOCALHTTPSERVER_H
