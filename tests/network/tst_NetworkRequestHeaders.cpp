#include "NetworkRequestHeaders.h"

#include <QSignalSpy>
#include <QTest>

class tst_NetworkRequestHeaders : public QObject
{
    Q_OBJECT

private slots:
    void shortcutsFollowKeys()
    {
        NetworkRequestHeaders headers;
        QSignalSpy refererSpy(&headers, &NetworkRequestHeaders::refererChanged);
        QSignalSpy agentSpy(&headers, &NetworkRequestHeaders::userAgentChanged);

        // "referrer" is another spelling of the same header.
        QVERIFY(headers.setProperty("referrer", QStringLiteral("https://a.example/")));
        QCOMPARE(headers.value("Referer").toString(), QStringLiteral("https://a.example/"));
        QCOMPARE(refererSpy.count(), 1);
        QCOMPARE(agentSpy.count(), 0);

        // Writing the key updates the shortcut; keys are exact, so another
        // case is another header.
        headers.setValue("User-Agent", "Direct/2");
        headers.setValue("user-agent", "lower");
        QCOMPARE(headers.userAgent(), QStringLiteral("Direct/2"));
        headers.setUserAgent(QStringLiteral("Direct/2"));
        QCOMPARE(agentSpy.count(), 1);
        QCOMPARE(headers.keys(), QStringList({ "Referer", "User-Agent", "user-agent" }));
        headers.clear("User-Agent");
        QCOMPARE(agentSpy.count(), 2);
        QVERIFY(headers.userAgent().isEmpty());
    }
};

QTEST_MAIN(tst_NetworkRequestHeaders)

#include "tst_NetworkRequestHeaders.moc"
