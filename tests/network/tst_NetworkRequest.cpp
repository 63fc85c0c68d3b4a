#include "Loomkit.h"
#include "NetworkRequestHeaders.h"
#include "NetworkTestFixture.h"
#include "NetworkingPrivate.h"
#include "TestHttpServer.h"

#include <QElapsedTimer>
#include <QFile>
#include <QJsonValue>
#include <QSignalSpy>
#include <QTemporaryDir>

QT_WARNING_DISABLE_DEPRECATED

class tst_NetworkRequest : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void cleanup();

    void stateRules();
    void signalOrderOfOneExchange();
    void signalOrderOfAFailedExchange();
    void bodyChoosesEncoding_data();
    void bodyChoosesEncoding();
    void headersSent();
    void redirects_data();
    void redirects();
    void responseType_data();
    void responseType();
    void responsePath();
    void serverBehaviour_data();
    void serverBehaviour();
    void timeouts_data();
    void timeouts();
    void multipartParts();
    void multipartSlices_data();
    void multipartSlices();
    void multipartMissingFile();
    void multipartVerbs_data();
    void multipartVerbs();
    void multipartRedirectRereadsFiles();
    void multipartProgress();
    void cookiesMergeIntoJar();
    void basicAuthentication();
    void tlsErrors();
    void outsideEventsEndLiveRequests();
    void abortAndRetry();
    void attributes();

private:
    NetworkRequest *request() { return makeRequest(m_engine, m_owner); }
    QString writeFile(const QString &name, const QByteArray &bytes);
    void sendAndWait(NetworkRequest *r, const QString &path);

    QQmlEngine *m_engine = nullptr;
    QObject *m_owner = nullptr;
    TestHttpServer *m_server = nullptr;
    QTemporaryDir m_dir;
    NetworkingPrivate *m_service = nullptr;
};

QString tst_NetworkRequest::writeFile(const QString &name, const QByteArray &bytes)
{
    const QString path = m_dir.filePath(name);
    QFile file(path);
    file.open(QIODevice::WriteOnly);
    file.write(bytes);
    return path;
}

void tst_NetworkRequest::sendAndWait(NetworkRequest *r, const QString &path)
{
    r->setUrl(QUrl(m_server->urlFor(path)));
    r->send();
    QVERIFY(waitComplete(r));
}

void tst_NetworkRequest::initTestCase()
{
    QVERIFY(m_dir.isValid());
    // As a host does: the service first, then the engine and its requests.
    m_service = NetworkingPrivate::publish();
    QVERIFY(m_service);
    m_engine = new QQmlEngine(this);
    Loomkit::instance(m_engine);
    QVERIFY(Loomkit::current());
}

void tst_NetworkRequest::init()
{
    m_owner = new QObject(this);
    m_server = new TestHttpServer(m_owner);
    QVERIFY(m_server->start());
    Loomkit::current()->setProperty("Orvane.Loomkit.Networking.timeout", QVariant());
    Loomkit::current()->setProperty("Orvane.Loomkit.Networking.defaultUserAgent", QVariant());
}

void tst_NetworkRequest::cleanup()
{
    delete m_owner;
    m_owner = nullptr;
    m_server = nullptr;
    m_engine->networkAccessManager()->clearAccessCache();
    m_engine->networkAccessManager()->clearConnectionCache();
}

void tst_NetworkRequest::stateRules()
{
    NetworkRequest *r = request();
    QSignalSpy stateSpy(r, &NetworkRequest::readyStateChanged);
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("readyState error"));
    r->send();
    QCOMPARE(r->errorText(), QStringLiteral("UNEXPECTED"));
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateUninitialized);
    QCOMPARE(stateSpy.count(), 0);

    r->setMethod(QStringLiteral("post"));
    QCOMPARE(r->method(), QStringLiteral("POST"));
    r->setUrl(QUrl(m_server->urlFor("/hang")));
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateInitialized);
    QCOMPARE(stateSpy.count(), 1);
    r->send();
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateSending);

    // While sending, url, method, open and send are refused.
    r->setUrl(QUrl(m_server->urlFor("/echo")));
    r->setMethod(QStringLiteral("GET"));
    r->open(QStringLiteral("PUT"), QUrl(m_server->urlFor("/other")));
    QCOMPARE(r->errorText(), QStringLiteral("UNEXPECTED"));
    QCOMPARE(r->url(), QUrl(m_server->urlFor("/hang")));
    QCOMPARE(r->method(), QStringLiteral("POST"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("readyState error"));
    r->send();
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateSending);

    r->abort();
    // The same URL again leaves state 4; another one goes back to 1.
    r->open(QStringLiteral("GET"), QUrl(m_server->urlFor("/hang")));
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
    sendAndWait(r, "/echo");
    QCOMPARE(r->statusText(), QStringLiteral("200 OK"));
}

