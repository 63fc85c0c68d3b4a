#include "NetworkRequest.h"
#include "FileUtility.h"
#include "JsonUtility.h"
#include "Loomkit.h"
#include "LoomkitLogging.h"
#include "NetworkFormData.h"
#include "NetworkRequestHeaders.h"
#include "NetworkingPrivateInvoker.h"
#include "RequestQuery.h"

#include <QAuthenticator>
#include <QDateTime>
#include <QFile>
#include <QFileInfo>
#include <QJSValueIterator>
#include <QMimeDatabase>
#include <QNetworkCookie>
#include <QNetworkCookieJar>
#include <QNetworkProxy>
#include <QNetworkRequest>
#include <QQmlEngine>
#include <QSslCertificate>
#include <QTimer>

QT_WARNING_DISABLE_DEPRECATED

namespace {

const QString kUserAgent = QStringLiteral("User-Agent");
const QString kContentType = QStringLiteral("Content-Type");
const QString kCookie = QStringLiteral("Cookie");

// Bytes the network layer may hold for us before it waits for a read: keeps
// memory flat however large the response, and is plenty for full speed.
constexpr qint64 kReadBufferSize = 1024 * 1024;

bool isMethod(const QString &method, const char *name)
{
    return method.compare(QLatin1String(name), Qt::CaseInsensitive) == 0;
}

QVariant frameworkProperty(const char *name)
{
    QObject *framework = Loomkit::current();
    return framework ? framework->property(name) : QVariant();
}

// The page cache takes a large write much more slowly than the same bytes
// in small ones, so a chunk goes to the file in slices.
bool writeInSlices(QFile *file, const QByteArray &chunk)
{
    constexpr int kSlice = 64 * 1024;
    const char *data = chunk.constData();
    for (int done = 0; done < chunk.size(); done += kSlice) {
        const int length = qMin(kSlice, chunk.size() - done);
        if (file->write(data + done, length) != length)
            return false;
    }
    return true;
}

bool containsNullWord(const QByteArray &data)
{
    // "null" in any case, without a lower-cased copy of the whole body.
    const char *p = data.constData();
    const int n = data.size();
    for (int i = 0; i + 3 < n; ++i) {
        if ((p[i] | 0x20) == 'n' && (p[i + 1] | 0x20) == 'u' && (p[i + 2] | 0x20) == 'l' && (p[i + 3] | 0x20) == 'l')
            return true;
    }
    return false;
}

bool hasLineBreak(const QByteArray &text)
{
    return text.contains('\r') || text.contains('\n');
}

QVariantMap certificateToMap(const QSslCertificate &certificate)
{
    static const char *const names[] = { "O", "CN", "L", "OU", "C", "ST", "DQ", "SN", "EM" };
    QVariantMap subject;
    QVariantMap issuer;
    for (int code = 0; code < 9; ++code) {
        const auto info = QSslCertificate::SubjectInfo(code);
        const QStringList subjectValues = certificate.subjectInfo(info);
        if (!subjectValues.isEmpty())
            subject.insert(QLatin1String(names[code]), QVariant(subjectValues).toList());
        const QStringList issuerValues = certificate.issuerInfo(info);
        if (!issuerValues.isEmpty())
            issuer.insert(QLatin1String(names[code]), QVariant(issuerValues).toList());
    }

    QVariantMap map;
    map.insert(QStringLiteral("effectiveDate"), certificate.effectiveDate());
    map.insert(QStringLiteral("expiryDate"), certificate.expiryDate());
    map.insert(QStringLiteral("isBlacklisted"), certificate.isBlacklisted());
    map.insert(QStringLiteral("isNull"), certificate.isNull());
    map.insert(QStringLiteral("isSelfSigned"), certificate.isSelfSigned());
    map.insert(QStringLiteral("text"), certificate.toText());
    map.insert(QStringLiteral("subject"), subject);
    map.insert(QStringLiteral("issuer"), issuer);
    return map;
}

} // namespace

NetworkRequest::NetworkRequest(QObject *parent)
    : QObject(parent)
{
    m_networking = new NetworkingPrivateInvoker();
    connect(m_networking, &NetworkingPrivateInvoker::defaultConfigurationChanged,
            this, &NetworkRequest::onDefaultConfigurationChanged);
    connect(m_networking, &NetworkingPrivateInvoker::accessCacheClearing,
            this, &NetworkRequest::onAccessCacheClearing);
}

NetworkRequest::~NetworkRequest()
{
    setNetworkAccessManager(nullptr);
    disconnect(m_networking, nullptr, this, nullptr);
    delete m_networking;

    // The reply may still be reading our body: stop it before the body goes.
    if (m_currentReply) {
        QNetworkReply *reply = m_currentReply;
        m_currentReply = nullptr;
        disconnect(reply, nullptr, this, nullptr);
        m_aborted = true;
        if (m_formData)
            m_formData->setAborted(true);
        reply->abort();
        delete reply;
    }
    delete m_timeoutTimer;
    delete m_currentRequest;
}

void NetworkRequest::classBegin()
{
    QQmlEngine *engine = qmlEngine(this);
    setNetworkAccessManager(engine ? engine->networkAccessManager() : nullptr);
    headers()->classBegin();
}

void NetworkRequest::componentComplete()
{
    headers()->componentComplete();
}

QNetworkAccessManager *NetworkRequest::networkAccessManager() const
{
    return m_networkAccessManager;
}

