#include "DigestEngine.h"

#ifdef LOOMKIT_HAVE_LIBCRYPTO
#include <openssl/evp.h>
#endif

#ifdef LOOMKIT_HAVE_LIBCRYPTO

namespace {

const EVP_MD *nativeDigest(QCryptographicHash::Algorithm algorithm)
{
    switch (algorithm) {
    case QCryptographicHash::Md5:
        return EVP_md5();
    case QCryptographicHash::Sha1:
        return EVP_sha1();
    case QCryptographicHash::Sha224:
        return EVP_sha224();
    case QCryptographicHash::Sha256:
        return EVP_sha256();
    case QCryptographicHash::Sha384:
        return EVP_sha384();
    case QCryptographicHash::Sha512:
        return EVP_sha512();
    case QCryptographicHash::RealSha3_224:
        return EVP_sha3_224();
    case QCryptographicHash::RealSha3_256:
        return EVP_sha3_256();
    case QCryptographicHash::RealSha3_384:
        return EVP_sha3_384();
    case QCryptographicHash::RealSha3_512:
        return EVP_sha3_512();
    default:
        return nullptr;
    }
}

} // namespace

struct DigestEngine::Native
{
    EVP_MD_CTX *context = EVP_MD_CTX_new();
    ~Native() { EVP_MD_CTX_free(context); }
};

#else

struct DigestEngine::Native
{
};

#endif

DigestEngine::DigestEngine(QCryptographicHash::Algorithm algorithm)
{
#ifdef LOOMKIT_HAVE_LIBCRYPTO
    if (const EVP_MD *digest = nativeDigest(algorithm)) {
        auto native = std::make_unique<Native>();
        if (native->context && EVP_DigestInit_ex(native->context, digest, nullptr) == 1)
            m_native = std::move(native);
    }
#endif
    if (!m_native)
        m_fallback = std::make_unique<QCryptographicHash>(algorithm);
}

DigestEngine::~DigestEngine() = default;

void DigestEngine::addData(const char *data, int length)
{
#ifdef LOOMKIT_HAVE_LIBCRYPTO
    if (m_native) {
        EVP_DigestUpdate(m_native->context, data, size_t(length));
        return;
    }
#endif
    m_fallback->addData(data, length);
}

QByteArray DigestEngine::result() const
{
#ifdef LOOMKIT_HAVE_LIBCRYPTO
    if (m_native) {
        // Finish a copy, so that the stream goes on.
        EVP_MD_CTX *copy = EVP_MD_CTX_new();
        unsigned char digest[EVP_MAX_MD_SIZE];
        unsigned int length = 0;
        const bool ok = copy && EVP_MD_CTX_copy_ex(copy, m_native->context) == 1
                        && EVP_DigestFinal_ex(copy, digest, &length) == 1;
        EVP_MD_CTX_free(copy);
        return ok ? QByteArray(reinterpret_cast<const char *>(digest), int(length)) : QByteArray();
    }
#endif
    return m_fallback->result();
}

QByteArray DigestEngine::hash(const QByteArray &data, QCryptographicHash::Algorithm algorithm)
{
    DigestEngine engine(algorithm);
    engine.addData(data);
    return engine.result();
}
