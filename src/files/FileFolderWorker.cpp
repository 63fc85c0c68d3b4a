#include "FileFolderWorker.h"
#include "LoomkitLogging.h"

#include <QMetaMethod>
#include <QStringList>
#include <QThread>

namespace {

constexpr int kMaxArguments = 10;

} // namespace

FileFolderWorker::FileFolderWorker(QObject *target, const QVariantList &arguments, QObject *parent)
    : QObject(parent)
    , m_target(target)
    , m_arguments(arguments)
{
}

void FileFolderWorker::process()
{
    QStringList texts;
    for (const QVariant &argument : qAsConst(m_arguments))
        texts.append(argument.toString());
    qCDebug(lcFile).noquote() << Q_FUNC_INFO << QLatin1Char('(') + texts.join(QLatin1String(", ")) + QLatin1Char(')');

    if (!m_arguments.isEmpty()) {
        const QByteArray method = texts.takeFirst().toLatin1();
        if (!invoke(method, texts))
            qCWarning(lcFile) << Q_FUNC_INFO << "Unable to invoke" << method << "on" << m_target.data();
    }
    emit finished();
}

bool FileFolderWorker::invoke(const QByteArray &method, const QStringList &arguments)
{
    QObject *target = m_target.data();
    if (!target || method.isEmpty() || arguments.size() > kMaxArguments)
        return false;

    const QMetaObject *metaObject = target->metaObject();
    QMetaMethod found;
    for (int i = metaObject->methodCount() - 1; i >= 0 && !found.isValid(); --i) {
        const QMetaMethod candidate = metaObject->method(i);
        if (candidate.name() != method || candidate.parameterCount() != arguments.size())
            continue;
        bool strings = true;
        for (int p = 0; p < candidate.parameterCount(); ++p)
            strings = strings && candidate.parameterType(p) == QMetaType::QString;
        if (strings)
            found = candidate;
    }
    if (!found.isValid())
        return false;

    QGenericArgument values[kMaxArguments];
    for (int i = 0; i < arguments.size(); ++i)
        values[i] = Q_ARG(QString, arguments.at(i));

    // A result can only come back from a call on this thread; across threads
    // the call is queued and the target reports through its own signals.
    const int returnType = found.returnType();
    if (target->thread() != QThread::currentThread() || returnType == QMetaType::Void) {
        return found.invoke(target, Qt::AutoConnection, values[0], values[1], values[2], values[3],
                            values[4], values[5], values[6], values[7], values[8], values[9]);
    }

    bool invoked = false;
    if (returnType == QMetaType::QVariant) {
        QVariant value;
        invoked = found.invoke(target, Qt::DirectConnection, Q_RETURN_ARG(QVariant, value), values[0],
                               values[1], values[2], values[3], values[4], values[5], values[6],
                               values[7], values[8], values[9]);
        m_result = value;
    } else {
        QVariant value(returnType, nullptr);
        invoked = found.invoke(target, Qt::DirectConnection,
                               QGenericReturnArgument(found.typeName(), value.data()), values[0],
                               values[1], values[2], values[3], values[4], values[5], values[6],
                               values[7], values[8], values[9]);
        m_result = value;
    }
    return invoked;
}