void NetworkRequest::setNetworkAccessManager(QNetworkAccessManager *manager)
{
    if (m_networkAccessManager) {
        QNetworkAccessManager *old = m_networkAccessManager;
        disconnect(old, &QNetworkAccessManager::authenticationRequired, this, &NetworkRequest::onAuthenticationRequired);
        disconnect(old, &QNetworkAccessManager::finished, this, qOverload<QNetworkReply *>(&NetworkRequest::onFinished));
        disconnect(old, &QNetworkAccessManager::proxyAuthenticationRequired,
                   this, &NetworkRequest::onProxyAuthenticationRequired);
        disconnect(old, &QNetworkAccessManager::networkAccessibleChanged,
                   this, &NetworkRequest::onNetworkAccessibleChanged);
        disconnect(old, &QNetworkAccessManager::encrypted, this, qOverload<QNetworkReply *>(&NetworkRequest::onEncrypted));
        disconnect(old, &QNetworkAccessManager::sslErrors,
                   this, qOverload<QNetworkReply *, const QList<QSslError> &>(&NetworkRequest::onSslErrors));
    }
    m_networkAccessManager = manager;
    if (!manager)
        return;
    connect(manager, &QNetworkAccessManager::authenticationRequired, this, &NetworkRequest::onAuthenticationRequired);
    connect(manager, &QNetworkAccessManager::finished, this, qOverload<QNetworkReply *>(&NetworkRequest::onFinished));
    connect(manager, &QNetworkAccessManager::proxyAuthenticationRequired,
            this, &NetworkRequest::onProxyAuthenticationRequired);
    connect(manager, &QNetworkAccessManager::networkAccessibleChanged,
            this, &NetworkRequest::onNetworkAccessibleChanged);
    connect(manager, &QNetworkAccessManager::encrypted, this, qOverload<QNetworkReply *>(&NetworkRequest::onEncrypted));
    connect(manager, &QNetworkAccessManager::sslErrors,
            this, qOverload<QNetworkReply *, const QList<QSslError> &>(&NetworkRequest::onSslErrors));
}

// Properties

QUrl NetworkRequest::url() const
{
    return m_url;
}

void NetworkRequest::setUrl(const QUrl &url)
{
    if (m_readyState == ReadyStateSending || m_readyState == ReadyStateProcessing) {
        setErrorText(QStringLiteral("UNEXPECTED"));
        return;
    }
    if (url == m_url)
        return;
    m_url = url;
    m_networking->setRequestUrl(url);
    emit urlChanged();
    setReadyState(ReadyStateInitialized);
}

QString NetworkRequest::method() const
{
    return m_method;
}

void NetworkRequest::setMethod(const QString &method)
{
    if (m_readyState == ReadyStateSending || m_readyState == ReadyStateProcessing) {
        setErrorText(QStringLiteral("UNEXPECTED"));
        return;
    }
    const QString upper = method.toUpper();
    if (upper == m_method)
        return;
    m_method = upper;
    emit methodChanged();
}

NetworkRequestHeaders *NetworkRequest::headers()
{
    if (!m_headers)
        m_headers = new NetworkRequestHeaders(this);
    return m_headers;
}

bool NetworkRequest::followRedirects() const
{
    return m_redirectMode != 0;
}

void NetworkRequest::setFollowRedirects(bool followRedirects)
{
    const int mode = followRedirects ? 2 : 0;
    if (mode == m_redirectMode)
        return;
    m_redirectMode = mode;
    emit followRedirectsChanged();
}

bool NetworkRequest::ignoreSslErrors() const
{
    return m_ignoreSslErrors;
}

void NetworkRequest::setIgnoreSslErrors(bool ignoreSslErrors)
{
    if (ignoreSslErrors == m_ignoreSslErrors)
        return;
    m_ignoreSslErrors = ignoreSslErrors;
    emit ignoreSslErrorsChanged();
}

QString NetworkRequest::uploadPrefix() const
{
    return m_uploadPrefix;
}

void NetworkRequest::setUploadPrefix(const QString &uploadPrefix)
{
    if (uploadPrefix == m_uploadPrefix)
        return;
    m_uploadPrefix = uploadPrefix;
    emit uploadPrefixChanged();
}

NetworkRequest::ReadyState NetworkRequest::readyState() const
{
    return m_readyState;
}

void NetworkRequest::setReadyState(ReadyState readyState)
{
    if (readyState == m_readyState)
        return;
    m_readyState = readyState;
    emit readyStateChanged();
}

int NetworkRequest::status() const
{
    return m_status;
}

QString NetworkRequest::statusText() const
{
    return m_statusText;
}

int NetworkRequest::errorCode() const
{
    return m_errorCode;
}

void NetworkRequest::setErrorCode(int errorCode)
{
    if (errorCode == m_errorCode)
        return;
    m_errorCode = errorCode;
    emit errorCodeChanged();
}

QString NetworkRequest::errorText() const
{
    return m_errorText;
}

void NetworkRequest::setErrorText(const QString &errorText)
{
    if (errorText == m_errorText)
        return;
    m_errorText = errorText;
    emit errorTextChanged();
}

QVariant NetworkRequest::requestBody() const
{
    return m_requestBody;
}

QString NetworkRequest::responseType() const
{
    return m_responseType;
}

