#ifndef AUTHENTICATIONCHALLENGE_H
#define AUTHENTICATIONCHALLENGE_H

#include <QJSValue>
#include <QObject>

// Hands a token credential back to the party that asked for it, which it
// finds through the framework singleton's "networking" object.
class AuthenticationChallenge : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QString requestUrl READ requestUrl WRITE setRequestUrl NOTIFY requestUrlChanged)
    Q_PROPERTY(AuthenticationChallengeType authenticationChallengeType READ authenticationChallengeType
               WRITE setAuthenticationChallengeType NOTIFY authenticationChallengeTypeChanged)

public:
    enum AuthenticationChallengeType {
        AuthenticationChallengeTypeNone = 0,
        AuthenticationChallengeTypeToken = 1
    };
    Q_ENUM(AuthenticationChallengeType)

    explicit AuthenticationChallenge(QObject *parent = nullptr);

    QString requestUrl() const;
    void setRequestUrl(const QString &requestUrl);
    AuthenticationChallengeType authenticationChallengeType() const;
    void setAuthenticationChallengeType(AuthenticationChallengeType type);

    Q_INVOKABLE void continueWithCredential(const QJSValue &credential);

signals:
    void requestUrlChanged();
    void authenticationChallengeTypeChanged();

private:
    QString m_requestUrl;
    AuthenticationChallengeType m_authenticationChallengeType = AuthenticationChallengeTypeNone;
};

Q_DECLARE_METATYPE(AuthenticationChallenge *)

#endif // AUTHENTICATIONCHALLENGE_H
