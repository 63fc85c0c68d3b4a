#ifndef NETWORKREQUEST_H
#define NETWORKREQUEST_H

#include <QDateTime>
#include <QJSValue>
#include <QMap>
#include <QNetworkAccessManager>
#include <QNetworkConfiguration>
#include <QNetworkReply>
#include <QObject>
#include <QPointer>
#include <QQmlParserStatus>
#include <QSslError>
#include <QUrl>
#include <QVariant>
#include <QVariantMap>

class NetworkFormData;
class NetworkRequestHeaders;
class NetworkingPrivateInvoker;
class QAuthenticator;
class QFile;
class QNetworkRequest;
class QSslPreSharedKeyAuthenticator;
class QTimer;

QT_WARNING_PUSH
QT_WARNING_DISABLE_DEPRECATED

// One HTTP exchange at a time, shaped like XMLHttpRequest, over the QML
// engine's network access manager. The object is reused for the next
// exchange; a failed one keeps all a retry needs.
class NetworkRequest : public QObject, public QQmlParserStatus
{
    Q_OBJECT
    Q_INTERFACES(QQmlParserStatus)

    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY urlChanged)
    Q_PROPERTY(QString method READ method WRITE setMethod NOTIFY methodChanged)
    Q_PROPERTY(NetworkRequestHeaders *headers READ headers CONSTANT)
    Q_PROPERTY(bool followRedirects READ followRedirects WRITE setFollowRedirects NOTIFY followRedirectsChanged)
    Q_PROPERTY(bool ignoreSslErrors READ ignoreSslErrors WRITE setIgnoreSslErrors NOTIFY ignoreSslErrorsChanged)
    Q_PROPERTY(QString uploadPrefix READ uploadPrefix WRITE setUploadPrefix NOTIFY uploadPrefixChanged)
    Q_PROPERTY(ReadyState readyState READ readyState WRITE setReadyState NOTIFY readyStateChanged)
    Q_PROPERTY(int status READ status NOTIFY readyStateChanged)
    Q_PROPERTY(QString statusText READ statusText NOTIFY readyStateChanged)
    Q_PROPERTY(int errorCode READ errorCode NOTIFY errorCodeChanged)
    Q_PROPERTY(QString errorText READ errorText NOTIFY errorTextChanged)
    Q_PROPERTY(QVariant requestBody READ requestBody NOTIFY requestBodyChanged)
    Q_PROPERTY(QString responseType READ responseType WRITE setResponseType NOTIFY responseTypeChanged)
    Q_PROPERTY(QVariantMap responseHeaders READ responseHeaders NOTIFY responseHeadersChanged)
    Q_PROPERTY(QString responsePath READ responsePath WRITE setResponsePath NOTIFY responsePathChanged)
    Q_PROPERTY(QString responseText READ responseText NOTIFY responseTextChanged)
    Q_PROPERTY(QVariant response READ response NOTIFY responseChanged)
    Q_PROPERTY(double progress READ progress NOTIFY progressChanged)
    Q_PROPERTY(QString user READ user WRITE setUser NOTIFY userChanged)
    Q_PROPERTY(QString password READ password WRITE setPassword NOTIFY passwordChanged)
    Q_PROPERTY(QString realm READ realm WRITE setRealm NOTIFY realmChanged)
    Q_PROPERTY(QVariant timeout READ timeoutValue WRITE setTimeout NOTIFY timeoutChanged)

