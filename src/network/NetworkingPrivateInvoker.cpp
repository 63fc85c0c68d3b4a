#include "NetworkingPrivateInvoker.h"
#include "LoomkitLogging.h"
#include "NetworkingPrivate.h"

#include <QCoreApplication>
#include <QVariant>

QT_WARNING_DISABLE_DEPRECATED

namespace {

const char *const kSignals[] = {
    SIGNAL(requestUrlChanged()),
    SIGNAL(proxyChanged()),
    SIGNAL(useSystemProxyChanged()),
    SIGNAL(allConfigurationsChanged()),
    SIGNAL(defaultConfigurationChanged()),
    SIGNAL(accessCacheClearing()),
    SIGNAL(accessCacheCleared()),
};

} // namespace

NetworkingPrivateInvoker::NetworkingPrivateInvoker(QObject *parent)
    : QObject(parent)
{
    qRegisterMetaType<QNetworkConfiguration>();
    QCoreApplication *app = QCoreApplication::instance();
    if (!app)
        return;
    const QVariant value = app->property(NetworkingPrivate::propertyName);
    if (!value.isValid() || value.isNull())
        return;
    QObject *object = value.value<QObject *>();
    if (!object && value.canConvert<QObject *>())
        object = qvariant_cast<QObject *>(value);
    if (object)
        setTarget(object);
}

QObject *NetworkingPrivateInvoker::target() const
{
    return m_target;
}

void NetworkingPrivateInvoker::connectTarget(bool connectIt)
{
    for (const char *signal : kSignals) {
        if (connectIt)
            connect(m_target, signal, this, signal);
        else
            disconnect(m_target, signal, this, signal);
    }
}

void NetworkingPrivateInvoker::setTarget(QObject *target)
{
    if (m_target)
        connectTarget(false);
    m_target = target;
    if (m_target)
        connectTarget(true);
}

QNetworkConfiguration NetworkingPrivateInvoker::queryDefaultConfiguration()
{
    QNetworkConfiguration result;
    if (!m_target)
        return result;
    if (!QMetaObject::invokeMethod(m_target, "queryDefaultConfiguration", Qt::AutoConnection,
                                   Q_RETURN_ARG(QNetworkConfiguration, result)))
        return QNetworkConfiguration();
    return result;
}

void NetworkingPrivateInvoker::setRequestUrl(const QUrl &url)
{
    if (m_target)
        QMetaObject::invokeMethod(m_target, "setRequestUrl", Qt::AutoConnection, Q_ARG(QUrl, url));
}
