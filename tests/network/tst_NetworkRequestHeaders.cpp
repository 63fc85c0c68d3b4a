#include "NetworkRequestHeaders.h"

#include <QSignalSpy>
#include <QTest>

class tst_NetworkRequestHeaders : public QObject
{
    Q_OBJECT

private slots:
    void shortcuts();
    void anyKeyWritesShortcut();
};

void tst_NetworkRequestHeaders::shortcuts()
{
    NetworkRequestHeaders headers;
    QSignalSpy refererSpy(&headers, &NetworkRequestHeaders::refererChanged);
    QSignalSpy agentSpy(&headers, &NetworkRequestHeaders::userAgentChanged);

    QVERIFY(headers.setProperty("referrer", QStringLiteral("https://a.example/")));
    QCOMPARE(headers.referer(), QStringLiteral("https://a.example/"));
    QCOMPARE(headers.property("referer").toString(), QStringLiteral("https://a.example/"));
    QCOMPARE(headers.value("Referer").toString(), QStringLiteral("https://a.example/"));
    QCOMPARE(refererSpy.count(), 1);
    QCOMPARE(agentSpy.count(), 0);

    headers.setUserAgent(QStringLiteral("Agent/1"));
    headers.setUserAgent(QStringLiteral("Agent/1"));
    QCOMPARE(agentSpy.count(), 1);
    QCOMPARE(headers.keys(), QStringList({ "Referer", "User-Agent" }));
}

void tst_NetworkRequestHeaders::anyKeyWritesShortcut()
{
    NetworkRequestHeaders headers;
    QSignalSpy agentSpy(&headers, &NetworkRequestHeaders::userAgentChanged);
    headers.setValue("User-Agent", "Direct/2");
    QCOMPARE(headers.userAgent(), QStringLiteral("Direct/2"));
    QCOMPARE(agentSpy.count(), 1);
    // Keys are exact: another case is another header.
    headers.setValue("user-agent", "lower");
    QCOMPARE(headers.userAgent(), QStringLiteral("Direct/2"));
    QCOMPARE(agentSpy.count(), 1);
    headers.clear("User-Agent");
    QCOMPARE(agentSpy.count(), 2);
    QVERIFY(headers.userAgent().isEmpty());
}

QTEST_MAIN(tst_NetworkRequestHeaders)

#include "tst_NetworkRequestHeaders.moc"