public:
    enum ReadyState {
        ReadyStateUninitialized = 0,
        UNSENT = 0,
        ReadyStateInitialized = 1,
        OPENED = 1,
        ReadyStateSending = 2,
        HEADERS_RECEIVED = 2,
        ReadyStateProcessing = 3,
        LOADING = 3,
        ReadyStateComplete = 4,
        DONE = 4
    };
    Q_ENUM(ReadyState)

    enum StatusCode {
        StatusCodeContinue = 100,
        StatusCodeSwitchingProtocols = 101,
        StatusCodeOK = 200,
        StatusCodeCreated = 201,
        StatusCodeAccepted = 202,
        StatusCodeNonAuthoritativeInformation = 203,
        StatusCodeNoContent = 204,
        StatusCodeResetContent = 205,
        StatusCodePartialContent = 206,
        StatusCodeMultipleChoices = 300,
        StatusCodeMovedPermanently = 301,
        StatusCodeFound = 302,
        StatusCodeSeeOther = 303,
        StatusCodeNotModified = 304,
        StatusCodeUseProxy = 305,
        StatusCodeTemporaryRedirect = 307,
        StatusCodeBadRequest = 400,
        StatusCodeUnauthorized = 401,
        StatusCodePaymentRequired = 402,
        StatusCodeForbidden = 403,
        StatusCodeNotFound = 404,
        StatusCodeMethodNotAllowed = 405,
        StatusCodeNotAcceptable = 406,
        StatusCodeProxyAuthenticationRequired = 407,
        StatusCodeRequestTimeout = 408,
        StatusCodeConflict = 409,
        StatusCodeGone = 410,
        StatusCodeLengthRequired = 411,
        StatusCodePreconditionFailed = 412,
        StatusCodeRequestEntityTooLarge = 413,
        StatusCodeRequestURITooLong = 414,
        StatusCodeUnsupportedMediaType = 415,
        StatusCodeRequestedRangeNotSuitable = 416,
        StatusCodeExpectationFailed = 417,
        StatusCodeInternalServerError = 500,
        StatusCodeNotImplemented = 501,
        StatusCodeBadGateway = 502,
        StatusCodeServiceUnavailable = 503,
        StatusCodeGatewayTimeout = 504,
        StatusCodeHTTPVersionNotSupported = 505
    };
    Q_ENUM(StatusCode)

    enum Attribute {
        Unknown = -1,
        HttpStatusCodeAttribute = 0,
        HttpReasonPhraseAttribute = 1,
        RedirectionTargetAttribute = 2,
        ConnectionEncryptedAttribute = 3,
        CacheLoadControlAttribute = 4,
        CacheSaveControlAttribute = 5,
        SourceIsFromCacheAttribute = 6,
        DoNotBufferUploadDataAttribute = 7,
        HttpPipeliningAllowedAttribute = 8,
        HttpPipeliningWasUsedAttribute = 9,
        CustomVerbAttribute = 10,
        CookieLoadControlAttribute = 11,
        AuthenticationReuseAttribute = 12,
        CookieSaveControlAttribute = 13,
        BackgroundRequestAttribute = 17,
        SpdyAllowedAttribute = 18,
        SpdyWasUsedAttribute = 19,
        EmitAllUploadProgressSignalsAttribute = 20,
        FollowRedirectsAttribute = 21,
        HTTP2AllowedAttribute = 22,
        HTTP2WasUsedAttribute = 23,
        OriginalContentLengthAttribute = 24,
        RedirectPolicyAttribute = 25,
        Http2DirectAttribute = 26,
        User = 1000,
        UserMax = 32767
    };
    Q_ENUM(Attribute)

    explicit NetworkRequest(QObject *parent = nullptr);
    ~NetworkRequest() override;

    void classBegin() override;
    void componentComplete() override;

    // The manager that classBegin takes from the QML engine; C++ users
    // without an engine set one here.
    QNetworkAccessManager *networkAccessManager() const;
    void setNetworkAccessManager(QNetworkAccessManager *manager);

    QUrl url() const;
    void setUrl(const QUrl &url);
    QString method() const;
    void setMethod(const QString &method);
    NetworkRequestHeaders *headers();
    bool followRedirects() const;
    void setFollowRedirects(bool followRedirects);
    bool ignoreSslErrors() const;
    void setIgnoreSslErrors(bool ignoreSslErrors);
    QString uploadPrefix() const;
    void setUploadPrefix(const QString &uploadPrefix);
    ReadyState readyState() const;
    void setReadyState(ReadyState readyState);
    int status() const;
    QString statusText() const;
    int errorCode() const;
    QString errorText() const;
    QVariant requestBody() const;
    QString responseType() const;
    void setResponseType(const QString &responseType);
    QVariantMap responseHeaders() const;
    QString responsePath() const;
    void setResponsePath(const QString &responsePath);
    QString responseText() const;
    QVariant response() const;
    double progress() const;
    QString user() const;
    void setUser(const QString &user);
    QString password() const;
    void setPassword(const QString &password);
    QString realm() const;
    void setRealm(const QString &realm);
    QVariant timeoutValue() const;
    void setTimeout(const QVariant &timeout);

    Q_INVOKABLE void open(const QString &method, const QUrl &url, bool async);
    Q_INVOKABLE void open(const QString &method, const QUrl &url);
    Q_INVOKABLE void send(const QVariant &body);
    Q_INVOKABLE void send();
    Q_INVOKABLE void abort();
    Q_INVOKABLE void setAttribute(Attribute attribute, const QVariant &value);
    Q_INVOKABLE QVariant attribute(Attribute attribute, bool checkResponse) const;
    Q_INVOKABLE QVariant attribute(Attribute attribute) const;

    static QNetworkReply *createNetworkReplyGET(QNetworkAccessManager *manager, const QNetworkRequest &request);
    static QNetworkReply *createNetworkReplyHEAD(QNetworkAccessManager *manager, const QNetworkRequest &request);
    static QNetworkReply *createNetworkReplyPOST(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                 const QVariant &body);
    static QNetworkReply *createNetworkReplyPUT(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                const QVariant &body);
    static QNetworkReply *createNetworkReplyDELETE(QNetworkAccessManager *manager, const QNetworkRequest &request,
                                                   const QVariant &body);
    static void setCookies(QNetworkAccessManager *manager, const QUrl &url, const QVariant &headers);
    static QVariantList sslErrorsToList(const QList<QSslError> &errors);
    static bool isRedirectStatus(int status);
    // Turns a finished body into `response` by responseType.
    static QVariant decodeResponse(const QByteArray &data, const QString &responseType);

