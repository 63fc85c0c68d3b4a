#ifndef DIGESTENGINE_H
#define DIGESTENGINE_H

#include <QByteArray>
#include <QCryptographicHash>

#include <memory>

// A running digest whose result can be read at any point without ending the
// stream. Uses the system's libcrypto where it offers the algorithm, since
// it has the processor's hash instructions, and QCryptographicHash for the
// rest (Keccak, and MD4 where libcrypto no longer has it).
class DigestEngine
{
public:
    explicit DigestEngine(QCryptographicHash::Algorithm algorithm);
    ~DigestEngine();
    DigestEngine(const DigestEngine &) = delete;
    DigestEngine &operator=(const DigestEngine &) = delete;

    void addData(const char *data, int length);
    void addData(const QByteArray &data) { addData(data.constData(), data.size()); }
    QByteArray result() const;

    static QByteArray hash(const QByteArray &data, QCryptographicHash::Algorithm algorithm);

private:
    struct Native;
    std::unique_ptr<Native> m_native;
    std::unique_ptr<QCryptographicHash> m_fallback;
};

#endif // DIGESTENGINE_H