void NetworkRequest::setResponseType(const QString &responseType)
{
    if (responseType == m_responseType)
        return;
    m_responseType = responseType;
    emit responseTypeChanged();
}

QVariantMap NetworkRequest::responseHeaders() const
{
    return m_responseHeaders;
}

QString NetworkRequest::responsePath() const
{
    return m_responsePath;
}

void NetworkRequest::setResponsePath(const QString &responsePath)
{
    if (m_responseFile) {
        setErrorText(QStringLiteral("Error: responsePath cannot be set when file is open"));
        return;
    }
    if (responsePath == m_responsePath)
        return;
    m_responsePath = responsePath;
    emit responsePathChanged();
}

QString NetworkRequest::responseText() const
{
    return QString::fromUtf8(m_responseData);
}

QVariant NetworkRequest::response() const
{
    return m_response;
}

double NetworkRequest::progress() const
{
    return m_progress;
}

void NetworkRequest::setProgress(double progress)
{
    if (qFuzzyCompare(1.0 + progress, 1.0 + m_progress))
        return;
    m_progress = progress;
    emit progressChanged();
}

QString NetworkRequest::user() const
{
    return m_user;
}

void NetworkRequest::setUser(const QString &user)
{
    if (user == m_user)
        return;
    m_user = user;
    emit userChanged();
}

QString NetworkRequest::password() const
{
    return m_password;
}

void NetworkRequest::setPassword(const QString &password)
{
    if (password == m_password)
        return;
    m_password = password;
    emit passwordChanged();
}

QString NetworkRequest::realm() const
{
    return m_realm;
}

void NetworkRequest::setRealm(const QString &realm)
{
    if (realm == m_realm)
        return;
    m_realm = realm;
    emit realmChanged();
}

QVariant NetworkRequest::timeoutValue() const
{
    return m_timeout;
}

void NetworkRequest::setTimeout(const QVariant &timeout)
{
    QVariant value = timeout;
    if (value.userType() == qMetaTypeId<QJSValue>())
        value = value.value<QJSValue>().toVariant();
    if (value == m_timeout && value.userType() == m_timeout.userType())
        return;
    m_timeout = value;
    emit timeoutChanged();
}

// Operations

void NetworkRequest::open(const QString &method, const QUrl &url, bool async)
{
    setMethod(method);
    if (m_readyState == ReadyStateSending || m_readyState == ReadyStateProcessing) {
        setErrorText(QStringLiteral("UNEXPECTED"));
        return;
    }
    m_async = async;
    setUrl(url);
}

void NetworkRequest::open(const QString &method, const QUrl &url)
{
    open(method, url, true);
}

void NetworkRequest::send()
{
    send(QVariant());
}

void NetworkRequest::send(const QVariant &body)
{
    if (m_readyState != ReadyStateInitialized && m_readyState != ReadyStateComplete) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "readyState error" << m_readyState << m_method << m_url;
        setErrorText(QStringLiteral("UNEXPECTED"));
        return;
    }
    send(m_url, body);
}

void NetworkRequest::send(const QUrl &url, const QVariant &body)
{
    m_aborted = false;
    QVariant value = body;
    if (value.userType() != m_requestBody.userType() || value != m_requestBody) {
        m_requestBody = value;
        emit requestBodyChanged();
    }

    QVariantMap headerMap;
    NetworkRequestHeaders *set = headers();
    const QStringList keys = set->keys();
    for (const QString &key : keys)
        headerMap.insert(key, set->value(key));
    if (!headerMap.contains(kUserAgent)) {
        const QString userAgent = frameworkProperty("Orvane.Loomkit.Networking.defaultUserAgent").toString();
        if (!userAgent.isEmpty())
            headerMap.insert(kUserAgent, userAgent);
    }

    if (body.isNull()) {
        send(url, m_method, QByteArray(), headerMap);
    } else if (body.userType() == QMetaType::QString) {
        send(url, m_method, body.toString().toUtf8(), headerMap);
    } else if (body.userType() == qMetaTypeId<QJSValue>()) {
        send(url, body.value<QJSValue>(), headerMap);
    } else if (body.userType() == QMetaType::QVariantMap || body.canConvert<QVariantMap>()) {
        send(url, body.toMap(), headerMap);
    } else {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "TODO";
        qCWarning(lcNetwork) << Q_FUNC_INFO << "body:" << body;
    }
}

void NetworkRequest::send(const QUrl &url, const QJSValue &body, const QVariantMap &headers)
{
    if (!body.isObject()) {
        qCDebug(lcNetwork) << Q_FUNC_INFO << "UNEXPECTED" << body.toString();
        return;
    }
    QVariantMap form;
    QJSValueIterator it(body);
    while (it.hasNext()) {
        it.next();
        form.insert(it.name(), it.value().toVariant());
    }
    send(url, form, headers);
}

void NetworkRequest::send(const QUrl &url, const QVariantMap &form, const QVariantMap &headers)
{
    if (!m_uploadPrefix.isEmpty()) {
        for (auto it = form.cbegin(); it != form.cend(); ++it) {
            if (it.value().toString().startsWith(m_uploadPrefix)) {
                sendFormData(url, form, headers);
                return;
            }
        }
    }

    const RequestQuery query(url, form);
    const QByteArray encoded = query.encodedQuery().toUtf8();
    if (isMethod(m_method, "POST"))
        send(query.url(), QStringLiteral("POST"), encoded, headers);
    else if (isMethod(m_method, "PUT"))
        send(query.url(), QStringLiteral("PUT"), encoded, headers);
    else if (isMethod(m_method, "DELETE"))
        send(query.url(), QStringLiteral("DELETE"), encoded, headers);
    else if (isMethod(m_method, "HEAD"))
        send(query.urlWithQuery(), QStringLiteral("HEAD"), QByteArray(), headers);
    else
        send(query.urlWithQuery(), QStringLiteral("GET"), QByteArray(), headers);
}

