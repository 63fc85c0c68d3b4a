#include "RequestQuery.h"

#include <QUrlQuery>

RequestQuery::RequestQuery(const QUrl &url, const QVariantMap &form)
    : m_url(url)
{
    const QList<QPair<QString, QString>> queryItems = QUrlQuery(url).queryItems(QUrl::FullyDecoded);
    for (const auto &item : queryItems)
        m_items.insert(item.first, item.second);
    for (auto it = form.cbegin(); it != form.cend(); ++it)
        m_items.insert(it.key(), it.value().toString());
    m_url.setQuery(QString());
}

QUrl RequestQuery::url() const
{
    return m_url;
}

QVariantMap RequestQuery::items() const
{
    return m_items;
}

QString RequestQuery::encodedQuery() const
{
    QStringList parts;
    for (auto it = m_items.cbegin(); it != m_items.cend(); ++it)
        parts.append(it.key() + QLatin1Char('=') + QString::fromLatin1(QUrl::toPercentEncoding(it.value().toString())));
    return parts.join(QLatin1Char('&'));
}

QUrl RequestQuery::urlWithQuery() const
{
    const QString query = encodedQuery();
    if (query.isEmpty())
        return m_url;
    // The fragment goes after the query, not before it.
    QUrl base = m_url;
    const QString fragment = base.fragment(QUrl::FullyEncoded);
    base.setFragment(QString());
    QUrl result(base.toString(QUrl::FullyEncoded) + QLatin1Char('?') + query, QUrl::TolerantMode);
    if (!fragment.isEmpty())
        result.setFragment(fragment, QUrl::TolerantMode);
    return result;
}
