#ifndef NETWORKREQUESTHEADERS_H
#define NETWORKREQUESTHEADERS_H

#include "PropertySet.h"

#include <QQmlParserStatus>

// The header set of a NetworkRequest: any key is a header, sent as written;
// referer/referrer and userAgent are shortcuts for two common ones.
class NetworkRequestHeaders : public PropertySet, public QQmlParserStatus
{
    Q_OBJECT
    Q_INTERFACES(QQmlParserStatus)

    Q_PROPERTY(QString referer READ referer WRITE setReferer NOTIFY refererChanged)
    Q_PROPERTY(QString referrer READ referer WRITE setReferer NOTIFY refererChanged)
    Q_PROPERTY(QString userAgent READ userAgent WRITE setUserAgent NOTIFY userAgentChanged)

public:
    explicit NetworkRequestHeaders(QObject *parent = nullptr);

    QString referer() const;
    void setReferer(const QString &referer);
    QString userAgent() const;
    void setUserAgent(const QString &userAgent);

    void classBegin() override;
    void componentComplete() override;

signals:
    void refererChanged();
    void userAgentChanged();

private slots:
    void onValueChanged(const QString &key, const QVariant &value);
};

#endif // NETWORKREQUESTHEADERS_H
