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

private slots:
    void initTestCase();
    void init();
    void credentials_data();
    void credentials();

private:
    QQmlEngine *m_engine = nullptr;
    CredentialSignaler m_signaler;
    HostNetworking m_networking;
};

void tst_AuthenticationChallenge::initTestCase()
{
    m_engine = new QQmlEngine(this);
    Loomkit::instance(m_engine);
    m_networking.signaler = &m_signaler;
}

void tst_AuthenticationChallenge::init()
{
    Loomkit *framework = Loomkit::current();
    framework->setProperty("networking", QVariant::fromValue<QObject *>(&m_networking));
    framework->setProperty("token", QStringLiteral("old-token"));
    framework->setProperty("tokenExpiry", QDateTime::fromMSecsSinceEpoch(1000));
    m_signaler.received.clear();
}

void tst_AuthenticationChallenge::credentials_data()
{
    // party: who is missing on the way to the host ("" for nobody).
    QTest::addColumn<QString>("party");
    QTest::addColumn<QString>("script");
    QTest::addColumn<bool>("reaches");
    QTest::addColumn<QString>("token");
    QTest::addColumn<qint64>("expiry");
    QTest::addColumn<QString>("warning");
    const QString token = QStringLiteral("({ token: 'new' })");
    QTest::newRow("undefined skips storing") << "" << "undefined" << true << "old-token" << qint64(1000) << "";
    QTest::newRow("token and expiry") << "" << "({ token: 'new', tokenExpiry: new Date(5000) })" << true << "new"
                                      << qint64(5000) << "";
    QTest::newRow("invalid expiry keeps the old") << "" << "({ token: 'new', tokenExpiry: 'never' })" << true
                                                  << "new" << qint64(1000) << "";
    QTest::newRow("no token") << "" << "({ other: 1 })" << false << "old-token" << qint64(1000)
                              << "Invalid credential object...";
    QTest::newRow("empty token") << "" << "({ token: '' })" << false << "old-token" << qint64(1000)
                                 << "Invalid or empty token...";
    QTest::newRow("not a token challenge") << "type" << token << false << "old-token" << qint64(1000)
                                           << "Challenge type is unknown";
    QTest::newRow("no signaler") << "signaler" << token << false << "old-token" << qint64(1000)
                                 << "Unable to find credential signaling object";
    QTest::newRow("no networking") << "networking" << token << false << "old-token" << qint64(1000)
                                   << "Unable to find Networking instance";
}

void tst_AuthenticationChallenge::credentials()
{
    QFETCH(QString, party);
    QFETCH(QString, script);
    QFETCH(bool, reaches);
    QFETCH(QString, token);
    QFETCH(qint64, expiry);
    QFETCH(QString, warning);

    AuthenticationChallenge challenge;
    if (party != QLatin1String("type"))
        challenge.setAuthenticationChallengeType(AuthenticationChallenge::AuthenticationChallengeTypeToken);
    HostNetworking noSignaler;
    if (party == QLatin1String("signaler"))
        Loomkit::current()->setProperty("networking", QVariant::fromValue<QObject *>(&noSignaler));
    else if (party == QLatin1String("networking"))
        Loomkit::current()->setProperty("networking", QVariant());
    const QJSValue credential = m_engine->evaluate(script);
    if (!warning.isEmpty())
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QRegularExpression::escape(warning)));
    challenge.continueWithCredential(credential);
    QCOMPARE(m_signaler.received.size(), reaches ? 1 : 0);
    if (reaches)
        QCOMPARE(m_signaler.received.first().data(), &challenge);
    QCOMPARE(Loomkit::current()->property("token").toString(), token);
    QCOMPARE(Loomkit::current()->property("tokenExpiry").toDateTime().toMSecsSinceEpoch(), expiry);
}

QTEST_MAIN(tst_AuthenticationChallenge)

#include "tst_AuthenticationChallenge.moc"