signals:
    void urlChanged();
    void methodChanged();
    void errorCodeChanged();
    void errorTextChanged();
    void readyStateChanged();
    void progressChanged();
    void followRedirectsChanged();
    void ignoreSslErrorsChanged();
    void passwordChanged();
    void realmChanged();
    void requestBodyChanged();
    void responseHeadersChanged();
    void responseChanged();
    void responseTypeChanged();
    void responseTextChanged();
    void responsePathChanged();
    void uploadPrefixChanged();
    void userChanged();
    void timeoutChanged();
    void timeout();
    void error();
    void sslErrors(const QVariant &errors);
    void sslErrorsIgnored(const QVariant &errors);

protected:
    // The steps of sending, for subclasses that build their own bodies.
    void send(const QUrl &url, const QVariant &body);
    void send(const QUrl &url, const QJSValue &body, const QVariantMap &headers);
    void send(const QUrl &url, const QVariantMap &form, const QVariantMap &headers);
    void send(const QUrl &url, const QString &method, const QVariant &body, const QVariantMap &headers);
    void setErrorCode(int errorCode);
    void setErrorText(const QString &errorText);

private slots:
    void onAuthenticationRequired(QNetworkReply *reply, QAuthenticator *authenticator);
    void onFinished(QNetworkReply *reply);
    void onNetworkAccessibleChanged(QNetworkAccessManager::NetworkAccessibility accessible);
    void onProxyAuthenticationRequired(const QNetworkProxy &proxy, QAuthenticator *authenticator);
    void onEncrypted(QNetworkReply *reply);
    void onSslErrors(QNetworkReply *reply, const QList<QSslError> &errors);
    void onFormDataProgress(double progress);
    void onDownloadProgress(qint64 bytesReceived, qint64 bytesTotal);
    void onError(QNetworkReply::NetworkError code);
    void onFinished();
    void onMetaDataChanged();
    void onReadyRead();
    void onRedirectAllowed();
    void onRedirected(const QUrl &url);
    void onUploadProgress(qint64 bytesSent, qint64 bytesTotal);
    void onEncrypted();
    void onPreSharedKeyAuthenticationRequired(QSslPreSharedKeyAuthenticator *authenticator);
    void onSslErrors(const QList<QSslError> &errors);
    void onTimeout();
    void onDefaultConfigurationChanged();
    void onAccessCacheClearing();

private:
    void sendFormData(const QUrl &url, const QVariantMap &form, const QVariantMap &headers);
    void resetForSend();
    void buildRequest(const QUrl &url, const QString &method, const QVariantMap &headers);
    void armTimer();
    void deleteTimer();
    void disposeFormData();
    void rebuildResponseHeaders(QNetworkReply *reply);
    void updateStatus(QNetworkReply *reply);
    void appendResponseData(const QByteArray &chunk);
    bool openResponseFile();
    void setProgress(double progress);
    void abortReply();
    QString resolvedResponsePath() const;

    QPointer<QNetworkAccessManager> m_networkAccessManager;
    QUrl m_url;
    QString m_method = QStringLiteral("GET");
    NetworkRequestHeaders *m_headers = nullptr;
    bool m_ignoreSslErrors = false;
    QString m_uploadPrefix = QStringLiteral("@");
    ReadyState m_readyState = ReadyStateUninitialized;
    int m_status = 0;
    QString m_statusText;
    int m_errorCode = 0;
    QString m_errorText;
    QVariant m_requestBody;
    QString m_responseType;
    QVariantMap m_responseHeaders;
    QString m_responsePath;
    QVariant m_response;
    double m_progress = 0.0;
    QString m_user;
    QString m_password;
    QString m_realm;
    QVariant m_timeout;

    QNetworkRequest *m_currentRequest = nullptr;
    QNetworkReply *m_currentReply = nullptr;
    bool m_async = true;
    int m_redirectMode = 2;
    QDateTime m_startTime;
    qint64 m_bytesReceived = 0;
    qint64 m_contentLength = 0;
    QVariant m_percentComplete;
    QVariant m_estimatedFinishTime;
    QByteArray m_responseData;
    QFile *m_responseFile = nullptr;
    bool m_responseFileFailed = false;
    bool m_aborted = false;
    NetworkFormData *m_formData = nullptr;
    QTimer *m_timeoutTimer = nullptr;
    QNetworkConfiguration m_configuration;
    NetworkingPrivateInvoker *m_networking = nullptr;
    QMap<int, QVariant> m_attributes;
    QMap<int, QVariant> m_replyAttributes;
};

QT_WARNING_POP

#endif // NETWORKREQUEST_H
