#ifndef NETWORKTESTFIXTURE_H
#define NETWORKTESTFIXTURE_H

#include "NetworkRequest.h"

#include <QCryptographicHash>
#include <QJsonDocument>
#include <QMetaMethod>
#include <QQmlContext>
#include <QQmlEngine>
#include <QStringList>
#include <QTest>

// Makes a NetworkRequest as QML would: in the engine's context, bound to the
// engine's network access manager through classBegin.
inline NetworkRequest *makeRequest(QQmlEngine *engine, QObject *parent = nullptr)
{
    auto *request = new NetworkRequest(parent);
    QQmlEngine::setContextForObject(request, engine->rootContext());
    request->classBegin();
    request->componentComplete();
    return request;
}

inline bool waitComplete(NetworkRequest *request, int ms = 10000)
{
    return QTest::qWaitFor([request]() { return request->readyState() == NetworkRequest::ReadyStateComplete; }, ms);
}

// What the server's /echo route saw, as a map.
inline QVariantMap echoOf(NetworkRequest *request)
{
    return QJsonDocument::fromJson(request->responseText().toUtf8()).toVariant().toMap();
}

// The bytes the server's /bytes, /slow and /chunked routes send.
inline QByteArray pattern(int size)
{
    QByteArray bytes(size, Qt::Uninitialized);
    for (int i = 0; i < size; ++i)
        bytes[i] = char('a' + (i % 26));
    return bytes;
}

inline QString sha256(const QByteArray &bytes)
{
    return QString::fromLatin1(QCryptographicHash::hash(bytes, QCryptographicHash::Sha256).toHex());
}

// Records the names of every signal an object emits, in order.
class SignalRecorder : public QObject
{
    Q_OBJECT

public:
    explicit SignalRecorder(QObject *target)
    {
        const QMetaMethod slot = metaObject()->method(metaObject()->indexOfSlot("record()"));
        for (int i = QObject::staticMetaObject.methodCount(); i < target->metaObject()->methodCount(); ++i) {
            if (target->metaObject()->method(i).methodType() == QMetaMethod::Signal)
                connect(target, target->metaObject()->method(i), this, slot);
        }
    }

    QStringList names;

public slots:
    void record() { names.append(QString::fromLatin1(sender()->metaObject()->method(senderSignalIndex()).name())); }
};

#endif // NETWORKTESTFIXTURE_H
