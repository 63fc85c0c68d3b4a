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

    QQmlEngine *m_engine = nullptr;
    QObject *m_owner = nullptr;
    TestHttpServer *m_server = nullptr;
    QTemporaryDir m_dir;
    NetworkingPrivate *m_service = nullptr;

    NetworkRequest *request() { return makeRequest(m_engine, m_owner); }
    QUrl url(const QString &path) const { return QUrl(m_server->urlFor(path)); }

    bool exchange(NetworkRequest *r, const QString &method, const QString &path, const QVariant &body = QVariant())
    {
        r->open(method, url(path));
        r->send(body);
        return waitComplete(r);
    }

    QString writeFile(const QString &name, const QByteArray &bytes)
    {
        QFile file(m_dir.filePath(name));
        file.open(QIODevice::WriteOnly);
        file.write(bytes);
        return file.fileName();
    }

    // The parts the server's /echo route parsed; none if the body was not well formed.
    static QVariantList partsOf(NetworkRequest *r)
    {
        const QVariantMap echo = echoOf(r);
        return echo.value("multipartWellFormed").toBool() ? echo.value("parts").toList() : QVariantList();
    }

private slots:
    void initTestCase()
    {
        QVERIFY(m_dir.isValid());
        // As a host does: the service first, then the engine and its requests.
        m_service = NetworkingPrivate::publish();
        QVERIFY(m_service);
        m_engine = new QQmlEngine(this);
        Loomkit::instance(m_engine);
        QVERIFY(Loomkit::current());
    }

    void init()
    {
        m_owner = new QObject(this);
        m_server = new TestHttpServer(m_owner);
        QVERIFY(m_server->start());
        Loomkit::current()->setProperty("Orvane.Loomkit.Networking.timeout", QVariant());
        Loomkit::current()->setProperty("Orvane.Loomkit.Networking.defaultUserAgent", QVariant());
    }

    void cleanup()
    {
        delete m_owner;
        m_engine->networkAccessManager()->clearAccessCache();
        m_engine->networkAccessManager()->clearConnectionCache();
    }

    void lifecycle()
    {
        NetworkRequest *r = request();
        QSignalSpy stateSpy(r, &NetworkRequest::readyStateChanged);
        QSignalSpy errorSpy(r, &NetworkRequest::error);
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("readyState error"));
        r->send();
        r->abort(); // nothing live: nothing happens
        QCOMPARE(r->errorText(), QStringLiteral("UNEXPECTED"));
        QCOMPARE(stateSpy.count(), 0);
        QCOMPARE(errorSpy.count(), 0);

        r->setMethod(QStringLiteral("post"));
        r->setUrl(url("/hang"));
        QCOMPARE(r->readyState(), NetworkRequest::ReadyStateInitialized);
        r->headers()->setValue(QStringLiteral("X-Try"), QStringLiteral("1"));
        r->setAttribute(NetworkRequest::CacheLoadControlAttribute, int(QNetworkRequest::AlwaysNetwork));
        r->setAttribute(NetworkRequest::HttpPipeliningAllowedAttribute, true);
        r->setAttribute(NetworkRequest::HttpPipeliningAllowedAttribute, QVariant());
        // Set attributes show on the live request only.
        QVERIFY(!r->attribute(NetworkRequest::CacheLoadControlAttribute).isValid());
        r->send(QStringLiteral("payload"));
        QCOMPARE(r->readyState(), NetworkRequest::ReadyStateSending);
        QCOMPARE(r->attribute(NetworkRequest::CacheLoadControlAttribute).toInt(), int(QNetworkRequest::AlwaysNetwork));
        QVERIFY(!r->attribute(NetworkRequest::HttpPipeliningAllowedAttribute).isValid());
        QCOMPARE(r->attribute(NetworkRequest::FollowRedirectsAttribute).toBool(), false);

        // While sending, url, method, open and send are refused.
        r->setUrl(url("/echo"));
        r->setMethod(QStringLiteral("GET"));
        r->open(QStringLiteral("PUT"), url("/other"));
        QCOMPARE(r->errorText(), QStringLiteral("UNEXPECTED"));
        QCOMPARE(r->url(), url("/hang"));
        QCOMPARE(r->method(), QStringLiteral("POST"));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("readyState error"));
        r->send();

        QTest::qWait(20);
        r->abort();
        r->abort();
        QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
        QCOMPARE(r->errorCode(), int(QNetworkReply::OperationCanceledError));
        QCOMPARE(errorSpy.count(), 1);
        QVERIFY(!r->attribute(NetworkRequest::CacheLoadControlAttribute).isValid());

        // The same URL again leaves state 4; the retry goes with what the
        // first try had.
        r->open(QStringLiteral("POST"), url("/hang"));
        QCOMPARE(r->readyState(), NetworkRequest::ReadyStateComplete);
        m_server->route(QStringLiteral("/hang"), [](const TestHttpRequest &, TestHttpConnection *connection) {
            connection->respond(201, "second time");
        });
        r->send(r->requestBody());
        QVERIFY(waitComplete(r));
        QCOMPARE(r->responseText(), QStringLiteral("second time"));
        const TestHttpRequest last = m_server->requests().last();
        QCOMPARE(last.method + ' ' + last.body + ' ' + last.header("X-Try"), QByteArray("POST payload 1"));
        QCOMPARE(r->statusText(), QStringLiteral("201 Created"));
        QCOMPARE(r->attribute(NetworkRequest::HttpStatusCodeAttribute, true).toInt(), 201);
        QCOMPARE(r->attribute(NetworkRequest::HttpReasonPhraseAttribute, true).toString(), QStringLiteral("Created"));
        QVERIFY(!r->attribute(NetworkRequest::User, true).isValid());
    }

    void signalOrder()
    {
        NetworkRequest *r = request();
        r->setUrl(url("/bytes?size=5000"));
        SignalRecorder recorder(r);
        r->send();
        QVERIFY(waitComplete(r));
        QCOMPARE(r->progress(), 1.0);
        const QStringList start = { "responseHeadersChanged", "progressChanged", "responseChanged",
                                    "responseTextChanged", "readyStateChanged", "responseHeadersChanged",
                                    "readyStateChanged", "responseTextChanged", "progressChanged" };
        QCOMPARE(recorder.names.mid(0, start.size()), start);
        // The finish: headers again, then progress only if the chunks left it
        // below 1.0, then the response and state 4.
        const QStringList end = recorder.names.mid(recorder.names.lastIndexOf("responseHeadersChanged"));
        QCOMPARE(end.mid(end.size() - 2), QStringList({ "responseChanged", "readyStateChanged" }));
        QVERIFY(end.size() <= 5);
        QVERIFY(!recorder.names.contains("error"));

        QVERIFY(exchange(r, "GET", "/status?code=404"));
        QCOMPARE(r->errorCode(), int(QNetworkReply::ContentNotFoundError));
        QCOMPARE(r->responseText(), QStringLiteral("status 404"));
        // The next exchange clears the error ahead of state 2; progress goes
        // back from 1.0 to 0.0, hence a second progressChanged.
        recorder.names.clear();
        r->send(QStringLiteral("body"));
        QCOMPARE(recorder.names, QStringList({ "requestBodyChanged", "responseHeadersChanged", "progressChanged",
                                               "progressChanged", "responseChanged", "responseTextChanged",
                                               "errorCodeChanged", "errorTextChanged", "readyStateChanged" }));
        QVERIFY(waitComplete(r));
        const QStringList failed = { "errorCodeChanged", "errorTextChanged", "responseChanged", "error",
                                     "readyStateChanged" };
        QCOMPARE(recorder.names.mid(recorder.names.size() - failed.size()), failed);
        QCOMPARE(recorder.names.count("error"), 1);
    }

    void bodyChoosesEncoding_data()
    {
        QTest::addColumn<QString>("method");
        QTest::addColumn<QString>("path");
        QTest::addColumn<QVariant>("body");
        QTest::addColumn<QString>("sent"); // method|target|body|Content-Type
        const QVariant form(QVariantMap { { "a", 1 } });
        const QVariant spaced(QVariantMap { { "a", "x y" } });
        QTest::newRow("GET form wins over query") << "GET" << "/echo?a=2&b=3" << form << "GET|/echo?a=1&b=3||";
        QTest::newRow("POST form takes the query") << "post" << "/echo?z=9" << spaced
                                                   << "POST|/echo|a=x%20y&z=9|application/x-www-form-urlencoded";
        QTest::newRow("POST text as is") << "POST" << "/echo" << QVariant("{\"k\":1}")
                                         << "POST|/echo|{\"k\":1}|application/x-www-form-urlencoded";
        QTest::newRow("PUT form") << "PUT" << "/echo" << form << "PUT|/echo|a=1|";
        QTest::newRow("DELETE form") << "DELETE" << "/echo" << form << "DELETE|/echo|a=1|";
        QTest::newRow("DELETE plain") << "DELETE" << "/echo" << QVariant() << "DELETE|/echo||";
        QTest::newRow("custom verb becomes GET") << "PATCH" << "/echo" << form << "GET|/echo?a=1||";
    }

    void bodyChoosesEncoding()
    {
        QFETCH(QString, method);
        QFETCH(QString, path);
        QFETCH(QVariant, body);
        QFETCH(QString, sent);
        QVERIFY(exchange(request(), method, path, body));
        QCOMPARE(m_server->requestCount(), 1);
        const TestHttpRequest got = m_server->requests().first();
        QCOMPARE(QString::fromUtf8(got.method + '|' + got.target + '|' + got.body + '|' + got.header("Content-Type")),
                 sent);
    }

    void headersSent()
    {
        Loomkit::current()->setProperty("Orvane.Loomkit.Networking.defaultUserAgent", QStringLiteral("Framework/1.0"));
        NetworkRequest *r = request();
        QVERIFY(exchange(r, "GET", "/cookies?set=sid=old"));
        QCOMPARE(m_server->requests().last().header("User-Agent"), QByteArray("Framework/1.0"));
        QVERIFY(r->responseHeaders().value("Set-Cookie").toString().startsWith("sid=old"));

        // The request's own agent wins; a value that would start another
        // header is skipped on its own. The script's cookie takes the jar's
        // value by name, and goes in the jar's header, not in one of ours.
        r->headers()->setUserAgent(QStringLiteral("Own/2.0"));
        r->headers()->setValue(QStringLiteral("X-Evil"), QStringLiteral("a\r\nX-Injected: 1"));
        r->headers()->setValue(QStringLiteral("X-Good"), QStringLiteral("fine"));
        r->headers()->setValue(QStringLiteral("Cookie"), QStringLiteral("sid=new"));
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Skipping header"));
        QVERIFY(exchange(r, "GET", "/cookies"));
        QCOMPARE(r->responseText(), QStringLiteral("sid=new"));
        const TestHttpRequest sent = m_server->requests().last();
        QCOMPARE(sent.header("User-Agent"), QByteArray("Own/2.0"));
        QCOMPARE(sent.header("X-Good"), QByteArray("fine"));
        QVERIFY(sent.header("X-Injected").isEmpty());
        QVERIFY(sent.header("X-Evil").isEmpty());

        r->headers()->clear(QStringLiteral("X-Evil"));
        r->headers()->setValue(QStringLiteral("Cookie"), QStringLiteral("extra=1"));
        r->send();
        QVERIFY(waitComplete(r));
        QStringList cookies = r->responseText().split(QStringLiteral("; "));
        cookies.sort();
        QCOMPARE(cookies, QStringList({ "extra=1", "sid=new" }));
    }

    void redirects_data()
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

    void redirects()
    {
        QFETCH(QString, path);
        QFETCH(QString, method);
        QFETCH(bool, follow);
        QFETCH(int, status);
        QFETCH(int, hops);
        NetworkRequest *r = request();
        r->setFollowRedirects(follow);
        QList<double> progress;
        connect(r, &NetworkRequest::progressChanged, r, [&]() { progress.append(r->progress()); });
        // A POST form would move the query into the body; a text body keeps
        // the redirect route's query.
        const bool post = method == QLatin1String("POST");
        QVERIFY(exchange(r, method, path, post ? QVariant("field=value") : QVariant(QVariantMap { { "field", "v" } })));
        QCOMPARE(r->status(), status);
        QCOMPARE(r->url(), url(path));
        QCOMPARE(r->responseText().contains("redirect body"), status == 301 || status == 302);
        QCOMPARE(m_server->requestCount(), hops);
        // Nothing of a hop shows as progress: 0 until the final jump.
        QCOMPARE(progress.takeLast(), 1.0);
        for (double p : progress)
            QVERIFY2(p == 0.0 || p > 0.5, qPrintable(QString::number(p)));
        if (hops == 1)
            return;
        // POST keeps its body; GET loses its form but keeps the location's query.
        const TestHttpRequest second = m_server->requests().at(1);
        QCOMPARE(QString::fromLatin1(second.method), method);
        QCOMPARE(post ? second.body : second.target, QByteArray(post ? "field=value" : "/echo?kept=1"));
    }

    void responseType_data()
    {
        QTest::addColumn<QString>("responseType");
        QTest::addColumn<QString>("body");
        QTest::addColumn<QVariant>("expected");
        const QVariantMap withNull { { "a", 1 }, { "b", QVariant::fromValue(nullptr) } };
        QTest::newRow("JSON in capitals") << "JSON" << "{\"b\":\"x\"}" << QVariant(QVariantMap { { "b", "x" } });
        QTest::newRow("json with null") << "json" << "{\"a\":1,\"b\":null}" << QVariant(withNull);
        QTest::newRow("base64") << "base64" << "hi!" << QVariant(QStringLiteral("aGkh"));
        QTest::newRow("binary") << "Binary" << "raw" << QVariant(QByteArray("raw"));
        QTest::newRow("text") << "text" << "h\xc3\xa9" << QVariant(QString::fromUtf8("h\xc3\xa9"));
        QTest::newRow("empty type") << "" << "plain" << QVariant(QStringLiteral("plain"));
        QTest::newRow("unknown type") << "xml" << "<a/>" << QVariant();
    }

    void responseType()
    {
        QFETCH(QString, responseType);
        QFETCH(QString, body);
        QFETCH(QVariant, expected);
        NetworkRequest *r = request();
        r->setResponseType(responseType);
        QSignalSpy responseSpy(r, &NetworkRequest::responseChanged);
        QVERIFY(exchange(r, "GET", "/text?body=" + QString::fromLatin1(QUrl::toPercentEncoding(body))));
        QCOMPARE(responseSpy.count(), 2); // the reset and the finish
        QCOMPARE(r->response().userType(), expected.userType());
        // Through JSON so that a null inside a map compares as null.
        QVERIFY(QJsonValue::fromVariant(r->response()) == QJsonValue::fromVariant(expected));
    }

    void responsePath()
    {
        const int size = 3 * 1024 * 1024 + 17;
        NetworkRequest *r = request();
        const QString path = writeFile("download.bin", "old content that must go");
        r->setResponsePath(path);
        QList<double> progress;
        connect(r, &NetworkRequest::progressChanged, r, [&]() { progress.append(r->progress()); });
        QVERIFY(exchange(r, "GET", QStringLiteral("/bytes?size=%1").arg(size)));
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
        r->setUrl(url("/slow?size=2000&pieces=20&interval=50"));
        r->send();
        QVERIFY(QTest::qWaitFor([&]() { return QFile::exists(path); }, 5000));
        r->setResponsePath(m_dir.filePath("other.bin"));
        QCOMPARE(r->errorText(), QStringLiteral("Error: responsePath cannot be set when file is open"));
        QCOMPARE(r->responsePath(), path);
        r->abort();
        QCOMPARE(r->errorCode(), int(QNetworkReply::OperationCanceledError));
        QVERIFY(!QFile::exists(path));

        // A failure that was not an abort keeps what arrived.
        QVERIFY(exchange(r, "GET", "/truncate?size=4000"));
        QVERIFY(r->errorCode() != 0);
        QCOMPARE(QFileInfo(path).size(), qint64(2000));

        // A folder cannot be opened as a file: the response stays in memory.
        r->setResponsePath(m_dir.path());
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression("Cannot open .*Is a directory"));
        QVERIFY(exchange(r, "GET", "/bytes?size=100"));
        QVERIFY(QFileInfo(m_dir.path()).isDir());
        QCOMPARE(r->responseText(), QString::fromLatin1(pattern(100)));
        QCOMPARE(r->errorText(), QString()); // cleared by the good finish
    }

    void serverBehaviour_data()
    {
        // size -1: the exchange must end in an error.
        QTest::addColumn<QString>("path");
        QTest::addColumn<int>("size");
        QTest::newRow("chunked") << "/chunked?size=100000&pieces=37" << 100000;
        QTest::newRow("empty") << "/bytes?size=0" << 0;
        QTest::newRow("refused") << "refused" << -1;
        QTest::newRow("reset") << "/reset" << -1;
        QTest::newRow("truncated") << "/truncate?size=1000" << -1;
        QTest::newRow("closed mid-body") << "/close" << -1;
        QTest::newRow("garbage") << "/garbage" << -1;
    }

    void serverBehaviour()
    {
        QFETCH(QString, path);
        QFETCH(int, size);
        QUrl target = url(path);
        if (path == QLatin1String("refused")) {
            QTcpServer probe; // a port that was just free
            QVERIFY(probe.listen(QHostAddress::LocalHost, 0));
            target = QUrl(QStringLiteral("http://127.0.0.1:%1/").arg(probe.serverPort()));
        }
        NetworkRequest *r = request();
        r->setUrl(target);
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
        QCOMPARE(r->url(), target);
        QCOMPARE(r->method(), QStringLiteral("GET"));
    }

    void timeouts_data()
    {
        QTest::addColumn<QVariant>("own");
        QTest::addColumn<QVariant>("framework");
        QTest::addColumn<bool>("timesOut");
        QTest::newRow("own as text wins") << QVariant(QStringLiteral("200")) << QVariant(60000) << true;
        QTest::newRow("framework") << QVariant() << QVariant(200) << true;
        QTest::newRow("own 0 turns framework off") << QVariant(0) << QVariant(200) << false;
        QTest::newRow("non-numeric turns framework off") << QVariant(QStringLiteral("soon")) << QVariant(200) << false;
        QTest::newRow("none") << QVariant() << QVariant() << false;
    }

    void timeouts()
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
        QVERIFY(exchange(r, "GET", "/slow?size=10&pieces=2&interval=700"));
        QCOMPARE(timeoutSpy.count(), timesOut ? 1 : 0);
        QCOMPARE(errorSpy.count(), timesOut ? 1 : 0);
        QCOMPARE(r->errorCode(), timesOut ? int(QNetworkReply::OperationCanceledError) : 0);
        QCOMPARE(r->responseText(), timesOut ? QString() : QStringLiteral("abcdefghij"));
        QVERIFY(!timesOut || clock.elapsed() < 1200);
    }

    void multipartParts()
    {
        const QByteArray photo = pattern(4 * 1024 * 1024);
        NetworkRequest *r = request();
        r->headers()->setValue(QStringLiteral("Content-Type"), QStringLiteral("text/wrong"));
        const QVariantMap form { { "title", QString::fromUtf8("Gr\xc3\xbc\xc3\x9f") }, { "count", 3 },
                                 { "photo", "@" + writeFile("photo.png", photo) },
                                 { "notes", "@" + writeFile("n.bin", "notes") + ";type=text/x-notes;filename=r.txt" } };
        QList<double> progress;
        connect(r, &NetworkRequest::progressChanged, r, [&]() { progress.append(r->progress()); });
        r->open(QStringLiteral("POST"), url("/echo?x=1"));
        r->send(form);
        QVERIFY(waitComplete(r, 20000));
        // The upload fills the first half of the progress, the download the second.
        QVERIFY(std::any_of(progress.cbegin(), progress.cend(), [](double p) { return p > 0.0 && p < 0.5; }));
        const int reachedHalf = progress.indexOf(0.5);
        QVERIFY(reachedHalf >= 0);
        for (int i = reachedHalf; i < progress.size(); ++i)
            QVERIFY(progress.at(i) >= 0.5);
        QCOMPARE(progress.last(), 1.0);

        const QVariantMap echo = echoOf(r);
        QCOMPARE(echo.value("target").toString(), QStringLiteral("/echo?x=1"));
        QVERIFY(echo.value("headers").toMap().value("content-type").toString().startsWith(
            "multipart/form-data; boundary=---------------------------"));
        // The script's header is replaced for this exchange only.
        QCOMPARE(r->headers()->value(QStringLiteral("Content-Type")).toString(), QStringLiteral("text/wrong"));

        // Plain values first, then files, each in key order.
        const QVariantList parts = partsOf(r);
        QCOMPARE(parts.size(), 4);
        const auto part = [&](int i, const char *key) { return parts.at(i).toMap().value(key).toString(); };
        QCOMPARE(part(0, "name") + '=' + part(0, "text"), QStringLiteral("count=3"));
        QVERIFY(!parts.at(0).toMap().contains("filename"));
        QCOMPARE(part(1, "name") + '=' + part(1, "text"), QString::fromUtf8("title=Gr\xc3\xbc\xc3\x9f"));
        QCOMPARE(QStringList({ part(2, "name"), part(2, "filename"), part(2, "contentType"), part(2, "text") }),
                 QStringList({ "notes", "r.txt", "text/x-notes", "notes" }));
        QCOMPARE(QStringList({ part(3, "name"), part(3, "filename"), part(3, "contentType"), part(3, "sha256") }),
                 QStringList({ "photo", "photo.png", "image/png", sha256(photo) }));

        // With an empty prefix nothing is a file.
        r->setUploadPrefix(QString());
        QVERIFY(exchange(r, "POST", "/echo", form));
        QCOMPARE(echoOf(r).value("parts").toList().size(), 0);
    }

    void multipartFile_data()
    {
        QTest::addColumn<QString>("method");
        QTest::addColumn<QString>("path");
        QTest::addColumn<QString>("parameters");
        QTest::addColumn<int>("offset");
        QTest::addColumn<int>("size");
        QTest::addColumn<QString>("sent");
        QTest::newRow("offset and size") << "POST" << "/echo" << ";offset=100;size=50" << 100 << 50 << "POST";
        QTest::newRow("offset to the end") << "POST" << "/echo" << ";offset=900" << 900 << 100 << "POST";
        QTest::newRow("size from the start") << "POST" << "/echo" << ";size=10" << 0 << 10 << "POST";
        QTest::newRow("unparsable numbers") << "POST" << "/echo" << ";offset=x;size=-1" << 0 << 1000 << "POST";
        QTest::newRow("unknown parameter skipped") << "POST" << "/echo" << ";colour=blue" << 0 << 1000 << "POST";
        QTest::newRow("PUT stays") << "PUT" << "/echo" << "" << 0 << 1000 << "PUT";
        QTest::newRow("DELETE becomes POST") << "DELETE" << "/echo" << "" << 0 << 1000 << "POST";
        QTest::newRow("GET becomes POST") << "GET" << "/echo" << "" << 0 << 1000 << "POST";
        // The body is built again from the files for the next hop.
        QTest::newRow("redirect rereads") << "POST" << "/redirect?code=307&to=/echo" << ";offset=10" << 10 << 990
                                          << "POST";
    }

    void multipartFile()
    {
        QFETCH(QString, method);
        QFETCH(QString, path);
        QFETCH(QString, parameters);
        QFETCH(int, offset);
        QFETCH(int, size);
        QFETCH(QString, sent);
        const QByteArray content = pattern(1000);
        NetworkRequest *r = request();
        QVERIFY(exchange(r, method, path, QVariantMap { { "f", "@" + writeFile("f.bin", content) + parameters } }));
        QCOMPARE(echoOf(r).value("method").toString(), sent);
        const QVariantList parts = partsOf(r);
        QCOMPARE(parts.size(), 1);
        QCOMPARE(parts.first().toMap().value("size").toInt(), size);
        QCOMPARE(parts.first().toMap().value("sha256").toString(), sha256(content.mid(offset, size)));
    }

    void multipartMissingFile()
    {
        NetworkRequest *r = request();
        r->open(QStringLiteral("POST"), url("/echo"));
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

    void basicAuthentication()
    {
        NetworkRequest *r = request();
        r->setUser(QStringLiteral("ann"));
        r->setPassword(QStringLiteral("secret"));
        QVERIFY(exchange(r, "GET", "/auth?user=ann&password=secret&realm=right"));
        QCOMPARE(r->responseText(), QStringLiteral("welcome"));

        // Wrong credentials fail once, without asking for ever. Another
        // server, since the manager reuses what worked for a host.
        auto *other = new TestHttpServer(m_owner);
        QVERIFY(other->start());
        r->setPassword(QStringLiteral("guess"));
        QSignalSpy errorSpy(r, &NetworkRequest::error);
        r->setUrl(QUrl(other->urlFor("/auth?user=ann&password=secret&realm=wrong")));
        r->send();
        QVERIFY(waitComplete(r));
        QCOMPARE(r->errorCode(), int(QNetworkReply::AuthenticationRequiredError));
        QCOMPARE(errorSpy.count(), 1);
        QVERIFY(other->requestCount() <= 3);
    }

    void tlsErrors()
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
        QVERIFY(!errors.first().toMap().value("errorString").toString().isEmpty());
        const QVariantMap cert = errors.first().toMap().value("certificate").toMap();
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

    void outsideEventsEndLiveRequests()
    {
        NetworkRequest *done = request();
        NetworkRequest *live = request();
        live->setUrl(url("/hang"));
        live->send();
        QVERIFY(exchange(done, "GET", "/bytes?size=10"));
        // A finish for one leaves the others alone.
        QCOMPARE(live->readyState(), NetworkRequest::ReadyStateSending);

        // Losing the network completes the live requests, and only those.
        QSignalSpy doneSpy(done, &NetworkRequest::errorCodeChanged);
        emit m_engine->networkAccessManager()->networkAccessibleChanged(QNetworkAccessManager::NotAccessible);
        QCOMPARE(live->readyState(), NetworkRequest::ReadyStateComplete);
        QCOMPARE(live->errorCode(), 2);
        QCOMPARE(live->errorText(), QStringLiteral("NETWORK CLOSED"));
        QCOMPARE(doneSpy.count(), 0);

        // Clearing the access cache aborts.
        live->send();
        QTest::qWait(20);
        m_service->emitAccessCacheClearing();
        QVERIFY(waitComplete(live));
        QCOMPARE(live->errorCode(), int(QNetworkReply::OperationCanceledError));
    }
};

QTEST_MAIN(tst_NetworkRequest)

#include "tst_NetworkRequest.moc"
