#include "AuthenticationChallenge.h"
#include "Loomkit.h"

#include <QJSEngine>
#include <QPointer>
#include <QQmlEngine>
#include <QRegularExpression>
#include <QTest>

// The host's side: the object that waits for a credential.
class CredentialSignaler : public QObject
{
    Q_OBJECT

public:
    QList<QPointer<AuthenticationChallenge>> received;

public slots:
    void credentialAvailable(AuthenticationChallenge *challenge) { received.append(challenge); }
};

class HostNetworking : public QObject
{
    Q_OBJECT
    Q_PROPERTY(QObject *credentialSignalingObject READ credentialSignalingObject CONSTANT)

public:
    QObject *credentialSignalingObject() const { return signaler; }
    QObject *signaler = nullptr;
};

class tst_AuthenticationChallenge : public QObject
{
    Q_OBJECT

    QQmlEngine *m_engine = nullptr;
    CredentialSignaler m_signaler;
    HostNetworking m_networking;

private slots:
    void initTestCase()
    {
        m_engine = new QQmlEngine(this);
        Loomkit::instance(m_engine);
        m_networking.signaler = &m_signaler;
    }

    void credentials_data()
    {
        // party: who is missing on the way to the host ("" for nobody).
        // stored: the framework's token and expiry (ms) afterwards.
        QTest::addColumn<QString>("party");
        QTest::addColumn<QString>("script");
        QTest::addColumn<QString>("stored");
        QTest::addColumn<QString>("warning"); // none: the host hears of the challenge
        const QString token = QStringLiteral("({ token: 'new' })");
        const QString old = QStringLiteral("old-token 1000");
        QTest::newRow("undefined skips storing") << "" << "undefined" << old << "";
        QTest::newRow("token and expiry") << "" << "({ token: 'new', tokenExpiry: new Date(5e3) })" << "new 5000" << "";
        QTest::newRow("bad expiry keeps the old") << "" << "({ token: 'new', tokenExpiry: 'x' })" << "new 1000" << "";
        QTest::newRow("no token") << "" << "({ other: 1 })" << old << "Invalid credential object...";
        QTest::newRow("empty token") << "" << "({ token: '' })" << old << "Invalid or empty token...";
        QTest::newRow("not a token challenge") << "type" << token << old << "Challenge type is unknown";
        QTest::newRow("no signaler") << "signaler" << token << old << "Unable to find credential signaling object";
        QTest::newRow("no networking") << "networking" << token << old << "Unable to find Networking instance";
    }

    void credentials()
    {
        QFETCH(QString, party);
        QFETCH(QString, script);
        QFETCH(QString, stored);
        QFETCH(QString, warning);
        Loomkit *framework = Loomkit::current();
        framework->setProperty("token", QStringLiteral("old-token"));
        framework->setProperty("tokenExpiry", QDateTime::fromMSecsSinceEpoch(1000));
        m_signaler.received.clear();
        AuthenticationChallenge challenge;
        if (party != QLatin1String("type"))
            challenge.setAuthenticationChallengeType(AuthenticationChallenge::AuthenticationChallengeTypeToken);
        HostNetworking noSignaler;
        QObject *networking = party == QLatin1String("signaler") ? &noSignaler : &m_networking;
        framework->setProperty("networking", party == QLatin1String("networking")
                                                 ? QVariant() : QVariant::fromValue<QObject *>(networking));
        if (!warning.isEmpty())
            QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QRegularExpression::escape(warning)));
        challenge.continueWithCredential(m_engine->evaluate(script));
        QCOMPARE(m_signaler.received.size(), warning.isEmpty() ? 1 : 0);
        QVERIFY(!warning.isEmpty() || m_signaler.received.first().data() == &challenge);
        const QDateTime expiry = framework->property("tokenExpiry").toDateTime();
        QCOMPARE(framework->property("token").toString() + ' ' + QString::number(expiry.toMSecsSinceEpoch()), stored);
    }
};

QTEST_MAIN(tst_AuthenticationChallenge)

#include "tst_AuthenticationChallenge.moc"
