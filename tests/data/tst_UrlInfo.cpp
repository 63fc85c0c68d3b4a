#include "Loomkit.h"
#include "UrlInfo.h"

#include <QQmlEngine>
#include <QSignalSpy>
#include <QtTest>

class tst_UrlInfo : public QObject
{
    Q_OBJECT

private slots:
    void parts_data();
    void parts();
    void queryRoundTrip_data();
    void queryRoundTrip();
    void repeatedNames();
    void setters();
    void localFiles();
    void factory();
};

void tst_UrlInfo::parts_data()
{
    QTest::addColumn<QString>("url");
    QTest::addColumn<QString>("scheme");
    QTest::addColumn<QString>("userName");
    QTest::addColumn<QString>("host");
    QTest::addColumn<int>("port");
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("fileName");
    QTest::addColumn<QString>("suffix");
    QTest::addColumn<QString>("fragment");

    QTest::newRow("full") << "https://ann:pw@example.com:8443/a/b%20c/report.tar.gz?x=1#top"
                          << "https" << "ann" << "example.com" << 8443 << "/a/b c/report.tar.gz"
                          << "report.tar.gz" << "gz" << "top";
    QTest::newRow("no port") << "http://example.org/" << "http" << "" << "example.org" << -1 << "/" << "" << ""
                             << "";
    QTest::newRow("relative") << "images/x.png" << "" << "" << "" << -1 << "images/x.png" << "x.png" << "png"
                              << "";
    QTest::newRow("encoded fragment") << "http://h/p#a%20b" << "http" << "" << "h" << -1 << "/p" << "p" << ""
                                      << "a b";
}

void tst_UrlInfo::parts()
{
    QFETCH(QString, url);
    UrlInfo info(QUrl(url, QUrl::StrictMode));
    QVERIFY(info.isValid());
    QTEST(info.scheme(), "scheme");
    QTEST(info.userName(), "userName");
    QTEST(info.host(), "host");
    QTEST(info.port(), "port");
    QTEST(info.path(), "path");
    QTEST(info.fileName(), "fileName");
    QTEST(info.suffix(), "suffix");
    QTEST(info.fragment(), "fragment");
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
}

void tst_UrlInfo::queryRoundTrip()
{
    QFETCH(QVariantMap, parameters);
    QFETCH(QString, query);

    UrlInfo info(QUrl(QStringLiteral("https://example.com/search")));
    QSignalSpy spy(&info, &UrlInfo::urlChanged);
    info.setQueryParameters(parameters);
    QCOMPARE(info.query(), query);
    QCOMPARE(info.queryParameters(), parameters);
    QCOMPARE(spy.count(), 1);

    // Through the text form and back.
    UrlInfo reparsed(QUrl(info.text()));
    QCOMPARE(reparsed.queryParameters(), parameters);
}

void tst_UrlInfo::repeatedNames()
{
    UrlInfo info(QUrl(QStringLiteral("http://h/?a=1&b=x&a=2&a=3&flag")));
    const QVariantMap map = info.queryParameters();
    QCOMPARE(map.value("a").toList(), (QVariantList { "1", "2", "3" }));
    QCOMPARE(map.value("b").toString(), QStringLiteral("x"));
    QVERIFY(map.contains("flag"));
    QCOMPARE(info.queryValue("b").toString(), QStringLiteral("x"));

    info.setQueryParameters(QVariantMap());
    QVERIFY(!info.url().hasQuery());
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
    QCOMPARE(info.text(), QStringLiteral("https://a%40b@example.com:8080/a b/c#x y"));
    QCOMPARE(info.url().toEncoded(), QByteArray("https://a%40b@example.com:8080/a%20b/c#x%20y"));
    QCOMPARE(spy.count(), 6);

    info.setHost(QStringLiteral("example.com"));
    QCOMPARE(spy.count(), 6);

    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Port out of range"));
    info.setPort(70000);
    QCOMPARE(info.port(), 8080);

    info.setFragment(QString());
    QVERIFY(!info.url().hasFragment());
    QCOMPARE(info.resolved(QUrl(QStringLiteral("../d"))).toString(), QStringLiteral("https://a%40b@example.com:8080/d"));
}

void tst_UrlInfo::localFiles()
{
    UrlInfo info;
    info.setLocalFile(QStringLiteral("/tmp/my file#1.txt"));
    QVERIFY(info.isLocalFile());
    QCOMPARE(info.scheme(), QStringLiteral("file"));
    QCOMPARE(info.localFile(), QStringLiteral("/tmp/my file#1.txt"));
    QCOMPARE(info.fileName(), QStringLiteral("my file#1.txt"));
    QVERIFY(info.fragment().isEmpty());

    info.fromUserInput(QStringLiteral("/var/log"));
    QCOMPARE(info.localFile(), QStringLiteral("/var/log"));
    info.fromUserInput(QStringLiteral("example.com/x"));
    QCOMPARE(info.scheme(), QStringLiteral("http"));
    QVERIFY(!info.isLocalFile());
    QCOMPARE(info.localFile(), QString());
}

void tst_UrlInfo::factory()
{
    Loomkit loomkit;
    QScopedPointer<UrlInfo> info(loomkit.urlInfo(QUrl(QStringLiteral("ftp://h/f"))));
    QCOMPARE(info->host(), QStringLiteral("h"));
    QVERIFY(!info->parent());
    QCOMPARE(QQmlEngine::objectOwnership(info.data()), QQmlEngine::JavaScriptOwnership);
}

QTEST_MAIN(tst_UrlInfo)
#include "tst_UrlInfo.moc"
