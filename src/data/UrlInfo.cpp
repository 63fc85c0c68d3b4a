#include "UrlInfo.h"
#include "LoomkitLogging.h"

#include <QFileInfo>
#include <QQmlEngine>
#include <QUrlQuery>

namespace {

// Everything but the unreserved characters is encoded, so that "+", "&",
// "=" and "#" in a value survive the trip through the query.
QByteArray encodePart(const QString &text)
{
    return QUrl::toPercentEncoding(text);
}

} // namespace

UrlInfo::UrlInfo(QObject *parent)
    : QObject(parent)
{
}

UrlInfo::UrlInfo(const QUrl &url, QObject *parent)
    : QObject(parent)
    , m_url(url)
{
}

UrlInfo *UrlInfo::create(const QUrl &url)
{
    auto *object = new UrlInfo(url);
    QQmlEngine::setObjectOwnership(object, QQmlEngine::JavaScriptOwnership);
    return object;
}

QString UrlInfo::toQuery(const QVariantMap &parameters)
{
    QByteArray query;
    auto append = [&query](const QByteArray &name, const QVariant &value) {
        if (!query.isEmpty())
            query += '&';
        query += name;
        if (value.isValid() && !value.isNull()) {
            query += '=';
            query += encodePart(value.toString());
        }
    };
    for (auto it = parameters.constBegin(); it != parameters.constEnd(); ++it) {
        const QByteArray name = encodePart(it.key());
        const QVariant &value = it.value();
        if (value.userType() == QMetaType::QVariantList || value.userType() == QMetaType::QStringList) {
            for (const QVariant &element : value.toList())
                append(name, element);
        } else {
            append(name, value);
        }
    }
    return QString::fromLatin1(query);
}

QVariantMap UrlInfo::queryMap(const QUrl &url)
{
    QVariantMap map;
    if (!url.hasQuery())
        return map;
    const QUrlQuery query(url);
    const auto items = query.queryItems(QUrl::FullyDecoded);
    for (const auto &item : items) {
        auto it = map.find(item.first);
        if (it == map.end()) {
            map.insert(item.first, item.second);
        } else if (it.value().userType() == QMetaType::QVariantList) {
            QVariantList list = it.value().toList();
            list.append(item.second);
            it.value() = list;
        } else {
            it.value() = QVariantList { it.value(), item.second };
        }
    }
    return map;
}

QUrl UrlInfo::url() const
{
    return m_url;
}

void UrlInfo::setUrl(const QUrl &url)
{
    if (url == m_url)
        return;
    m_url = url;
    emit urlChanged();
}

template <typename Setter>
void UrlInfo::change(Setter setter)
{
    QUrl url = m_url;
    setter(url);
    setUrl(url);
}

QString UrlInfo::text() const
{
    return m_url.toString();
}

bool UrlInfo::isValid() const
{
    return m_url.isValid();
}

bool UrlInfo::isEmpty() const
{
    return m_url.isEmpty();
}

bool UrlInfo::isRelative() const
{
    return m_url.isRelative();
}

bool UrlInfo::isLocalFile() const
{
    return m_url.isLocalFile();
}

QString UrlInfo::scheme() const
{
    return m_url.scheme();
}

void UrlInfo::setScheme(const QString &scheme)
{
    change([&](QUrl &url) { url.setScheme(scheme); });
}

QString UrlInfo::userName() const
{
    return m_url.userName(QUrl::FullyDecoded);
}

void UrlInfo::setUserName(const QString &userName)
{
    change([&](QUrl &url) { url.setUserName(userName, QUrl::DecodedMode); });
}

QString UrlInfo::password() const
{
    return m_url.password(QUrl::FullyDecoded);
}

void UrlInfo::setPassword(const QString &password)
{
    change([&](QUrl &url) { url.setPassword(password, QUrl::DecodedMode); });
}

QString UrlInfo::host() const
{
    return m_url.host();
}

void UrlInfo::setHost(const QString &host)
{
    change([&](QUrl &url) { url.setHost(host); });
}

int UrlInfo::port() const
{
    return m_url.port();
}

void UrlInfo::setPort(int port)
{
    if (port < -1 || port > 65535) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Port out of range:" << port;
        return;
    }
    change([&](QUrl &url) { url.setPort(port); });
}

QString UrlInfo::authority() const
{
    return m_url.authority();
}

QString UrlInfo::path() const
{
    return m_url.path(QUrl::FullyDecoded);
}

void UrlInfo::setPath(const QString &path)
{
    change([&](QUrl &url) { url.setPath(path, QUrl::DecodedMode); });
}

QString UrlInfo::fileName() const
{
    return m_url.fileName(QUrl::FullyDecoded);
}

QString UrlInfo::suffix() const
{
    return QFileInfo(fileName()).suffix();
}

QString UrlInfo::query() const
{
    return m_url.query(QUrl::FullyEncoded);
}

void UrlInfo::setQuery(const QString &query)
{
    change([&](QUrl &url) { url.setQuery(query.isEmpty() ? QString() : query, QUrl::TolerantMode); });
}

QVariantMap UrlInfo::queryParameters() const
{
    return queryMap(m_url);
}

void UrlInfo::setQueryParameters(const QVariantMap &parameters)
{
    setQuery(toQuery(parameters));
}

QString UrlInfo::fragment() const
{
    return m_url.fragment(QUrl::FullyDecoded);
}

void UrlInfo::setFragment(const QString &fragment)
{
    change([&](QUrl &url) { url.setFragment(fragment.isEmpty() ? QString() : fragment, QUrl::DecodedMode); });
}

QString UrlInfo::localFile() const
{
    return m_url.toLocalFile();
}

void UrlInfo::setLocalFile(const QString &path)
{
    setUrl(QUrl::fromLocalFile(path));
}

void UrlInfo::fromUserInput(const QString &text)
{
    setUrl(QUrl::fromUserInput(text));
}

QUrl UrlInfo::resolved(const QUrl &relative) const
{
    return m_url.resolved(relative);
}

QVariant UrlInfo::queryValue(const QString &name) const
{
    return queryMap(m_url).value(name);
}