void NetworkRequest::sendFormData(const QUrl &url, const QVariantMap &form, const QVariantMap &headers)
{
    disposeFormData();

    const QString boundary = QStringLiteral("---------------------------")
                             + QString::number(QDateTime::currentMSecsSinceEpoch());
    const QByteArray dashBoundary = "--" + boundary.toLatin1();
    m_formData = new NetworkFormData(this);
    connect(m_formData, &NetworkFormData::readProgress, this, &NetworkRequest::onFormDataProgress);

    const auto isFile = [this](const QVariant &value) {
        return !m_uploadPrefix.isEmpty() && value.toString().startsWith(m_uploadPrefix);
    };

    for (auto it = form.cbegin(); it != form.cend(); ++it) {
        if (isFile(it.value()))
            continue;
        m_formData->appendData(dashBoundary + "\r\n"
                               "Content-Disposition: form-data; name=\"" + it.key().toUtf8() + "\"\r\n"
                               "\r\n"
                               + it.value().toString().toUtf8() + "\r\n");
    }

    static const QMimeDatabase mimeDatabase;
    for (auto it = form.cbegin(); it != form.cend(); ++it) {
        if (!isFile(it.value()))
            continue;
        const QStringList parameters = it.value().toString().mid(m_uploadPrefix.size()).split(QLatin1Char(';'));
        const QString path = parameters.first();
        QString fileName = QFileInfo(path).fileName();
        const QMimeType mimeType = mimeDatabase.mimeTypeForFile(path);
        QString contentType = mimeType.isValid() ? mimeType.name() : QStringLiteral("application/octet-stream");
        qint64 offset = 0;
        qint64 size = -1;
        for (const QString &parameter : parameters) {
            if (parameter.startsWith(QLatin1String("type=")))
                contentType = parameter.mid(5);
            else if (parameter.startsWith(QLatin1String("filename=")))
                fileName = parameter.mid(9);
            else if (parameter.startsWith(QLatin1String("offset=")))
                offset = parameter.midRef(7).toLongLong(nullptr, 10);
            else if (parameter.startsWith(QLatin1String("size=")))
                size = parameter.midRef(5).toLongLong(nullptr, 10);
            else
                qCDebug(lcNetwork) << Q_FUNC_INFO << "Skipping Parameter" << parameter;
        }

        m_formData->appendData(dashBoundary + "\r\n"
                               "Content-Disposition: form-data; name=\"" + it.key().toUtf8()
                               + "\"; filename=\"" + fileName.toUtf8() + "\"\r\n"
                               "Content-Type: " + contentType.toUtf8() + "\r\n"
                               "\r\n");
        if (!m_formData->appendPath(path, offset, size)) {
            NetworkFormData *formData = m_formData;
            m_formData = nullptr;
            disconnect(formData, nullptr, this, nullptr);
            formData->deleteLater();
            formData->clear();
            resetForSend();
            setErrorCode(-1);
            setErrorText(QStringLiteral("Cannot open %1").arg(path));
            emit error();
            setReadyState(ReadyStateComplete);
            return;
        }
        m_formData->appendData(QByteArrayLiteral("\r\n"));
    }
    m_formData->appendData(dashBoundary + "--\r\n");

    QVariantMap headerMap = headers;
    headerMap.insert(kContentType, QStringLiteral("multipart/form-data; boundary=") + boundary);
    const QString verb = isMethod(m_method, "PUT") ? QStringLiteral("PUT") : QStringLiteral("POST");
    send(url, verb, QVariant::fromValue(m_formData), headerMap);
}

void NetworkRequest::resetForSend()
{
    m_startTime = QDateTime::currentDateTime();
    m_estimatedFinishTime.clear();
    m_percentComplete.clear();
    m_responseHeaders.clear();
    m_status = 0;
    m_statusText.clear();
    m_aborted = false;
    m_replyAttributes.clear();
    m_responseFileFailed = false;
    emit responseHeadersChanged();
    emit progressChanged();

    m_bytesReceived = 0;
    m_contentLength = 0;
    setProgress(0.0);

    m_responseData.clear();
    m_response.clear();
    emit responseChanged();
    emit responseTextChanged();

    setErrorCode(0);
    setErrorText(QString());
    setReadyState(ReadyStateSending);
}

