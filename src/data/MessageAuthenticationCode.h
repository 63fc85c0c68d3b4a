#ifndef MESSAGEAUTHENTICATIONCODE_H
#define MESSAGEAUTHENTICATIONCODE_H

#include "CryptographicHash.h"

#include <QVariant>

// A keyed hash (HMAC) with the surface of CryptographicHash plus a key.
class MessageAuthenticationCode : public CryptographicHash
{
    Q_OBJECT

    Q_PROPERTY(QVariant key READ key WRITE setKey NOTIFY keyChanged)

public:
    explicit MessageAuthenticationCode(QObject *parent = nullptr);
    ~MessageAuthenticationCode() override;

    QVariant key() const;
    // Text (UTF-8), a BinaryData object or an ArrayBuffer. Setting the key
    // starts over.
    void setKey(const QVariant &key);
    void setKeyBytes(const QByteArray &key);

signals:
    void keyChanged();

protected:
    void restart() override;
    QByteArray digest() const override;
    QByteArray digestOf(const QByteArray &bytes) const override;

private:
    QByteArray m_key;
    QByteArray m_outerPad;
};

#endif // MESSAGEAUTHENTICATIONCODE_H