void tst_NetworkRequest::signalOrderOfOneExchange()
{
    NetworkRequest *r = request();
    r->setUrl(QUrl(m_server->urlFor("/bytes?size=5000")));
    SignalRecorder recorder(r);
    r->send();
    QVERIFY(waitComplete(r));
    QCOMPARE(r->errorCode(), 0);
    QCOMPARE(r->progress(), 1.0);

    const QStringList &names = recorder.names;
    const QStringList start = { "responseHeadersChanged", "progressChanged", "responseChanged",
                                "responseTextChanged", "readyStateChanged", "responseHeadersChanged",
                                "readyStateChanged", "responseTextChanged", "progressChanged" };
    QCOMPARE(names.mid(0, start.size()), start);
    // The finish: headers again, then progress only if the chunks left it
    // below 1.0, then the response and state 4.
    const QStringList end = names.mid(names.lastIndexOf("responseHeadersChanged"));
    QCOMPARE(end.mid(end.size() - 2), QStringList({ "responseChanged", "readyStateChanged" }));
    QVERIFY(end.size() <= 5);
    QVERIFY(!names.contains("error"));
}

void tst_NetworkRequest::signalOrderOfAFailedExchange()
{
    NetworkRequest *r = request();
    sendAndWait(r, "/status?code=404");
    QCOMPARE(r->status(), 404);
    QCOMPARE(r->errorCode(), int(QNetworkReply::ContentNotFoundError));
    QCOMPARE(r->responseText(), QStringLiteral("status 404"));

    // The next exchange clears the error ahead of state 2; progress goes
    // back from 1.0 to 0.0, hence a second progressChanged.
    SignalRecorder recorder(r);
    r->send(QStringLiteral("body"));
    const QStringList start = { "requestBodyChanged", "responseHeadersChanged", "progressChanged",
                                "progressChanged", "responseChanged", "responseTextChanged", "errorCodeChanged",
                                "errorTextChanged", "readyStateChanged" };
    QCOMPARE(recorder.names, start);
    QVERIFY(waitComplete(r));
    const QStringList end = { "errorCodeChanged", "errorTextChanged", "responseChanged", "error", "readyStateChanged" };
    QCOMPARE(recorder.names.mid(recorder.names.size() - end.size()), end);
    QCOMPARE(recorder.names.count("error"), 1);
}

void tst_NetworkRequest::bodyChoosesEncoding_data()
{
    QTest::addColumn<QString>("method");
    QTest::addColumn<QString>("path");
    QTest::addColumn<QVariant>("body");
    QTest::addColumn<QString>("sentMethod");
    QTest::addColumn<QString>("sentTarget");
    QTest::addColumn<QString>("sentBody");
    QTest::addColumn<QString>("contentType");

    const QVariant form(QVariantMap { { "a", 1 } });
    const QString urlencoded = QStringLiteral("application/x-www-form-urlencoded");
    QTest::newRow("GET form wins over query") << "GET" << "/echo?a=2&b=3" << form << "GET" << "/echo?a=1&b=3" << "" << "";
    QTest::newRow("POST form urlencoded") << "post" << "/echo" << QVariant(QVariantMap { { "a", "x y" } }) << "POST"
                                          << "/echo" << "a=x%20y" << urlencoded;
    QTest::newRow("POST moves query into body") << "POST" << "/echo?z=9" << form << "POST" << "/echo" << "a=1&z=9"
                                                << urlencoded;
    QTest::newRow("POST JSON-looking string as is") << "POST" << "/echo" << QVariant(QStringLiteral("{\"k\":1}"))
                                                    << "POST" << "/echo" << "{\"k\":1}" << urlencoded;
    QTest::newRow("PUT form") << "PUT" << "/echo" << form << "PUT" << "/echo" << "a=1" << "";
    QTest::newRow("DELETE form") << "DELETE" << "/echo" << form << "DELETE" << "/echo" << "a=1" << "";
    QTest::newRow("DELETE plain") << "DELETE" << "/echo" << QVariant() << "DELETE" << "/echo" << "" << "";
    QTest::newRow("custom verb becomes GET") << "PATCH" << "/echo" << form << "GET" << "/echo?a=1" << "" << "";
    QTest::newRow("GET null body") << "GET" << "/echo?q=1" << QVariant() << "GET" << "/echo?q=1" << "" << "";
}

void tst_NetworkRequest::bodyChoosesEncoding()
{
    QFETCH(QString, method);
    QFETCH(QString, path);
    QFETCH(QVariant, body);
    QFETCH(QString, sentMethod);
    QFETCH(QString, sentTarget);
    QFETCH(QString, sentBody);
    QFETCH(QString, contentType);

    NetworkRequest *r = request();
    r->open(method, QUrl(m_server->urlFor(path)));
    r->send(body);
    QVERIFY(waitComplete(r));
    QCOMPARE(m_server->requestCount(), 1);
    const TestHttpRequest sent = m_server->requests().first();
    QCOMPARE(QString::fromLatin1(sent.method), sentMethod);
    QCOMPARE(QString::fromUtf8(sent.target), sentTarget);
    QCOMPARE(QString::fromUtf8(sent.body), sentBody);
    QCOMPARE(QString::fromUtf8(sent.header("Content-Type")), contentType);
}

