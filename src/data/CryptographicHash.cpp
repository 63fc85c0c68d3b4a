#include "CryptographicHash.h"
#include "BinaryData.h"
#include "DigestEngine.h"
#include "FileUtility.h"
#include "LoomkitLogging.h"

#include <QFile>
#include <QMetaEnum>

namespace {

constexpr qint64 kReadChunk = 256 * 1024;

} // namespace

CryptographicHash::CryptographicHash(QObject *parent)
    : QObject(parent)
{
    CryptographicHash::restart();
}

CryptographicHash::~CryptographicHash() = default;

CryptographicHash::Algorithm CryptographicHash::algorithm() const
{
    return m_algorithm;
}

void CryptographicHash::setAlgorithm(Algorithm algorithm)
{
    if (algorithm == m_algorithm)
        return;
    if (!QMetaEnum::fromType<Algorithm>().valueToKey(algorithm)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported algorithm:" << int(algorithm);
        return;
    }
    m_algorithm = algorithm;
    startOver();
    emit algorithmChanged();
}

int CryptographicHash::hashLength() const
{
    return QCryptographicHash::hashLength(QCryptographicHash::Algorithm(m_algorithm));
}

QString CryptographicHash::hex() const
{
    return QString::fromLatin1(resultBytes().toHex());
}

QString CryptographicHash::base64() const
{
    return QString::fromLatin1(resultBytes().toBase64());
}

QByteArray CryptographicHash::resultBytes() const
{
    if (m_result.isEmpty())
        m_result = digest();
    return m_result;
}

bool CryptographicHash::addData(const QJSValue &data)
{
    QByteArray bytes;
    if (!BinaryData::toBytes(data.toVariant(), &bytes)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported data type:" << data.toString();
        return false;
    }
    return addBytes(bytes);
}

bool CryptographicHash::addFile(const QString &path)
{
    QFile file(FileUtility::resolvedPath(path));
    if (!file.open(QIODevice::ReadOnly)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Cannot open" << file.fileName() << file.errorString();
        return false;
    }
    return addDevice(&file);
}

void CryptographicHash::reset()
{
    startOver();
}

BinaryData *CryptographicHash::result() const
{
    return BinaryData::create(resultBytes());
}

QString CryptographicHash::hash(const QJSValue &data) const
{
    QByteArray bytes;
    if (!BinaryData::toBytes(data.toVariant(), &bytes)) {
        qCWarning(lcCore) << Q_FUNC_INFO << "Unsupported data type:" << data.toString();
        return QString();
    }
    return QString::fromLatin1(digestOf(bytes).toHex());
}

bool CryptographicHash::addBytes(const QByteArray &bytes)
{
    m_hash->addData(bytes);
    m_result.clear();
    emit resultChanged();
    return true;
}

bool CryptographicHash::addDevice(QIODevice *device)
{
    if (!device || !device->isReadable())
        return false;
    // Large reads: QCryptographicHash's own device loop reads 1 KiB at a time.
    QByteArray buffer(int(kReadChunk), Qt::Uninitialized);
    bool ok = true;
    for (;;) {
        const qint64 count = device->read(buffer.data(), kReadChunk);
        if (count < 0) {
            qCWarning(lcCore) << Q_FUNC_INFO << "Read error:" << device->errorString();
            ok = false;
            break;
        }
        if (count == 0)
            break;
        m_hash->addData(buffer.constData(), int(count));
    }
    m_result.clear();
    emit resultChanged();
    return ok;
}

void CryptographicHash::restart()
{
    m_hash = std::make_unique<DigestEngine>(QCryptographicHash::Algorithm(m_algorithm));
}

QByteArray CryptographicHash::digest() const
{
    return m_hash->result();
}

QByteArray CryptographicHash::digestOf(const QByteArray &bytes) const
{
    return DigestEngine::hash(bytes, QCryptographicHash::Algorithm(m_algorithm));
}

void CryptographicHash::startOver()
{
    restart();
    m_result.clear();
    emit resultChanged();
}