void NetworkRequest::send(const QUrl &url, const QString &method, const QVariant &body, const QVariantMap &headers)
{
    resetForSend();
    buildRequest(url, method, headers);

    if (m_currentReply) {
        QNetworkReply *old = m_currentReply;
        m_currentReply = nullptr;
        disconnect(old, nullptr, this, nullptr);
        delete old;
    }

    QNetworkAccessManager *manager = m_networkAccessManager;
    QNetworkReply *reply = nullptr;
    if (isMethod(method, "POST"))
        reply = createNetworkReplyPOST(manager, *m_currentRequest, body);
    else if (isMethod(method, "PUT"))
        reply = createNetworkReplyPUT(manager, *m_currentRequest, body);
    else if (isMethod(method, "HEAD"))
        reply = createNetworkReplyHEAD(manager, *m_currentRequest);
    else if (isMethod(method, "DELETE"))
        reply = createNetworkReplyDELETE(manager, *m_currentRequest, body);
    else
        reply = createNetworkReplyGET(manager, *m_currentRequest);
    if (!reply) {
        qCDebug(lcNetwork) << Q_FUNC_INFO << "No reply" << method << url;
        return;
    }
    m_currentReply = reply;
    reply->setReadBufferSize(kReadBufferSize);

    connect(reply, &QNetworkReply::downloadProgress, this, &NetworkRequest::onDownloadProgress);
    connect(reply, &QNetworkReply::errorOccurred, this, &NetworkRequest::onError);
    connect(reply, &QNetworkReply::metaDataChanged, this, &NetworkRequest::onMetaDataChanged);
    connect(reply, &QNetworkReply::readyRead, this, &NetworkRequest::onReadyRead);
    connect(reply, &QNetworkReply::redirected, this, &NetworkRequest::onRedirected);
    connect(reply, &QNetworkReply::redirectAllowed, this, &NetworkRequest::onRedirectAllowed);
    connect(reply, &QNetworkReply::uploadProgress, this, &NetworkRequest::onUploadProgress);
    connect(reply, &QNetworkReply::encrypted, this, qOverload<>(&NetworkRequest::onEncrypted));
    connect(reply, &QNetworkReply::preSharedKeyAuthenticationRequired,
            this, &NetworkRequest::onPreSharedKeyAuthenticationRequired);
    connect(reply, qOverload<const QList<QSslError> &>(&QNetworkReply::sslErrors),
            this, qOverload<const QList<QSslError> &>(&NetworkRequest::onSslErrors));
    // Also the manager's finished() comes; this one only logs.
    connect(reply, &QNetworkReply::finished, this, qOverload<>(&NetworkRequest::onFinished));

    m_configuration = QNetworkConfiguration();
    m_configuration = m_networking->queryDefaultConfiguration();

    armTimer();
}

void NetworkRequest::buildRequest(const QUrl &url, const QString &method, const QVariantMap &headers)
{
    delete m_currentRequest;
    m_currentRequest = new QNetworkRequest(url);
    // Redirects are followed here, not by the manager, unless a script
    // turns the manager's own following on with setAttribute.
    m_currentRequest->setAttribute(QNetworkRequest::FollowRedirectsAttribute, m_redirectMode == 1);
    for (auto it = m_attributes.cbegin(); it != m_attributes.cend(); ++it)
        m_currentRequest->setAttribute(QNetworkRequest::Attribute(it.key()), it.value());

    QVariantMap headerMap = headers;
    if (isMethod(method, "POST") && !headerMap.contains(kContentType))
        headerMap.insert(kContentType, QStringLiteral("application/x-www-form-urlencoded"));
    for (auto it = headerMap.cbegin(); it != headerMap.cend(); ++it) {
        if (it.key() == kCookie)
            continue;
        const QByteArray name = it.key().toUtf8();
        const QByteArray value = it.value().toString().toUtf8();
        // A line break would end the header and start another one.
        if (name.isEmpty() || hasLineBreak(name) || hasLineBreak(value)) {
            qCWarning(lcNetwork) << Q_FUNC_INFO << "Skipping header" << it.key();
            continue;
        }
        m_currentRequest->setRawHeader(name, value);
    }
    setCookies(m_networkAccessManager, url, headerMap);
}

void NetworkRequest::setCookies(QNetworkAccessManager *manager, const QUrl &url, const QVariant &headers)
{
    if (!manager || !manager->cookieJar())
        return;
    const QVariant value = headers.toMap().value(kCookie);
    if (value.userType() != QMetaType::QString)
        return;
    const QList<QNetworkCookie> parsed = QNetworkCookie::parseCookies(value.toString().toUtf8());
    if (parsed.isEmpty())
        return;
    QNetworkCookieJar *jar = manager->cookieJar();
    QList<QNetworkCookie> cookies = jar->cookiesForUrl(url);
    for (const QNetworkCookie &cookie : parsed) {
        bool found = false;
        for (QNetworkCookie &existing : cookies) {
            if (existing.name() == cookie.name()) {
                qCDebug(lcNetwork) << Q_FUNC_INFO << "found: " << cookie.name();
                existing.setValue(cookie.value());
                found = true;
                break;
            }
        }
        if (!found) {
            qCDebug(lcNetwork) << Q_FUNC_INFO << "new: " << cookie.name();
            cookies.append(cookie);
        }
    }
    jar->setCookiesFromUrl(cookies, url);
}

QNetworkReply *NetworkRequest::createNetworkReplyGET(QNetworkAccessManager *manager, const QNetworkRequest &request)
{
    return manager ? manager->get(request) : nullptr;
}

QNetworkReply *NetworkRequest::createNetworkReplyHEAD(QNetworkAccessManager *manager, const QNetworkRequest &request)
{
    return manager ? manager->head(request) : nullptr;
}