void tst_NetworkRequest::headersSent()
{
    Loomkit::current()->setProperty("Orvane.Loomkit.Networking.defaultUserAgent", QStringLiteral("Framework/1.0"));
    NetworkRequest *r = request();
    sendAndWait(r, "/echo");
    QCOMPARE(m_server->requests().last().header("User-Agent"), QByteArray("Framework/1.0"));

    // The request's own agent wins; a value that would start another header
    // is skipped on its own.
    r->headers()->setUserAgent(QStringLiteral("Own/2.0"));
    r->headers()->setValue(QStringLiteral("X-Evil"), QStringLiteral("a\r\nX-Injected: 1"));
    r->headers()->setValue(QStringLiteral("X-Good"), QStringLiteral("fine"));
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Skipping header"));
    r->send();
    QVERIFY(waitComplete(r));
    const TestHttpRequest sent = m_server->requests().last();
    QCOMPARE(sent.header("User-Agent"), QByteArray("Own/2.0"));
    QCOMPARE(sent.header("X-Good"), QByteArray("fine"));
    QVERIFY(sent.header("X-Injected").isEmpty());
    QVERIFY(sent.header("X-Evil").isEmpty());
}

void tst_NetworkRequest::redirects_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("method");
    QTest::addColumn<bool>("follow");
    QTest::addColumn<int>("status");
    QTest::addColumn<int>("hops");
    for (int code : { 301, 302, 303, 305, 307, 308 }) {
        const QString path = QStringLiteral("/redirect?code=%1&to=/echo%3Fkept%3D1").arg(code);
        QTest::addRow("POST %d", code) << path << "POST" << true << 200 << 2;
        QTest::addRow("GET %d", code) << path << "GET" << true << 200 << 2;
    }
    QTest::newRow("not followed") << "/redirect?code=302&to=/echo" << "GET" << false << 302 << 1;
    QTest::newRow("no location") << "/redirect?code=301" << "GET" << true << 301 << 1;
    QTest::newRow("304 is no redirect") << "/status?code=304" << "GET" << true << 304 << 1;
}

void tst_NetworkRequest::redirects()
{
    QFETCH(QString, path);
    QFETCH(QString, method);
    QFETCH(bool, follow);
    QFETCH(int, status);
    QFETCH(int, hops);

    NetworkRequest *r = request();
    r->setFollowRedirects(follow);
    const QUrl url(m_server->urlFor(path));
    r->open(method, url);
    QList<double> progressSeen;
    connect(r, &NetworkRequest::progressChanged, r, [&]() { progressSeen.append(r->progress()); });
    // A POST form would move the query into the body; a text body keeps the
    // redirect route's query.
    const bool post = method == QLatin1String("POST");
    r->send(post ? QVariant(QStringLiteral("field=value")) : QVariant(QVariantMap { { "field", "value" } }));
    QVERIFY(waitComplete(r));
    QCOMPARE(r->status(), status);
    QCOMPARE(r->url(), url);
    QCOMPARE(r->responseText().contains("redirect body"), status == 301 || status == 302);
    QCOMPARE(m_server->requestCount(), hops);
    // Nothing of a hop shows as progress: 0 until the final jump.
    QCOMPARE(progressSeen.last(), 1.0);
    for (int i = 0; i < progressSeen.size() - 1; ++i)
        QVERIFY2(progressSeen.at(i) == 0.0 || progressSeen.at(i) > 0.5, qPrintable(QString::number(progressSeen.at(i))));
    if (hops == 1)
        return;
    const TestHttpRequest second = m_server->requests().at(1);
    QCOMPARE(QString::fromLatin1(second.method), method);
    // POST keeps its body; GET loses its form but keeps the location's query.
    if (post)
        QCOMPARE(second.body, QByteArray("field=value"));
    else
        QCOMPARE(second.target, QByteArray("/echo?kept=1"));
}

