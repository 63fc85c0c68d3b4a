#include "MessageAuthenticationCode.h"
#include "BinaryData.h"
#include "DigestEngine.h"
#include "LoomkitLogging.h"

#include <QMessageAuthenticationCode>

namespace {

// Input block size of each hash, which HMAC pads the key to.
int blockSize(CryptographicHash::Algorithm algorithm)
{
    switch (algorithm) {
    case CryptographicHash::Sha384:
    case CryptographicHash::Sha512:
        return 128;
    case CryptographicHash::Keccak_224:
    case CryptographicHash::Sha3_224:
        return 144;
    case CryptographicHash::Keccak_256:
    case CryptographicHash::Sha3_256:
        return 136;
    case CryptographicHash::Keccak_384:
    case CryptographicHash::Sha3_384:
        return 104;
    case CryptographicHash::Keccak_512:
    case CryptographicHash::Sha3_512:
        return 72;
    default:
        return 64;
    }
}

QByteArray xored(const QByteArray &bytes, char pad)
{
    QByteArray result = bytes;
    for (char &c : result)
        c ^= pad;
    return result;
}

} // namespace

MessageAuthenticationCode::MessageAuthenticationCode(QObject *parent)
    : CryptographicHash(parent)
{
    MessageAuthenticationCode::restart();
}

MessageAuthenticationCode::~MessageAuthenticationCode() = default;

QVariant MessageAuthenticationCode::key() const
{
    return QVariant(m_key);
}

void MessageAuthenticationCode::setKey(const QVariant &key)
{
    QByteArray bytes;
    if (!BinaryData::toBytes(key, &bytes)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported key type:" << key;
        return;
    }
    setKeyBytes(bytes);
}

void MessageAuthenticationCode::setKeyBytes(const QByteArray &key)
{
    if (key == m_key)
        return;
    m_key = key;
    startOver();
    emit keyChanged();
}

// HMAC over the running hash, so that the result can be read at any point
// and more data added afterwards, which QMessageAuthenticationCode does not
// allow once it has given a result.
void MessageAuthenticationCode::restart()
{
    const auto algorithm = QCryptographicHash::Algorithm(m_algorithm);
    const int block = blockSize(m_algorithm);
    QByteArray key = m_key.size() > block ? DigestEngine::hash(m_key, algorithm) : m_key;
    key.append(QByteArray(block - key.size(), '\0'));

    m_outerPad = xored(key, 0x5c);
    m_hash = std::make_unique<DigestEngine>(algorithm);
    m_hash->addData(xored(key, 0x36));
}

QByteArray MessageAuthenticationCode::digest() const
{
    DigestEngine outer { QCryptographicHash::Algorithm(m_algorithm) };
    outer.addData(m_outerPad);
    outer.addData(m_hash->result());
    return outer.result();
}

QByteArray MessageAuthenticationCode::digestOf(const QByteArray &bytes) const
{
    return QMessageAuthenticationCode::hash(bytes, m_key, QCryptographicHash::Algorithm(m_algorithm));
}
