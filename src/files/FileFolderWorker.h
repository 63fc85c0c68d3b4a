#ifndef FILEFOLDERWORKER_H
#define FILEFOLDERWORKER_H

#include <QObject>
#include <QPointer>
#include <QVariant>
#include <QVariantList>

// Calls one method of a target object by name from a worker thread. The first
// element of the arguments names the method, the rest are its QString
// arguments. A target on another thread is called by a queued call, so the
// method runs on the target's own thread and its result is not waited for.
class FileFolderWorker : public QObject
{
    Q_OBJECT

public:
    FileFolderWorker(QObject *target, const QVariantList &arguments, QObject *parent = nullptr);

    // What the method returned, for a target on the worker's own thread.
    QVariant result() const { return m_result; }

public slots:
    void process();

signals:
    void finished();

private:
    bool invoke(const QByteArray &method, const QStringList &arguments);

    QPointer<QObject> m_target;
    QVariantList m_arguments;
    QVariant m_result;
};

#endif // FILEFOLDERWORKER_H