void tst_NetworkRequest::responseType_data()
{
    QTest::addColumn<QString>("responseType");
    QTest::addColumn<QString>("body");
    QTest::addColumn<QVariant>("expected");

    const QVariantMap plain { { "a", 1 }, { "b", "x" } };
    const QVariantMap withNull { { "a", 1 }, { "b", QVariant::fromValue(nullptr) } };
    QTest::newRow("json") << "json" << "{\"a\":1,\"b\":\"x\"}" << QVariant(plain);
    QTest::newRow("JSON in capitals") << "JSON" << "{\"a\":1,\"b\":\"x\"}" << QVariant(plain);
    QTest::newRow("json with NULL") << "json" << "{\"a\":1,\"b\":NULL}" << QVariant(QVariantMap());
    QTest::newRow("json with null") << "json" << "{\"a\":1,\"b\":null}" << QVariant(withNull);
    QTest::newRow("json array") << "json" << "[1,2]" << QVariant(QVariantList { 1, 2 });
    QTest::newRow("json empty") << "json" << "" << QVariant();
    QTest::newRow("base64") << "base64" << "hi!" << QVariant(QStringLiteral("aGkh"));
    QTest::newRow("binary") << "Binary" << "raw" << QVariant(QByteArray("raw"));
    QTest::newRow("text") << "text" << "h\xc3\xa9" << QVariant(QString::fromUtf8("h\xc3\xa9"));
    QTest::newRow("empty type") << "" << "plain" << QVariant(QStringLiteral("plain"));
    QTest::newRow("unknown type") << "xml" << "<a/>" << QVariant();
}

void tst_NetworkRequest::responseType()
{
    QFETCH(QString, responseType);
    QFETCH(QString, body);
    QFETCH(QVariant, expected);

    NetworkRequest *r = request();
    r->setResponseType(responseType);
    QSignalSpy responseSpy(r, &NetworkRequest::responseChanged);
    sendAndWait(r, "/text?body=" + QString::fromLatin1(QUrl::toPercentEncoding(body)));
    QCOMPARE(responseSpy.count(), 2); // the reset and the finish
    QCOMPARE(r->response().userType(), expected.userType());
    // Through JSON so that a null inside a map compares as null.
    QVERIFY(QJsonValue::fromVariant(r->response()) == QJsonValue::fromVariant(expected));
}

void tst_NetworkRequest::responsePath()
{
    const int size = 3 * 1024 * 1024 + 17;
    NetworkRequest *r = request();
    const QString path = writeFile("download.bin", "old content that must go");
    r->setResponsePath(path);
    QList<double> progress;
    connect(r, &NetworkRequest::progressChanged, r, [&]() { progress.append(r->progress()); });
    sendAndWait(r, QStringLiteral("/bytes?size=%1").arg(size));
    QCOMPARE(r->errorCode(), 0);
    QFile file(path);
    QVERIFY(file.open(QIODevice::ReadOnly));
    QCOMPARE(sha256(file.readAll()), sha256(pattern(size)));
    QVERIFY(!r->response().isValid());
    QVERIFY(r->responseText().isEmpty());
    // The download half runs from 0.5 to 1.0, never backwards.
    for (int i = 1; i < progress.size(); ++i)
        QVERIFY(progress.at(i) >= progress.at(i - 1) || progress.at(i) == 0.0);
    QVERIFY(std::any_of(progress.cbegin(), progress.cend(), [](double p) { return p > 0.5 && p < 1.0; }));

    // An abort removes the partial file; the path cannot change under it.
    QVERIFY(QFile::remove(path));
    r->setUrl(QUrl(m_server->urlFor("/slow?size=2000&pieces=20&interval=50")));
    r->send();
    QVERIFY(QTest::qWaitFor([&]() { return QFile::exists(path); }, 5000));
    r->setResponsePath(m_dir.filePath("other.bin"));
    QCOMPARE(r->errorText(), QStringLiteral("Error: responsePath cannot be set when file is open"));
    QCOMPARE(r->responsePath(), path);
    r->abort();
    QCOMPARE(r->errorCode(), int(QNetworkReply::OperationCanceledError));
    QVERIFY(!QFile::exists(path));

    // A failure that was not an abort keeps what arrived.
    sendAndWait(r, "/truncate?size=4000");
    QVERIFY(r->errorCode() != 0);
    QCOMPARE(QFileInfo(path).size(), qint64(2000));

    // A folder cannot be opened as a file: the response stays in memory.
    r->setResponsePath(m_dir.path());
    QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Cannot open .*Is a directory"));
    sendAndWait(r, "/bytes?size=100");
    QVERIFY(QFileInfo(m_dir.path()).isDir());
    QCOMPARE(r->responseText(), QString::fromLatin1(pattern(100)));
    QCOMPARE(r->errorText(), QString()); // cleared by the good finish
}

void tst_NetworkRequest::serverBehaviour_data()
{
    // size -1: the exchange must end in an error.
    QTest::addColumn<QString>("path");
    QTest::addColumn<int>("size");
    QTest::newRow("slow") << "/slow?size=3000&pieces=10&interval=20" << 3000;
    QTest::newRow("chunked") << "/chunked?size=100000&pieces=37" << 100000;
    QTest::newRow("empty") << "/bytes?size=0" << 0;
    QTest::newRow("refused") << "refused" << -1;
    QTest::newRow("reset") << "/reset" << -1;
    QTest::newRow("truncated") << "/truncate?size=1000" << -1;
    QTest::newRow("closed mid-body") << "/close" << -1;
    QTest::newRow("garbage") << "/garbage" << -1;
}

