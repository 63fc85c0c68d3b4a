#include "AuthenticationChallenge.h"
#include "Loomkit.h"
#include "LoomkitLogging.h"

#include <QDateTime>
#include <QVariant>

namespace {

bool holdsObject(const QVariant &value)
{
    return value.isValid() && !value.isNull() && value.canConvert<QObject *>();
}

} // namespace

AuthenticationChallenge::AuthenticationChallenge(QObject *parent)
    : QObject(parent)
{
    qRegisterMetaType<AuthenticationChallenge *>();
}

QString AuthenticationChallenge::requestUrl() const
{
    return m_requestUrl;
}

void AuthenticationChallenge::setRequestUrl(const QString &requestUrl)
{
    if (requestUrl == m_requestUrl)
        return;
    m_requestUrl = requestUrl;
    emit requestUrlChanged();
}

AuthenticationChallenge::AuthenticationChallengeType AuthenticationChallenge::authenticationChallengeType() const
{
    return m_authenticationChallengeType;
}

void AuthenticationChallenge::setAuthenticationChallengeType(AuthenticationChallengeType type)
{
    if (type == m_authenticationChallengeType)
        return;
    m_authenticationChallengeType = type;
    emit authenticationChallengeTypeChanged();
}

void AuthenticationChallenge::continueWithCredential(const QJSValue &credential)
{
    QObject *framework = Loomkit::current();

    const QVariant networkingValue = framework ? framework->property("networking") : QVariant();
    if (!holdsObject(networkingValue)) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Unable to find Networking instance...";
        return;
    }
    QObject *networking = qvariant_cast<QObject *>(networkingValue);
    if (!networking) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Can't convert Networking to QObject...";
        return;
    }
    const QVariant signalerValue = networking->property("credentialSignalingObject");
    if (!holdsObject(signalerValue)) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Unable to find credential signaling object...";
        return;
    }
    if (m_authenticationChallengeType != AuthenticationChallengeTypeToken) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Challenge type is unknown...";
        return;
    }
    QObject *signaler = qvariant_cast<QObject *>(signalerValue);
    if (!signaler) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Unable to convert credential signaler to QObject...";
        return;
    }

    if (!credential.isUndefined()) {
        if (!credential.hasProperty(QStringLiteral("token"))) {
            qCWarning(lcManager) << Q_FUNC_INFO << "Invalid credential object...";
            return;
        }
        const QString token = credential.property(QStringLiteral("token")).toString();
        if (token.isEmpty()) {
            qCWarning(lcManager) << Q_FUNC_INFO << "Invalid or empty token...";
            return;
        }
        framework->setProperty("token", token);

        const QJSValue expiryValue = credential.property(QStringLiteral("tokenExpiry"));
        const QDateTime expiry = expiryValue.isDate() ? expiryValue.toDateTime()
                                                      : expiryValue.toVariant().toDateTime();
        if (expiry.isValid())
            framework->setProperty("tokenExpiry", expiry);
    }

    QMetaObject::invokeMethod(signaler, "credentialAvailable", Q_ARG(AuthenticationChallenge *, this));
}