QNetworkReply *NetworkRequest::createNetworkReplyPOST(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                      const QVariant &body)
{
    if (!manager)
        return nullptr;
    if (body.isNull())
        return manager->post(request, QByteArray());
    if (body.userType() == QMetaType::QByteArray)
        return manager->post(request, body.toByteArray());
    if (auto *formData = body.value<NetworkFormData *>())
        return manager->post(request, formData);
    qCDebug(lcNetwork) << Q_FUNC_INFO << "UNEXPECTED" << body;
    return nullptr;
}

QNetworkReply *NetworkRequest::createNetworkReplyPUT(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                     const QVariant &body)
{
    if (!manager)
        return nullptr;
    if (body.isNull())
        return manager->put(request, QByteArray());
    if (body.userType() == QMetaType::QByteArray)
        return manager->put(request, body.toByteArray());
    if (auto *formData = body.value<NetworkFormData *>())
        return manager->put(request, formData);
    qCDebug(lcNetwork) << Q_FUNC_INFO << "UNEXPECTED" << body;
    return nullptr;
}

QNetworkReply *NetworkRequest::createNetworkReplyDELETE(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                        const QVariant &body)
{
    if (!manager)
        return nullptr;
    if (body.isNull())
        return manager->deleteResource(request);
    if (body.userType() == QMetaType::QByteArray)
        return manager->sendCustomRequest(request, QByteArrayLiteral("DELETE"), body.toByteArray());
    if (auto *formData = body.value<NetworkFormData *>())
        return manager->sendCustomRequest(request, QByteArrayLiteral("DELETE"), formData);
    qCDebug(lcNetwork) << Q_FUNC_INFO << "UNEXPECTED" << body;
    return nullptr;
}

void NetworkRequest::armTimer()
{
    deleteTimer();
    int milliseconds = 0;
    if (m_timeout.isValid() && !m_timeout.isNull()) {
        milliseconds = m_timeout.toInt();
    } else {
        const QVariant framework = frameworkProperty("Orvane.Loomkit.Networking.timeout");
        if (!framework.isValid() || framework.isNull())
            return;
        milliseconds = framework.toInt();
    }
    if (milliseconds < 1)
        return;
    m_timeoutTimer = new QTimer();
    m_timeoutTimer->setSingleShot(true);
    connect(m_timeoutTimer, &QTimer::timeout, this, &NetworkRequest::onTimeout);
    m_timeoutTimer->start(milliseconds);
}

void NetworkRequest::deleteTimer()
{
    if (!m_timeoutTimer)
        return;
    QTimer *timer = m_timeoutTimer;
    m_timeoutTimer = nullptr;
    timer->stop();
    // The timer may be the one whose signal is running now.
    timer->deleteLater();
}

void NetworkRequest::disposeFormData()
{
    if (!m_formData)
        return;
    NetworkFormData *formData = m_formData;
    m_formData = nullptr;
    disconnect(formData, &NetworkFormData::readProgress, this, &NetworkRequest::onFormDataProgress);
    formData->clear();
    formData->deleteLater();
}

void NetworkRequest::abortReply()
{
    m_aborted = true;
    if (m_formData)
        m_formData->setAborted(true);
    m_currentReply->abort();
}

void NetworkRequest::abort()
{
    if (!m_currentReply || m_aborted)
        return;
    deleteTimer();
    abortReply();
}

void NetworkRequest::setAttribute(Attribute attribute, const QVariant &value)
{
    QVariant stored = value;
    if (stored.userType() == qMetaTypeId<QJSValue>())
        stored = stored.value<QJSValue>().toVariant();
    if (stored.isNull())
        m_attributes.remove(attribute);
    else
        m_attributes.insert(attribute, stored);
}

QVariant NetworkRequest::attribute(Attribute attribute, bool checkResponse) const
{
    if (checkResponse)
        return m_replyAttributes.value(attribute);
    return m_currentRequest ? m_currentRequest->attribute(QNetworkRequest::Attribute(attribute)) : QVariant();
}

QVariant NetworkRequest::attribute(Attribute attribute) const
{
    return NetworkRequest::attribute(attribute, false);
}

// Receiving

bool NetworkRequest::isRedirectStatus(int status)
{
    switch (status) {
    case 301:
    case 302:
    case 303:
    case 305:
    case 307:
    case 308:
        return true;
    default:
        return false;
    }
}

void NetworkRequest::rebuildResponseHeaders(QNetworkReply *reply)
{
    m_responseHeaders.clear();
    const QList<QNetworkReply::RawHeaderPair> pairs = reply->rawHeaderPairs();
    for (const auto &pair : pairs)
        m_responseHeaders.insert(QString::fromUtf8(pair.first), QString::fromUtf8(pair.second));
    emit responseHeadersChanged();
}

void NetworkRequest::updateStatus(QNetworkReply *reply)
{
    const QVariant statusAttribute = reply->attribute(QNetworkRequest::HttpStatusCodeAttribute);
    m_status = statusAttribute.toInt();
    // No status line, no status text: a " " alone would tell nothing.
    m_statusText = statusAttribute.isValid()
        ? statusAttribute.toString() + QLatin1Char(' ')
              + reply->attribute(QNetworkRequest::HttpReasonPhraseAttribute).toString()
        : QString();
}