void tst_NetworkRequest::serverBehaviour()
{
    QFETCH(QString, path);
    QFETCH(int, size);
    QUrl url(m_server->urlFor(path));
    if (path == QLatin1String("refused")) {
        QTcpServer probe; // a port that was just free
        QVERIFY(probe.listen(QHostAddress::LocalHost, 0));
        url = QUrl(QStringLiteral("http://127.0.0.1:%1/").arg(probe.serverPort()));
    }
    NetworkRequest *r = request();
    r->setUrl(url);
    r->setResponseType(QStringLiteral("binary"));
    QSignalSpy errorSpy(r, &NetworkRequest::error);
    r->send();
    QVERIFY(waitComplete(r));
    if (size >= 0) {
        QCOMPARE(r->errorCode(), 0);
        QCOMPARE(r->response().toByteArray(), pattern(size));
        QCOMPARE(r->progress(), 1.0);
        return;
    }
    QVERIFY2(r->errorCode() != 0, qPrintable(r->errorText()));
    QVERIFY(!r->errorText().isEmpty());
    QCOMPARE(errorSpy.count(), 1);
    // Everything a retry needs is still there.
    QCOMPARE(r->url(), url);
    QCOMPARE(r->method(), QStringLiteral("GET"));
}

void tst_NetworkRequest::timeouts_data()
{
    QTest::addColumn<QVariant>("own");
    QTest::addColumn<QVariant>("framework");
    QTest::addColumn<bool>("timesOut");
    QTest::newRow("own") << QVariant(200) << QVariant() << true;
    QTest::newRow("own as text") << QVariant(QStringLiteral("200")) << QVariant(60000) << true;
    QTest::newRow("framework") << QVariant() << QVariant(200) << true;
    QTest::newRow("own 0 turns framework off") << QVariant(0) << QVariant(200) << false;
    QTest::newRow("non-numeric turns framework off") << QVariant(QStringLiteral("soon")) << QVariant(200) << false;
    QTest::newRow("none") << QVariant() << QVariant() << false;
}

void tst_NetworkRequest::timeouts()
{
    QFETCH(QVariant, own);
    QFETCH(QVariant, framework);
    QFETCH(bool, timesOut);

    Loomkit::current()->setProperty("Orvane.Loomkit.Networking.timeout", framework);
    NetworkRequest *r = request();
    r->setTimeout(own);
    QSignalSpy timeoutSpy(r, &NetworkRequest::timeout);
    QSignalSpy errorSpy(r, &NetworkRequest::error);
    QElapsedTimer clock;
    clock.start();
    // Slower than the timeouts above, yet it ends by itself.
    sendAndWait(r, "/slow?size=10&pieces=2&interval=700");
    QCOMPARE(timeoutSpy.count(), timesOut ? 1 : 0);
    QCOMPARE(errorSpy.count(), timesOut ? 1 : 0);
    QCOMPARE(r->errorCode(), timesOut ? int(QNetworkReply::OperationCanceledError) : 0);
    QCOMPARE(r->responseText(), timesOut ? QString() : QStringLiteral("abcdefghij"));
    if (timesOut)
        QVERIFY(clock.elapsed() < 1200);
}

void tst_NetworkRequest::multipartParts()
{
    const QByteArray photo = pattern(70000);
    const QString photoPath = writeFile("photo.png", photo);
    const QString notesPath = writeFile("notes.bin", "notes");
    NetworkRequest *r = request();
    r->headers()->setValue(QStringLiteral("Content-Type"), QStringLiteral("text/wrong"));
    QVariantMap form { { "title", QString::fromUtf8("Gr\xc3\xbc\xc3\x9f") }, { "count", 3 }, { "photo", "@" + photoPath } };
    form.insert("notes", "@" + notesPath + ";type=text/x-notes;filename=renamed.txt");
    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/echo?x=1")));
    r->send(form);
    QVERIFY(waitComplete(r));
    const QVariantMap echo = echoOf(r);
    QVERIFY(echo.value("multipartWellFormed").toBool());
    QCOMPARE(echo.value("target").toString(), QStringLiteral("/echo?x=1"));
    QVERIFY(echo.value("headers").toMap().value("content-type").toString().startsWith(
        "multipart/form-data; boundary=---------------------------"));
    // The script's header is replaced for this exchange only.
    QCOMPARE(r->headers()->value(QStringLiteral("Content-Type")).toString(), QStringLiteral("text/wrong"));

    // Plain values first, then files, each in key order.
    const QVariantList parts = echo.value("parts").toList();
    QCOMPARE(parts.size(), 4);
    const auto part = [&](int i, const char *key) { return parts.at(i).toMap().value(key).toString(); };
    QCOMPARE(part(0, "name") + '=' + part(0, "text"), QStringLiteral("count=3"));
    QVERIFY(!parts.at(0).toMap().contains("filename"));
    QCOMPARE(part(1, "name") + '=' + part(1, "text"), QString::fromUtf8("title=Gr\xc3\xbc\xc3\x9f"));
    QCOMPARE(QStringList({ part(2, "name"), part(2, "filename"), part(2, "contentType"), part(2, "text") }),
             QStringList({ "notes", "renamed.txt", "text/x-notes", "notes" }));
    QCOMPARE(QStringList({ part(3, "name"), part(3, "filename"), part(3, "contentType"), part(3, "sha256") }),
             QStringList({ "photo", "photo.png", "image/png", sha256(photo) }));
}

