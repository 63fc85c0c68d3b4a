#ifndef REQUESTQUERY_H
#define REQUESTQUERY_H

#include <QString>
#include <QUrl>
#include <QVariantMap>

// Merges a URL's query with a form: the form wins on equal keys, and the
// result is in key order, values percent-encoded.
class RequestQuery
{
public:
    RequestQuery(const QUrl &url, const QVariantMap &form);

    // The URL without its query.
    QUrl url() const;
    QVariantMap items() const;
    QString encodedQuery() const;
    QUrl urlWithQuery() const;

private:
    QUrl m_url;
    QVariantMap m_items;
};

#endif // REQUESTQUERY_H
