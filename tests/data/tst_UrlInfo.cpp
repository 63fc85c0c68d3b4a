#include "Loomkit.h"
#include "UrlInfo.h"

#include <QQmlEngine>
#include <QtTest>

class tst_UrlInfo : public QObject
{
    Q_OBJECT

private slots:
    void parts_data();
    void parts();
    void queryRoundTrip_data();
    void queryRoundTrip();
    void setters();
};

void tst_UrlInfo::parts_data()
{
    QTest::addColumn<QString>("url");
    // scheme|userName|host|port|path|fileName|suffix|fragment
    QTest::addColumn<QString>("parts");

    QTest::newRow("full") << "https://ann:pw@example.com:8443/a/b%20c/report.tar.gz?x=1#top"
                          << "https|ann|example.com|8443|/a/b c/report.tar.gz|report.tar.gz|gz|top";
    QTest::newRow("no port") << "http://example.org/" << "http||example.org|-1|/|||";
    QTest::newRow("relative") << "images/x.png" << "|||-1|images/x.png|x.png|png|";
    QTest::newRow("encoded fragment") << "http://h/p#a%20b" << "http||h|-1|/p|p||a b";
}

void tst_UrlInfo::parts()
{
    QFETCH(QString, url);
    UrlInfo info(QUrl(url, QUrl::StrictMode));
    QVERIFY(info.isValid());
    const QStringList parts { info.scheme(), info.userName(), info.host(), QString::number(info.port()),
                              info.path(), info.fileName(), info.suffix(), info.fragment() };
    QTEST(parts.join(QLatin1Char('|')), "parts");
    QCOMPARE(info.isRelative(), info.scheme().isEmpty());
}

void tst_UrlInfo::queryRoundTrip_data()
{
    QTest::addColumn<QVariantMap>("parameters");
    QTest::addColumn<QString>("query");

    QTest::newRow("plain") << QVariantMap { { "a", "1" }, { "b", "two" } } << "a=1&b=two";
    QTest::newRow("delimiters in values")
        << QVariantMap { { "q", "a&b=c+d #e" } } << "q=a%26b%3Dc%2Bd%20%23e";
    QTest::newRow("unicode names") << QVariantMap { { "n\u00e4me", "\u20ac" } } << "n%C3%A4me=%E2%82%AC";
    QTest::newRow("empty value") << QVariantMap { { "k", "" } } << "k=";
    QTest::newRow("list") << QVariantMap { { "id", QVariantList { "1", "2", "3" } } } << "id=1&id=2&id=3";
    QTest::newRow("none") << QVariantMap() << "";
}

void tst_UrlInfo::queryRoundTrip()
{
    QFETCH(QVariantMap, parameters);
    QFETCH(QString, query);

    UrlInfo info(QUrl(QStringLiteral("https://example.com/search")));
    QSignalSpy spy(&info, &UrlInfo::urlChanged);
    info.setQueryParameters(parameters);
    QCOMPARE(info.query(), query);
    QCOMPARE(spy.count(), query.isEmpty() ? 0 : 1);
    QCOMPARE(info.url().hasQuery(), !query.isEmpty());
    // Through the text form and back.
    QCOMPARE(UrlInfo(QUrl(info.text())).queryParameters(), parameters);
}

void tst_UrlInfo::setters()
{
    UrlInfo info;
    QSignalSpy spy(&info, &UrlInfo::urlChanged);
    info.setScheme(QStringLiteral("https"));
    info.setHost(QStringLiteral("example.com"));
    info.setPort(8080);
    info.setPath(QStringLiteral("/a b/c"));
    info.setUserName(QStringLiteral("a@b"));
    info.setFragment(QStringLiteral("x y"));
    info.setHost(QStringLiteral("example.com"));
    QCOMPARE(info.text(), QStringLiteral("https://a%40b@example.com:8080/a b/c#x y"));
    QCOMPARE(info.url().toEncoded(), QByteArray("https://a%40b@example.com:8080/a%20b/c#x%20y"));
    QCOMPARE(spy.count(), 6);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Port out of range"));
    info.setPort(70000);
    QCOMPARE(info.port(), 8080);
    info.setFragment(QString());
    QVERIFY(!info.url().hasFragment());
    QCOMPARE(info.resolved(QUrl(QStringLiteral("../d"))).toString(), QStringLiteral("https://a%40b@example.com:8080/d"));

    Loomkit loomkit;
    QScopedPointer<UrlInfo> made(loomkit.urlInfo(QUrl()));
    QCOMPARE(QQmlEngine::objectOwnership(made.data()), QQmlEngine::JavaScriptOwnership);
    QVERIFY(!made->parent());
    // A '#' in a file name is no fragment.
    made->setLocalFile(QStringLiteral("/tmp/my file#1.txt"));
    QCOMPARE(made->localFile(), QStringLiteral("/tmp/my file#1.txt"));
    QVERIFY(made->fragment().isEmpty());
    made->fromUserInput(QStringLiteral("example.com/x"));
    QCOMPARE(made->text(), QStringLiteral("http://example.com/x"));
}

QTEST_MAIN(tst_UrlInfo)
#include "tst_UrlInfo.moc"