void tst_NetworkRequest::multipartSlices_data()
{
    QTest::addColumn<QString>("parameters");
    QTest::addColumn<int>("offset");
    QTest::addColumn<int>("size");
    QTest::newRow("offset and size") << ";offset=100;size=50" << 100 << 50;
    QTest::newRow("offset to the end") << ";offset=900" << 900 << 100;
    QTest::newRow("size from the start") << ";size=10" << 0 << 10;
    QTest::newRow("size 0") << ";size=0" << 0 << 0;
    QTest::newRow("offset past the end") << ";offset=5000;size=10" << 1000 << 0;
    QTest::newRow("size past the end") << ";offset=990;size=100" << 990 << 10;
    QTest::newRow("unparsable numbers") << ";offset=x;size=-1" << 0 << 1000;
    QTest::newRow("unknown parameter skipped") << ";colour=blue" << 0 << 1000;
}

void tst_NetworkRequest::multipartSlices()
{
    QFETCH(QString, parameters);
    QFETCH(int, offset);
    QFETCH(int, size);
    const QByteArray content = pattern(1000);
    const QString path = writeFile("slice.bin", content);
    NetworkRequest *r = request();
    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/echo")));
    r->send(QVariantMap { { "part", "@" + path + parameters } });
    QVERIFY(waitComplete(r));
    const QVariantMap echo = echoOf(r);
    QVERIFY(echo.value("multipartWellFormed").toBool());
    const QVariantList parts = echo.value("parts").toList();
    QCOMPARE(parts.size(), 1);
    QCOMPARE(parts.first().toMap().value("size").toInt(), size);
    QCOMPARE(parts.first().toMap().value("sha256").toString(), sha256(content.mid(offset, size)));
}

void tst_NetworkRequest::multipartMissingFile()
{
    NetworkRequest *r = request();
    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/echo")));
    const QString missing = m_dir.filePath("missing.bin");
    SignalRecorder recorder(r);
    r->send(QVariantMap { { "file", "@" + missing } });
    // It ends at once, in state 4, without reaching the server.
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
    QCOMPARE(r->errorCode(), -1);
    QCOMPARE(r->errorText(), QStringLiteral("Cannot open %1").arg(missing));
    QCOMPARE(recorder.names.count("readyStateChanged"), 2);
    QCOMPARE(recorder.names.count("error"), 1);
    QCOMPARE(recorder.names.mid(recorder.names.size() - 4),
             QStringList({ "errorCodeChanged", "errorTextChanged", "error", "readyStateChanged" }));
    QTest::qWait(50);
    QCOMPARE(m_server->requestCount(), 0);
}

void tst_NetworkRequest::multipartVerbs_data()
{
    QTest::addColumn<QString>("method");
    QTest::addColumn<QString>("sent");
    QTest::newRow("PUT stays") << "PUT" << "PUT";
    QTest::newRow("DELETE becomes POST") << "DELETE" << "POST";
    QTest::newRow("GET becomes POST") << "GET" << "POST";
}

void tst_NetworkRequest::multipartVerbs()
{
    QFETCH(QString, method);
    QFETCH(QString, sent);
    const QVariantMap form { { "f", "@" + writeFile("verb.txt", "x") } };
    NetworkRequest *r = request();
    r->open(method, QUrl(m_server->urlFor("/echo")));
    r->send(form);
    QVERIFY(waitComplete(r));
    QCOMPARE(echoOf(r).value("method").toString(), sent);

    // With an empty prefix nothing is a file.
    r->setUploadPrefix(QString());
    r->send(form);
    QVERIFY(waitComplete(r));
    QVERIFY(echoOf(r).value("parts").toList().isEmpty());
}

void tst_NetworkRequest::multipartRedirectRereadsFiles()
{
    const QByteArray content = pattern(200000);
    const QString path = writeFile("again.bin", content);
    NetworkRequest *r = request();
    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/redirect?code=307&to=/echo")));
    r->send(QVariantMap { { "f", "@" + path + ";offset=10" } });
    QVERIFY(waitComplete(r));
    QCOMPARE(m_server->requestCount(), 2);
    // Both hops carried the whole body.
    QCOMPARE(m_server->requests().at(0).body.size(), m_server->requests().at(1).body.size());
    const QVariantList parts = echoOf(r).value("parts").toList();
    QCOMPARE(parts.size(), 1);
    QCOMPARE(parts.first().toMap().value("sha256").toString(), sha256(content.mid(10)));
}