void NetworkRequest::onReadyRead()
{
    auto *reply = qobject_cast<QNetworkReply *>(sender());
    if (!reply || reply != m_currentReply)
        return;
    m_status = reply->attribute(QNetworkRequest::HttpStatusCodeAttribute).toInt();
    if (m_aborted)
        return;
    if (m_redirectMode == 2 && isRedirectStatus(m_status))
        return;
    if (m_readyState != ReadyStateProcessing) {
        updateStatus(reply);
        m_replyAttributes.clear();
        rebuildResponseHeaders(reply);
        setReadyState(ReadyStateProcessing);
    }
    m_contentLength = reply->header(QNetworkRequest::ContentLengthHeader).toLongLong();
    appendResponseData(reply->readAll());
}

QString NetworkRequest::resolvedResponsePath() const
{
    return FileUtility::resolvedPath(m_responsePath, true);
}

bool NetworkRequest::openResponseFile()
{
    const QString path = resolvedResponsePath();
    if (QFile::exists(path))
        QFile::remove(path);
    auto *file = new QFile(path, this);
    if (!file->open(QIODevice::ReadWrite | QIODevice::Unbuffered)) {
        qCWarning(lcNetwork) << Q_FUNC_INFO << "Cannot open" << path << file->errorString();
        delete file;
        m_responseFileFailed = true;
        setErrorText(QStringLiteral("Cannot open ") + path);
        return false;
    }
    m_responseFile = file;
    return true;
}

void NetworkRequest::appendResponseData(const QByteArray &chunk)
{
    if (chunk.isEmpty())
        return;
    if (!m_responseFile && !m_responseFileFailed && !m_responsePath.isEmpty())
        openResponseFile();

    if (m_responseFile) {
        if (!writeInSlices(m_responseFile, chunk)) {
            // A full disk must not pass for a complete download.
            qCWarning(lcNetwork) << Q_FUNC_INFO << "Cannot write" << m_responseFile->fileName()
                                 << m_responseFile->errorString();
            if (m_currentReply && !m_aborted) {
                deleteTimer();
                abortReply();
            }
            return;
        }
    } else {
        m_responseData.append(chunk);
    }
    m_bytesReceived += chunk.size();
    emit responseTextChanged();

    const qint64 elapsed = m_startTime.msecsTo(QDateTime::currentDateTime());
    if (elapsed >= 10 && m_contentLength > 0) {
        m_estimatedFinishTime = m_startTime.addMSecs(m_contentLength * elapsed / m_bytesReceived);
        m_percentComplete = double(m_bytesReceived) * 100.0 / double(m_contentLength);
    }
    if (m_contentLength >= 1)
        setProgress(0.5 + 0.5 * double(m_bytesReceived) / double(m_contentLength));
}

QVariant NetworkRequest::decodeResponse(const QByteArray &data, const QString &responseType)
{
    if (responseType.compare(QLatin1String("json"), Qt::CaseInsensitive) == 0)
        return JsonUtility::toVariant(data, containsNullWord(data));
    if (responseType.compare(QLatin1String("base64"), Qt::CaseInsensitive) == 0)
        return QString::fromLatin1(data.toBase64());
    if (responseType.compare(QLatin1String("binary"), Qt::CaseInsensitive) == 0)
        return data;
    if (responseType.isEmpty() || responseType.compare(QLatin1String("text"), Qt::CaseInsensitive) == 0)
        return QString::fromUtf8(data);
    return QVariant();
}

void NetworkRequest::onFinished(QNetworkReply *reply)
{
    if (!reply || reply != m_currentReply)
        return;

    m_configuration = QNetworkConfiguration();
    if (reply->error() == QNetworkReply::NoError)
        deleteTimer();

    rebuildResponseHeaders(reply);
    updateStatus(reply);

    if (m_redirectMode == 2 && isRedirectStatus(m_status)) {
        QString target = reply->attribute(QNetworkRequest::RedirectionTargetAttribute).toUrl().toString();
        // The manager gives no target for 305; its Location says the same.
        if (target.isEmpty())
            target = QString::fromUtf8(reply->rawHeader("Location"));
        // Without a Location there is nowhere to go: resolving an empty
        // reference would give this same URL again, for ever.
        const QUrl redirectUrl = target.isEmpty() ? QUrl()
                                                  : reply->url().resolved(QUrl(target, QUrl::TolerantMode));
        qCDebug(lcNetwork) << Q_FUNC_INFO << "url: " << reply->url();
        qCDebug(lcNetwork) << Q_FUNC_INFO << "redirectUrl: " << redirectUrl;
        if (!redirectUrl.isEmpty()) {
            reply->readAll();
            disconnect(reply, nullptr, this, nullptr);
            reply->deleteLater();
            m_currentReply = nullptr;
            m_readyState = ReadyStateInitialized;
            disposeFormData();
            if (isMethod(m_method, "POST") || isMethod(m_method, "PUT"))
                send(redirectUrl, m_requestBody);
            else
                send(redirectUrl, QVariant());
            return;
        }
    }

    m_contentLength = reply->header(QNetworkRequest::ContentLengthHeader).toLongLong();
    setProgress(1.0);

    if (!m_aborted)
        appendResponseData(reply->readAll());

    setErrorCode(reply->error());
    if (reply->error() != QNetworkReply::NoError)
        setErrorText(reply->errorString());
    else
        setErrorText(QString());

    for (int i = 0; i <= 24; ++i) {
        if (i == 14 || i == 15 || i == 16)
            continue;
        const QVariant value = reply->attribute(QNetworkRequest::Attribute(i));
        if (value.isValid())
            m_replyAttributes.insert(i, value);
    }

    disconnect(reply, nullptr, this, nullptr);
    reply->deleteLater();
    m_currentReply = nullptr;
    delete m_currentRequest;
    m_currentRequest = nullptr;
    deleteTimer();
    disposeFormData();

    if (m_responseFile) {
        QFile *file = m_responseFile;
        m_responseFile = nullptr;
        file->flush();
        file->close();
        file->deleteLater();
        if (m_aborted)
            QFile::remove(resolvedResponsePath());
    } else {
        m_response.clear();
        if (!m_aborted)
            m_response = decodeResponse(m_responseData, m_responseType);
        emit responseChanged();
    }

    if (m_errorCode != 0)
        emit error();
    setReadyState(ReadyStateComplete);
}

