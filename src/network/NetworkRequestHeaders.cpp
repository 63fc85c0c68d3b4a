#include "NetworkRequestHeaders.h"

namespace {

const QString kReferer = QStringLiteral("Referer");
const QString kUserAgent = QStringLiteral("User-Agent");

} // namespace

NetworkRequestHeaders::NetworkRequestHeaders(QObject *parent)
    : PropertySet(this, parent)
{
    connect(this, &QQmlPropertyMap::valueChanged, this, &NetworkRequestHeaders::onValueChanged);
}

QString NetworkRequestHeaders::referer() const
{
    return value(kReferer).toString();
}

void NetworkRequestHeaders::setReferer(const QString &referer)
{
    setValue(kReferer, referer);
}

QString NetworkRequestHeaders::userAgent() const
{
    return value(kUserAgent).toString();
}

void NetworkRequestHeaders::setUserAgent(const QString &userAgent)
{
    setValue(kUserAgent, userAgent);
}

void NetworkRequestHeaders::classBegin()
{
}

void NetworkRequestHeaders::componentComplete()
{
}

void NetworkRequestHeaders::onValueChanged(const QString &key, const QVariant &value)
{
    Q_UNUSED(value)
    if (key == kReferer)
        emit refererChanged();
    else if (key == kUserAgent)
        emit userAgentChanged();
}