void tst_NetworkRequest::multipartProgress()
{
    const QString path = writeFile("big.bin", pattern(4 * 1024 * 1024));
    NetworkRequest *r = request();
    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/bytes?size=200000")));
    QList<double> progress;
    connect(r, &NetworkRequest::progressChanged, r, [&]() { progress.append(r->progress()); });
    r->send(QVariantMap { { "f", "@" + path } });
    QVERIFY(waitComplete(r, 20000));
    QCOMPARE(r->errorCode(), 0);
    // The upload fills the first half, the download the second.
    QVERIFY(std::any_of(progress.cbegin(), progress.cend(), [](double p) { return p > 0.0 && p < 0.5; }));
    const int reachedHalf = progress.indexOf(0.5);
    QVERIFY(reachedHalf >= 0);
    for (int i = reachedHalf; i < progress.size(); ++i)
        QVERIFY(progress.at(i) >= 0.5);
    QCOMPARE(progress.last(), 1.0);
}

void tst_NetworkRequest::cookiesMergeIntoJar()
{
    NetworkRequest *r = request();
    sendAndWait(r, "/cookies?set=sid=old");
    QVERIFY(r->responseHeaders().value("Set-Cookie").toString().startsWith("sid=old"));

    // The script's cookie takes the jar's value by name; no header of ours.
    r->headers()->setValue(QStringLiteral("Cookie"), QStringLiteral("sid=new"));
    sendAndWait(r, "/cookies");
    QCOMPARE(r->responseText(), QStringLiteral("sid=new"));

    r->headers()->setValue(QStringLiteral("Cookie"), QStringLiteral("extra=1"));
    r->send();
    QVERIFY(waitComplete(r));
    QStringList cookies = r->responseText().split(QStringLiteral("; "));
    cookies.sort();
    QCOMPARE(cookies, QStringList({ "extra=1", "sid=new" }));
}

void tst_NetworkRequest::basicAuthentication()
{
    NetworkRequest *r = request();
    r->setUser(QStringLiteral("ann"));
    r->setPassword(QStringLiteral("secret"));
    sendAndWait(r, "/auth?user=ann&password=secret&realm=right");
    QCOMPARE(r->responseText(), QStringLiteral("welcome"));

    // Wrong credentials fail once, without asking for ever. Another server,
    // since the manager reuses what worked for a host.
    auto *other = new TestHttpServer(m_owner);
    QVERIFY(other->start());
    NetworkRequest *wrong = request();
    wrong->setUser(QStringLiteral("ann"));
    wrong->setPassword(QStringLiteral("guess"));
    wrong->setUrl(QUrl(other->urlFor("/auth?user=ann&password=secret&realm=wrong")));
    QSignalSpy errorSpy(wrong, &NetworkRequest::error);
    wrong->send();
    QVERIFY(waitComplete(wrong));
    QCOMPARE(wrong->errorCode(), int(QNetworkReply::AuthenticationRequiredError));
    QCOMPARE(errorSpy.count(), 1);
    QVERIFY(other->requestCount() <= 3);
}

void tst_NetworkRequest::tlsErrors()
{
    if (!QSslSocket::supportsSsl())
        QSKIP("No TLS support in this Qt");
    QSslCertificate certificate;
    QSslKey key;
    if (!TestHttpServer::makeCertificate(m_dir.path(), &certificate, &key))
        QSKIP("openssl could not make a certificate");
    auto *tls = new TestHttpServer(m_owner);
    QVERIFY(tls->startTls(certificate, key));

    NetworkRequest *r = request();
    r->setUrl(QUrl(tls->urlFor("/text?body=secure")));
    QSignalSpy errorsSpy(r, &NetworkRequest::sslErrors);
    QSignalSpy ignoredSpy(r, &NetworkRequest::sslErrorsIgnored);
    r->send();
    QVERIFY(waitComplete(r));
    QCOMPARE(errorsSpy.count(), 1);
    QCOMPARE(ignoredSpy.count(), 0);
    QCOMPARE(r->errorCode(), int(QNetworkReply::SslHandshakeFailedError));
    const QVariantList errors = errorsSpy.first().first().value<QVariant>().toList();
    QVERIFY(!errors.isEmpty());
    const QVariantMap first = errors.first().toMap();
    QVERIFY(!first.value("errorString").toString().isEmpty());
    const QVariantMap cert = first.value("certificate").toMap();
    QVERIFY(cert.value("isSelfSigned").toBool());
    QCOMPARE(cert.value("issuer").toMap().value("O").toList(), QVariantList { QStringLiteral("Loomkit Tests") });
    QVERIFY(cert.value("expiryDate").toDateTime() > QDateTime::currentDateTime());

    r->setIgnoreSslErrors(true);
    r->send();
    QVERIFY(waitComplete(r));
    QCOMPARE(ignoredSpy.count(), 1);
    QCOMPARE(errorsSpy.count(), 1);
    QCOMPARE(r->errorCode(), 0);
    QCOMPARE(r->responseText(), QStringLiteral("secure"));
    QVERIFY(r->attribute(NetworkRequest::ConnectionEncryptedAttribute, true).toBool());
}