// Authentication and TLS

void NetworkRequest::onAuthenticationRequired(QNetworkReply *reply, QAuthenticator *authenticator)
{
    if (!reply || reply != m_currentReply || !authenticator)
        return;
    if (!authenticator->user().isEmpty() || !authenticator->password().isEmpty()) {
        // The manager asks again only when what it was given failed: give
        // nothing, so that the reply fails instead of asking for ever.
        qCDebug(lcNetwork) << Q_FUNC_INFO << "Clearing invalid authenticator";
        QString user = authenticator->user();
        QString password = authenticator->password();
        user.clear();
        password.clear();
        return;
    }
    if (!m_user.isEmpty())
        authenticator->setUser(m_user);
    if (!m_password.isEmpty())
        authenticator->setPassword(m_password);
    if (!m_realm.isEmpty())
        authenticator->setRealm(m_realm);
}

void NetworkRequest::onProxyAuthenticationRequired(const QNetworkProxy &proxy, QAuthenticator *authenticator)
{
    Q_UNUSED(authenticator)
    qCDebug(lcNetwork) << Q_FUNC_INFO << proxy;
}

void NetworkRequest::onEncrypted(QNetworkReply *reply)
{
    Q_UNUSED(reply)
}

QVariantList NetworkRequest::sslErrorsToList(const QList<QSslError> &errors)
{
    QVariantList list;
    for (const QSslError &sslError : errors) {
        QVariantMap map;
        map.insert(QStringLiteral("certificate"), certificateToMap(sslError.certificate()));
        map.insert(QStringLiteral("error"), int(sslError.error()));
        map.insert(QStringLiteral("errorString"), sslError.errorString());
        list.append(map);
    }
    return list;
}

void NetworkRequest::onSslErrors(QNetworkReply *reply, const QList<QSslError> &errors)
{
    if (!reply || reply != m_currentReply)
        return;
    const QVariantList list = sslErrorsToList(errors);
    if (m_ignoreSslErrors) {
        reply->ignoreSslErrors();
        emit sslErrorsIgnored(list);
    } else {
        emit sslErrors(list);
    }
}

// Progress and diagnostics

void NetworkRequest::onFormDataProgress(double progress)
{
    setProgress(0.5 * progress);
}

void NetworkRequest::onDownloadProgress(qint64 bytesReceived, qint64 bytesTotal)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << bytesReceived << bytesTotal;
}

void NetworkRequest::onUploadProgress(qint64 bytesSent, qint64 bytesTotal)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << bytesSent << bytesTotal;
}

void NetworkRequest::onError(QNetworkReply::NetworkError code)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << code;
}

void NetworkRequest::onFinished()
{
    qCDebug(lcNetwork) << Q_FUNC_INFO;
}

void NetworkRequest::onMetaDataChanged()
{
    qCDebug(lcNetwork) << Q_FUNC_INFO;
}

void NetworkRequest::onRedirectAllowed()
{
    qCDebug(lcNetwork) << Q_FUNC_INFO;
}

void NetworkRequest::onRedirected(const QUrl &url)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << url;
}

void NetworkRequest::onEncrypted()
{
    qCDebug(lcNetwork) << Q_FUNC_INFO;
}

void NetworkRequest::onPreSharedKeyAuthenticationRequired(QSslPreSharedKeyAuthenticator *authenticator)
{
    Q_UNUSED(authenticator)
    qCDebug(lcNetwork) << Q_FUNC_INFO;
}

void NetworkRequest::onSslErrors(const QList<QSslError> &errors)
{
    qCDebug(lcNetwork) << Q_FUNC_INFO << errors;
}

// Interruptions

void NetworkRequest::onTimeout()
{
    deleteTimer();
    if (!m_currentReply)
        return;
    if (!m_aborted)
        abortReply();
    emit timeout();
}

void NetworkRequest::onNetworkAccessibleChanged(QNetworkAccessManager::NetworkAccessibility accessible)
{
    if (accessible != QNetworkAccessManager::NotAccessible || !m_currentReply)
        return;
    if (!m_aborted) {
        deleteTimer();
        abortReply();
    }
    setErrorText(QStringLiteral("NETWORK CLOSED"));
    setErrorCode(2);
    setReadyState(ReadyStateComplete);
}

void NetworkRequest::onDefaultConfigurationChanged()
{
    if (!m_currentReply || !m_configuration.isValid())
        return;
    QQmlEngine *engine = qmlEngine(this);
    if (!engine || !engine->networkAccessManager())
        return;
    if (m_networking->queryDefaultConfiguration() != m_configuration)
        abort();
}

void NetworkRequest::onAccessCacheClearing()
{
    abort();
}
