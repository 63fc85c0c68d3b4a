#ifndef NETWORKTESTFIXTURE_H
#define NETWORKTESTFIXTURE_H

#include "NetworkRequest.h"

#include <QMetaMethod>
#include <QQmlContext>
#include <QQmlEngine>
#include <QStringList>

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

// Records the names of every signal an object emits, in order.
class SignalRecorder : public QObject
{
    Q_OBJECT

public:
    explicit SignalRecorder(QObject *target)
    {
        const QMetaObject *mo = target->metaObject();
        const QMetaMethod slot = metaObject()->method(metaObject()->indexOfSlot("record()"));
        for (int i = QObject::staticMetaObject.methodCount(); i < mo->methodCount(); ++i) {
            const QMetaMethod method = mo->method(i);
            if (method.methodType() == QMetaMethod::Signal)
                connect(target, method, this, slot);
        }
    }

    QStringList names;

public slots:
    void record()
    {
        names.append(QString::fromLatin1(sender()->metaObject()->method(senderSignalIndex()).name()));
    }
};

#endif // NETWORKTESTFIXTURE_H