void tst_NetworkRequest::outsideEventsEndLiveRequests()
{
    NetworkRequest *done = request();
    NetworkRequest *first = request();
    NetworkRequest *second = request();
    first->setUrl(QUrl(m_server->urlFor("/hang")));
    second->setUrl(QUrl(m_server->urlFor("/hang")));
    first->send();
    second->send();
    sendAndWait(done, "/bytes?size=10");
    // A finish for one leaves the others alone.
    QCOMPARE(first->readyState(), NetworkRequest::ReadyStateSending);
    QCOMPARE(second->readyState(), NetworkRequest::ReadyStateSending);

    // Losing the network completes every live request, and only those.
    QSignalSpy doneSpy(done, &NetworkRequest::errorCodeChanged);
    emit m_engine->networkAccessManager()->networkAccessibleChanged(QNetworkAccessManager::NotAccessible);
    for (NetworkRequest *r : { first, second }) {
        QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
        QCOMPARE(r->errorCode(), 2);
        QCOMPARE(r->errorText(), QStringLiteral("NETWORK CLOSED"));
    }
    QCOMPARE(doneSpy.count(), 0);

    // Clearing the access cache aborts.
    first->send();
    QTest::qWait(20);
    m_service->emitAccessCacheClearing();
    QVERIFY(waitComplete(first));
    QCOMPARE(first->errorCode(), int(QNetworkReply::OperationCanceledError));
}

void tst_NetworkRequest::abortAndRetry()
{
    NetworkRequest *r = request();
    QSignalSpy errorSpy(r, &NetworkRequest::error);
    r->abort(); // nothing live: nothing happens
    QCOMPARE(errorSpy.count(), 0);

    r->open(QStringLiteral("POST"), QUrl(m_server->urlFor("/hang")));
    r->headers()->setValue(QStringLiteral("X-Try"), QStringLiteral("1"));
    r->send(QStringLiteral("payload"));
    QTest::qWait(20);
    r->abort();
    r->abort();
    QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
    QCOMPARE(r->errorCode(), int(QNetworkReply::OperationCanceledError));
    QCOMPARE(errorSpy.count(), 1);

    // The retry goes with what the first try had.
    m_server->route(QStringLiteral("/hang"), [](const TestHttpRequest &, TestHttpConnection *connection) {
        connection->respond(200, "second time");
    });
    r->send(r->requestBody());
    QVERIFY(waitComplete(r));
    QCOMPARE(r->responseText(), QStringLiteral("second time"));
    const TestHttpRequest last = m_server->requests().last();
    QCOMPARE(last.method + ' ' + last.body + ' ' + last.header("X-Try"), QByteArray("POST payload 1"));
}

void tst_NetworkRequest::attributes()
{
    NetworkRequest *r = request();
    r->setAttribute(NetworkRequest::CacheLoadControlAttribute, int(QNetworkRequest::AlwaysNetwork));
    r->setAttribute(NetworkRequest::HttpPipeliningAllowedAttribute, true);
    r->setAttribute(NetworkRequest::HttpPipeliningAllowedAttribute, QVariant());
    // Set attributes show on the live request only.
    QVERIFY(!r->attribute(NetworkRequest::CacheLoadControlAttribute).isValid());
    r->setUrl(QUrl(m_server->urlFor("/hang")));
    r->send();
    QCOMPARE(r->attribute(NetworkRequest::CacheLoadControlAttribute).toInt(), int(QNetworkRequest::AlwaysNetwork));
    QVERIFY(!r->attribute(NetworkRequest::HttpPipeliningAllowedAttribute).isValid());
    QCOMPARE(r->attribute(NetworkRequest::FollowRedirectsAttribute).toBool(), false);
    r->abort();
    QVERIFY(!r->attribute(NetworkRequest::CacheLoadControlAttribute).isValid());

    sendAndWait(r, "/status?code=201");
    QCOMPARE(r->attribute(NetworkRequest::HttpStatusCodeAttribute, true).toInt(), 201);
    QCOMPARE(r->attribute(NetworkRequest::HttpReasonPhraseAttribute, true).toString(), QStringLiteral("Created"));
    QVERIFY(!r->attribute(NetworkRequest::User, true).isValid());
}

QTEST_MAIN(tst_NetworkRequest)

#include "tst_NetworkRequest.moc"
