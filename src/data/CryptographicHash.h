#ifndef CRYPTOGRAPHICHASH_H
#define CRYPTOGRAPHICHASH_H

#include <QByteArray>
#include <QCryptographicHash>
#include <QJSValue>
#include <QObject>
#include <QString>

#include <memory>

class BinaryData;
class DigestEngine;
class QIODevice;

// A digest of text, bytes or files for QML. Data is added in pieces; the
// result reflects everything added since the last reset.
class CryptographicHash : public QObject
{
    Q_OBJECT

    Q_PROPERTY(Algorithm algorithm READ algorithm WRITE setAlgorithm NOTIFY algorithmChanged)
    Q_PROPERTY(int hashLength READ hashLength NOTIFY algorithmChanged)
    Q_PROPERTY(QString hex READ hex NOTIFY resultChanged)
    Q_PROPERTY(QString base64 READ base64 NOTIFY resultChanged)

public:
    // The values of QCryptographicHash::Algorithm.
    enum Algorithm {
        Md4 = QCryptographicHash::Md4,
        Md5 = QCryptographicHash::Md5,
        Sha1 = QCryptographicHash::Sha1,
        Sha224 = QCryptographicHash::Sha224,
        Sha256 = QCryptographicHash::Sha256,
        Sha384 = QCryptographicHash::Sha384,
        Sha512 = QCryptographicHash::Sha512,
        Keccak_224 = QCryptographicHash::Keccak_224,
        Keccak_256 = QCryptographicHash::Keccak_256,
        Keccak_384 = QCryptographicHash::Keccak_384,
        Keccak_512 = QCryptographicHash::Keccak_512,
        Sha3_224 = QCryptographicHash::RealSha3_224,
        Sha3_256 = QCryptographicHash::RealSha3_256,
        Sha3_384 = QCryptographicHash::RealSha3_384,
        Sha3_512 = QCryptographicHash::RealSha3_512
    };
    Q_ENUM(Algorithm)

    explicit CryptographicHash(QObject *parent = nullptr);
    ~CryptographicHash() override;

    Algorithm algorithm() const;
    void setAlgorithm(Algorithm algorithm);
    int hashLength() const;
    QString hex() const;
    QString base64() const;

    // The digest of everything added so far; adding more continues from it.
    QByteArray resultBytes() const;

    // Text is taken as UTF-8; BinaryData objects and ArrayBuffers as bytes.
    Q_INVOKABLE bool addData(const QJSValue &data);
    Q_INVOKABLE bool addFile(const QString &path);
    Q_INVOKABLE void reset();
    Q_INVOKABLE BinaryData *result() const;

    // One-shot digest of a single value, leaving the object's state alone.
    Q_INVOKABLE QString hash(const QJSValue &data) const;

    bool addBytes(const QByteArray &bytes);
    bool addDevice(QIODevice *device);

signals:
    void algorithmChanged();
    void resultChanged();

protected:
    // The keyed variant wraps the same running hash: restart() primes it
    // and digest() finishes it.
    virtual void restart();
    virtual QByteArray digest() const;
    virtual QByteArray digestOf(const QByteArray &bytes) const;
    void startOver();

    Algorithm m_algorithm = Sha256;
    std::unique_ptr<DigestEngine> m_hash;

private:
    mutable QByteArray m_result;
};

#endif // CRYPTOGRAPHICHASH_H
