#ifndef URLINFO_H
#define URLINFO_H

#include <QObject>
#include <QUrl>
#include <QVariantMap>

// The parts of a URL, each readable and writable from QML. The query is also
// offered as a map of decoded names to values; a name given more than once
// maps to a list.
class UrlInfo : public QObject
{
    Q_OBJECT

    Q_PROPERTY(QUrl url READ url WRITE setUrl NOTIFY urlChanged)
    Q_PROPERTY(QString text READ text NOTIFY urlChanged)
    Q_PROPERTY(bool isValid READ isValid NOTIFY urlChanged)
    Q_PROPERTY(bool isEmpty READ isEmpty NOTIFY urlChanged)
    Q_PROPERTY(bool isRelative READ isRelative NOTIFY urlChanged)
    Q_PROPERTY(bool isLocalFile READ isLocalFile NOTIFY urlChanged)
    Q_PROPERTY(QString scheme READ scheme WRITE setScheme NOTIFY urlChanged)
    Q_PROPERTY(QString userName READ userName WRITE setUserName NOTIFY urlChanged)
    Q_PROPERTY(QString password READ password WRITE setPassword NOTIFY urlChanged)
    Q_PROPERTY(QString host READ host WRITE setHost NOTIFY urlChanged)
    Q_PROPERTY(int port READ port WRITE setPort NOTIFY urlChanged)
    Q_PROPERTY(QString authority READ authority NOTIFY urlChanged)
    Q_PROPERTY(QString path READ path WRITE setPath NOTIFY urlChanged)
    Q_PROPERTY(QString fileName READ fileName NOTIFY urlChanged)
    Q_PROPERTY(QString suffix READ suffix NOTIFY urlChanged)
    Q_PROPERTY(QString query READ query WRITE setQuery NOTIFY urlChanged)
    Q_PROPERTY(QVariantMap queryParameters READ queryParameters WRITE setQueryParameters NOTIFY urlChanged)
    Q_PROPERTY(QString fragment READ fragment WRITE setFragment NOTIFY urlChanged)
    Q_PROPERTY(QString localFile READ localFile WRITE setLocalFile NOTIFY urlChanged)

public:
    explicit UrlInfo(QObject *parent = nullptr);
    explicit UrlInfo(const QUrl &url, QObject *parent = nullptr);

    // Unparented, in JavaScript ownership.
    static UrlInfo *create(const QUrl &url);

    // Query text from a map: names and values percent-encoded, a list value
    // repeating its name. The inverse of queryMap.
    static QString toQuery(const QVariantMap &parameters);
    static QVariantMap queryMap(const QUrl &url);

    QUrl url() const;
    void setUrl(const QUrl &url);
    QString text() const;
    bool isValid() const;
    bool isEmpty() const;
    bool isRelative() const;
    bool isLocalFile() const;
    QString scheme() const;
    void setScheme(const QString &scheme);
    QString userName() const;
    void setUserName(const QString &userName);
    QString password() const;
    void setPassword(const QString &password);
    QString host() const;
    void setHost(const QString &host);
    int port() const;
    void setPort(int port);
    QString authority() const;
    QString path() const;
    void setPath(const QString &path);
    QString fileName() const;
    QString suffix() const;
    QString query() const;
    void setQuery(const QString &query);
    QVariantMap queryParameters() const;
    void setQueryParameters(const QVariantMap &parameters);
    QString fragment() const;
    void setFragment(const QString &fragment);
    QString localFile() const;
    void setLocalFile(const QString &path);

    // Takes text as a user would type it ("example.com/x", "/tmp/a").
    Q_INVOKABLE void fromUserInput(const QString &text);
    Q_INVOKABLE QUrl resolved(const QUrl &relative) const;
    Q_INVOKABLE QVariant queryValue(const QString &name) const;

signals:
    void urlChanged();

private:
    template <typename Setter>
    void change(Setter setter);

    QUrl m_url;
};

#endif // URLINFO_H
